#pragma once

#include <memory>

#include "Host/Model/ModelRefs.h"
#include "Host/Model/TickTime.h"
#include "Host/Toolkit/SubView.h"

class EffectControlsListView;
class ImageList;

// The keyframe area beside the list: the targeted clip's span as a band, one track per visible
// list row at the row's position, the keyframes of time-varying parameters and the current
// time line. It owns no rows: it reads their positions and the shared time state (visible start
// time, seconds per pixel) from the list it was given.
//
// Owned by the panel view (a child view). UI thread only.
class EffectControlsKeyframeView : public SubView {
 public:
  explicit EffectControlsKeyframeView(Commander* superCommander = nullptr);
  ~EffectControlsKeyframeView() override;

  // The list whose rows and time state the area follows (shared with the panel view).
  void SetListView(std::weak_ptr<EffectControlsListView> list) { mList = std::move(list); }
  // The keyframe glyphs (6 x kind + variant); null draws plain diamonds.
  void SetKeyframeImages(std::shared_ptr<const ImageList> images) { mImages = std::move(images); }

  void SetToolMode(int mode) { mToolMode = mode; }
  int GetToolMode() const { return mToolMode; }
  void SetPinToClip(bool pinned);
  bool IsPinnedToClip() const { return mPinned; }
  void SetKeyframesVisible(bool visible) { mKeyframesVisible = visible; }

  // The clip's span and the edit line, in sequence ticks.
  void SetClipSpan(TickTime start, TickTime end);
  void SetEditTime(TickTime time);
  TickTime GetEditTime() const { return mEditTime; }

  // Snapping flags (commands 18006 to 18013).
  enum SnapFlag : unsigned {
    kSnapKeyframes = 1,
    kSnapVideo = 2,
    kSnapAudio = 4,
    kSnapMarkers = 8,
    kSnapCurrentTime = 16,
    kSnapClip = 32,
  };
  void SetSnapFlags(unsigned flags) { mSnapFlags = flags; }
  unsigned GetSnapFlags() const { return mSnapFlags; }

  // Time mapping from the list's time state: x in local pixels.
  TickTime GetVisibleStartTime() const;
  double GetSecondsPerPixel() const;
  double TimeToX(TickTime time) const;
  TickTime XToTime(double x) const;

  // Selected keyframes across the list's keyframe selection.
  int GetSelectedKeyframeCount() const;

  void PaintSelf(DC& dc) override;

 private:
  std::weak_ptr<EffectControlsListView> mList;
  std::shared_ptr<const ImageList> mImages;
  int mToolMode = 100;
  bool mPinned = true;
  bool mKeyframesVisible = true;
  TickTime mClipStart = 0;
  TickTime mClipEnd = 0;
  TickTime mEditTime = 0;
  unsigned mSnapFlags =
      kSnapKeyframes | kSnapVideo | kSnapAudio | kSnapMarkers | kSnapCurrentTime | kSnapClip;
};
