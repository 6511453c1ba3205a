#pragma once

#include <cstdint>
#include <memory>

#include "Host/Toolkit/Bitmap.h"
#include "Host/Toolkit/PopupControl.h"

// A popup that shows a picture (an effect's presets, a panel menu) instead of the selected
// item's text; the items still have texts for the menu (see PopupControl). Pictures made for
// popups carry their own arrow, so the chevron is drawn only on request. The picture is drawn
// faded while the popup is disabled.
class PicturePopup : public PopupControl {
 public:
  static constexpr int kChevronWidth = 8;

  PicturePopup(const Rect& bounds, Decal picture, std::int32_t id = 0,
               Commander* commander = nullptr);
  // A null picture draws only the face and the chevron.
  PicturePopup(const Rect& bounds, std::shared_ptr<const Bitmap> picture, std::int32_t id = 0,
               Commander* commander = nullptr);

  void SetPicture(std::shared_ptr<const Bitmap> picture);
  // A chevron at the right end, for pictures without an arrow of their own.
  void SetShowsChevron(bool shows);
  bool ShowsChevron() const { return mShowsChevron; }
  const std::shared_ptr<const Bitmap>& GetPicture() const { return mPicture; }

  void PaintSelf(DC& dc) override;

 private:
  std::shared_ptr<const Bitmap> mPicture;
  bool mShowsChevron = false;
};
