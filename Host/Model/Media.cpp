#include "Host/Model/Media.h"

#include <utility>

#include "Host/Model/ModelMessages.h"

MediaRef Media::Create(std::string name, TickTime duration, bool hasVideo, bool hasAudio,
                       FrameRate frameRate) {
  return MediaRef(new Media(std::move(name), duration, hasVideo, hasAudio, frameRate));
}

Media::Media(std::string name, TickTime duration, bool hasVideo, bool hasAudio, FrameRate frameRate)
    : ModelObject("Media"),
      mName(std::move(name)),
      mDuration(duration < 0 ? 0 : duration),
      mHasVideo(hasVideo),
      mHasAudio(hasAudio),
      mFrameRate(frameRate) {}

void Media::SetName(std::string name) {
  if (name == mName) {
    return;
  }
  mName = std::move(name);
  BroadcastMessage(GetStation(), MediaChangedMessage(MediaRef(this)));
}
