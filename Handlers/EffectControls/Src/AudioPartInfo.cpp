#include "Handlers/EffectControls/Src/AudioPartInfo.h"

#include <utility>

#include "Host/Model/TrackItem.h"
#include "Host/Toolkit/MultiPictureButton.h"

AudioPartInfo::AudioPartInfo(TrackItemRef trackItem) : mTrackItem(std::move(trackItem)) {}

AudioPartInfo::~AudioPartInfo() {
  Clear();
}

bool AudioPartInfo::IsClipPart() const {
  return mTrackItem && mTrackItem->IsClip();
}

void AudioPartInfo::SetExpanderButton(std::shared_ptr<MultiPictureButton> button) {
  mExpander = std::move(button);
}

void AudioPartInfo::SetPlayButton(std::shared_ptr<MultiPictureButton> button) {
  mPlayButton = std::move(button);
}

void AudioPartInfo::SetStations(StationName itemStation, StationName chainStation) {
  mItemStation = std::move(itemStation);
  mChainStation = std::move(chainStation);
}

void AudioPartInfo::Clear() {
  mItems.Clear();
  for (std::shared_ptr<MultiPictureButton>* button : {&mExpander, &mPlayButton}) {
    if (*button) {
      (*button)->Destroy();
      button->reset();
    }
  }
}
