#pragma once

#include <memory>

#include "Host/Messaging/Station.h"
#include "Host/Model/ModelRefs.h"
#include "Host/Rows/EffectItemList.h"

class MultiPictureButton;

// One audio part of the targeted clip (one of its audio track items), shown as a section of its
// own: its rows, whether the section is open, and its buttons. Owned by the effect list (shared
// with code that walks the parts); the list destroys the buttons and rows before letting go.
// UI thread only.
class AudioPartInfo {
 public:
  explicit AudioPartInfo(TrackItemRef trackItem);
  ~AudioPartInfo();
  AudioPartInfo(const AudioPartInfo&) = delete;
  AudioPartInfo& operator=(const AudioPartInfo&) = delete;

  const TrackItemRef& GetTrackItem() const { return mTrackItem; }
  // A part of a clip has a header and rows; an audio transition's part holds the transition row.
  bool IsClipPart() const;

  bool IsExpanded() const { return mExpanded; }
  void SetExpanded(bool expanded) { mExpanded = expanded; }

  EffectItemList& GetItems() { return mItems; }
  const EffectItemList& GetItems() const { return mItems; }

  // The section's disclosure button and (with two or more parts) its play button; child views
  // of the list, owned by it through these references.
  const std::shared_ptr<MultiPictureButton>& GetExpanderButton() const { return mExpander; }
  const std::shared_ptr<MultiPictureButton>& GetPlayButton() const { return mPlayButton; }
  void SetExpanderButton(std::shared_ptr<MultiPictureButton> button);
  void SetPlayButton(std::shared_ptr<MultiPictureButton> button);

  // The top of the part's header as last placed (view coordinates); -1 before.
  int GetHeaderTop() const { return mHeaderTop; }
  void SetHeaderTop(int top) { mHeaderTop = top; }

  // Stations the list listens on for this part (the item's and its chain's).
  void SetStations(StationName itemStation, StationName chainStation);
  const StationName& GetItemStation() const { return mItemStation; }
  const StationName& GetChainStation() const { return mChainStation; }

  // Destroys the rows (last to first) and the buttons.
  void Clear();

 private:
  TrackItemRef mTrackItem;
  bool mExpanded = false;
  EffectItemList mItems;
  std::shared_ptr<MultiPictureButton> mExpander;
  std::shared_ptr<MultiPictureButton> mPlayButton;
  int mHeaderTop = -1;
  StationName mItemStation;
  StationName mChainStation;
};
