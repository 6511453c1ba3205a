#pragma once

// What the effect list needs of the view that owns its vertical scroll bar (the panel view).
// Positions are pixels of the list's content scrolled out at the top. UI thread only.
class EffectControlsListScroller {
 public:
  virtual ~EffectControlsListScroller() = default;

  // Fits the scroll bar to the list: `contentHeight` pixels of rows shown in `visibleHeight`
  // pixels (the list's height). May change the position when it no longer fits.
  virtual void SizeListScrollBar(int contentHeight, int visibleHeight) = 0;
  virtual int GetListScrollPosition() const = 0;
  // Moves the thumb without sending a scroll message back to the list.
  virtual void SetListScrollPosition(int position) = 0;
};
