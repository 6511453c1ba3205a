#include "Host/Toolkit/MultiPictureButton.h"

#include "Host/Messaging/Diagnostics.h"
#include "Host/Toolkit/DC.h"

namespace {
std::vector<std::shared_ptr<const Bitmap>> BitmapsOf(std::initializer_list<Decal> decals) {
  std::vector<std::shared_ptr<const Bitmap>> bitmaps;
  for (const Decal decal : decals) {
    bitmaps.push_back(Bitmap::GetBitmap(decal));
  }
  return bitmaps;
}
}  // namespace

MultiPictureButton::MultiPictureButton(const Rect& bounds, CommandID command,
                                       std::vector<std::shared_ptr<const Bitmap>> pictures,
                                       Commander* commander)
    : ButtonControl(command, commander), mPictures(std::move(pictures)) {
  SetBounds(bounds);
}

MultiPictureButton::MultiPictureButton(const Rect& bounds, CommandID command,
                                       std::initializer_list<Decal> pictures, Commander* commander)
    : MultiPictureButton(bounds, command, BitmapsOf(pictures), commander) {}

void MultiPictureButton::SetPictures(std::vector<std::shared_ptr<const Bitmap>> pictures) {
  mPictures = std::move(pictures);
  if (mValue >= GetValueCount()) {
    mValue = 0;
  }
  Invalidate();
}

void MultiPictureButton::SetValue(int value) {
  if (!HOST_VERIFY(value >= 0 && value < GetValueCount(), "Invalid button value")) {
    return;
  }
  if (value != mValue) {
    mValue = value;
    Invalidate();
  }
}

bool MultiPictureButton::ClickSelf(KeyModifiers /*modifiers*/) {
  const int before = mValue;
  if (GetValueCount() > 1) {
    mValue = (mValue + 1) % GetValueCount();
    Invalidate();
  }
  const int advanced = mValue;
  const bool handled = SendCommand();
  // Unhandled: back to where it was, unless the chain set a value itself.
  if (!handled && mValue == advanced && mValue != before) {
    mValue = before;
    Invalidate();
  }
  return handled;
}

void MultiPictureButton::PaintSelf(DC& dc) {
  const Rect bounds = GetLocalBounds();
  if (IsPressed() || IsHovered()) {
    PaintFace(dc, bounds, false);
  }
  if (mValue < 0 || mValue >= GetValueCount() || mPictures[mValue] == nullptr) {
    return;
  }
  const Bitmap& picture = *mPictures[mValue];
  const Size size = picture.GetSize();
  const Point topLeft{(bounds.Width() - size.width) / 2, (bounds.Height() - size.height) / 2};
  dc.DrawBitmap(picture, topLeft, IsEnabledInTree() ? 1.0 : 0.35);
}
