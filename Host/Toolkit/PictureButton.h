#pragma once

#include <memory>

#include "Host/Toolkit/Bitmap.h"
#include "Host/Toolkit/ButtonControl.h"

// A button with one picture that sends its command when clicked (setup, reset, loop, the
// tracker's buttons). It may carry a second picture shown while it is selected (the eyedropper
// while picking, loop while on); the owner sets the selection, a click does not.
class PictureButton : public ButtonControl {
 public:
  PictureButton(const Rect& bounds, CommandID command, std::shared_ptr<const Bitmap> picture,
                std::shared_ptr<const Bitmap> selectedPicture = nullptr,
                Commander* commander = nullptr);
  PictureButton(const Rect& bounds, CommandID command, Decal picture,
                Commander* commander = nullptr);
  PictureButton(const Rect& bounds, CommandID command, Decal picture, Decal selectedPicture,
                Commander* commander = nullptr);

  void SetPicture(std::shared_ptr<const Bitmap> picture);
  void SetSelectedPicture(std::shared_ptr<const Bitmap> picture);
  // Selected without a selected picture draws the normal picture on a pressed face.
  void SetSelected(bool selected);
  bool IsSelected() const { return mSelected; }

  void PaintSelf(DC& dc) override;

 private:
  std::shared_ptr<const Bitmap> mPicture;
  std::shared_ptr<const Bitmap> mSelectedPicture;
  bool mSelected = false;
};
