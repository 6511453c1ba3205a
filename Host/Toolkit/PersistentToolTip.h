#pragma once

#include <memory>
#include <string>

#include "Host/Toolkit/Geometry.h"

class ViewBase;

// A tool tip that stays up until its owner takes it down (e.g. while a drag shows a changing
// duration): a small label drawn above every view of the window of `anchor`, next to a window
// point, kept inside the window. It never takes mouse input. The tip disappears when this object
// is destroyed. A tip made for a view that is not in a window shows nothing. UI thread only.
class PersistentToolTip {
 public:
  // Pixels between the pointer and the tip's top-left corner.
  static constexpr Point kPointerOffset{12, 18};

  // `text` may be a "$$$/" key. `windowPoint`: the pointer, window coordinates.
  PersistentToolTip(ViewBase& anchor, std::string text, Point windowPoint);
  ~PersistentToolTip();
  PersistentToolTip(const PersistentToolTip&) = delete;
  PersistentToolTip& operator=(const PersistentToolTip&) = delete;

  void SetText(std::string text);
  const std::string& GetText() const;
  // Follows the pointer (window coordinates).
  void MoveTo(Point windowPoint);
  // In a window and visible.
  bool IsShown() const;
  // Where the tip is drawn, window coordinates; empty when not shown.
  Rect GetWindowBounds() const;

 private:
  class TipView;

  void Place();

  std::shared_ptr<TipView> mView;  // owned together with the root view it is a child of
  Point mWindowPoint;
};
