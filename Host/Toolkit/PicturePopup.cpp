#include "Host/Toolkit/PicturePopup.h"

#include <utility>

#include "Host/Toolkit/DC.h"

PicturePopup::PicturePopup(const Rect& bounds, Decal picture, std::int32_t id, Commander* commander)
    : PicturePopup(bounds, Bitmap::GetBitmap(picture), id, commander) {}

PicturePopup::PicturePopup(const Rect& bounds, std::shared_ptr<const Bitmap> picture,
                           std::int32_t id, Commander* commander)
    : PopupControl(bounds, id, commander), mPicture(std::move(picture)) {}

void PicturePopup::SetPicture(std::shared_ptr<const Bitmap> picture) {
  mPicture = std::move(picture);
  Invalidate();
}

void PicturePopup::SetShowsChevron(bool shows) {
  if (shows != mShowsChevron) {
    mShowsChevron = shows;
    Invalidate();
  }
}

void PicturePopup::PaintSelf(DC& dc) {
  const Rect bounds = GetLocalBounds();
  const Color ink = PaintFace(dc, bounds);
  Rect chevron{bounds.right, bounds.top, bounds.right, bounds.bottom};
  if (mShowsChevron) {
    chevron.left = bounds.right - kChevronWidth;
    PaintChevron(dc, chevron.Offset(-1, 0), ink);
  }
  if (mPicture == nullptr) {
    return;
  }
  const Size size = mPicture->GetSize();
  const int room = chevron.left - bounds.left;
  const Point topLeft{bounds.left + (room - size.width) / 2, (bounds.Height() - size.height) / 2};
  dc.PushClip(Rect{bounds.left + 1, bounds.top + 1, chevron.left, bounds.bottom - 1});
  dc.DrawBitmap(*mPicture, topLeft, IsEnabledInTree() ? 1.0 : 0.35);
  dc.PopClip();
}
