#include "Host/Toolkit/PictureButton.h"

#include "Host/Toolkit/ColorManager.h"
#include "Host/Toolkit/DC.h"

PictureButton::PictureButton(const Rect& bounds, CommandID command,
                             std::shared_ptr<const Bitmap> picture,
                             std::shared_ptr<const Bitmap> selectedPicture, Commander* commander)
    : ButtonControl(command, commander),
      mPicture(std::move(picture)),
      mSelectedPicture(std::move(selectedPicture)) {
  SetBounds(bounds);
}

PictureButton::PictureButton(const Rect& bounds, CommandID command, Decal picture,
                             Commander* commander)
    : PictureButton(bounds, command, Bitmap::GetBitmap(picture), nullptr, commander) {}

PictureButton::PictureButton(const Rect& bounds, CommandID command, Decal picture,
                             Decal selectedPicture, Commander* commander)
    : PictureButton(bounds, command, Bitmap::GetBitmap(picture), Bitmap::GetBitmap(selectedPicture),
                    commander) {}

void PictureButton::SetPicture(std::shared_ptr<const Bitmap> picture) {
  mPicture = std::move(picture);
  Invalidate();
}

void PictureButton::SetSelectedPicture(std::shared_ptr<const Bitmap> picture) {
  mSelectedPicture = std::move(picture);
  Invalidate();
}

void PictureButton::SetSelected(bool selected) {
  if (selected != mSelected) {
    mSelected = selected;
    Invalidate();
  }
}

void PictureButton::PaintSelf(DC& dc) {
  const Rect bounds = GetLocalBounds();
  const bool useSelectedPicture = mSelected && mSelectedPicture != nullptr;
  if (IsPressed() || IsHovered()) {
    PaintFace(dc, bounds, false);
  } else if (mSelected && !useSelectedPicture) {
    dc.FillRect(bounds, ColorManager::GetColor(kColor_ButtonFacePressed));
  }
  const std::shared_ptr<const Bitmap>& picture = useSelectedPicture ? mSelectedPicture : mPicture;
  if (picture == nullptr) {
    return;
  }
  const Size size = picture->GetSize();
  dc.DrawBitmap(*picture, {(bounds.Width() - size.width) / 2, (bounds.Height() - size.height) / 2},
                IsEnabledInTree() ? 1.0 : 0.35);
}
