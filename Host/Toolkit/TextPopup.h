#pragma once

#include <cstdint>
#include <string>

#include "Host/Toolkit/PopupControl.h"

// A popup that shows the selected item's text with a chevron at its right end (see
// PopupControl for items, choosing and messages). Text wider than the popup is ellipsized.
class TextPopup : public PopupControl {
 public:
  static constexpr int kChevronWidth = 14;
  static constexpr int kTextInset = 4;

  // `commander`: where command items send their commands (null: the parent view). `id`
  // travels in the messages.
  explicit TextPopup(const Rect& bounds, std::int32_t id = 0, Commander* commander = nullptr);

  void PaintSelf(DC& dc) override;
};
