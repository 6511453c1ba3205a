#include "Host/Toolkit/DisclosureTriangle.h"

#include "Host/Toolkit/Bitmap.h"
#include "Host/Toolkit/ControlMessages.h"
#include "Host/Toolkit/DC.h"

DisclosureTriangle::DisclosureTriangle(const Rect& bounds, std::int32_t id, bool open,
                                       Commander* commander)
    : ButtonControl(kNoCommand, commander), mID(id), mOpen(open) {
  SetTakesFocusOnClick(false);
  SetBounds(bounds);
}

void DisclosureTriangle::SetOpen(bool open) {
  if (open != mOpen) {
    mOpen = open;
    Invalidate();
  }
}

bool DisclosureTriangle::ClickSelf(KeyModifiers modifiers) {
  mOpen = !mOpen;
  Invalidate();
  mStation.Broadcast(DisclosureTriangleStateChangedMessage(mID, mOpen, modifiers));
  if (GetCommand() != kNoCommand) {
    SendCommand();
  }
  return true;
}

void DisclosureTriangle::PaintSelf(DC& dc) {
  const std::shared_ptr<const Bitmap> picture =
      Bitmap::GetBitmap(mOpen ? kDisclosureTriangleOpenDecal : kDisclosureTriangleClosedDecal);
  const Size size = picture->GetSize();
  const Rect bounds = GetLocalBounds();
  dc.DrawBitmap(*picture, {(bounds.Width() - size.width) / 2, (bounds.Height() - size.height) / 2},
                IsEnabledInTree() ? (IsPressed() ? 0.7 : 1.0) : 0.35);
}
