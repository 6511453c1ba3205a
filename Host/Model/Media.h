#pragma once

#include <string>

#include "Host/Model/ModelObject.h"
#include "Host/Model/ModelRefs.h"
#include "Host/Time/FrameRate.h"
#include "Host/Time/TickTime.h"

// A piece of source media: what a master clip plays. Its time runs from 0 to its duration; a
// generated media (graphics, titles) has no end and gives kTime_Max.
class Media : public ModelObject {
 public:
  static MediaRef Create(std::string name, TickTime duration, bool hasVideo, bool hasAudio,
                         FrameRate frameRate = kFrameRate_25);

  const std::string& GetName() const { return mName; }
  TickTime GetDuration() const { return mDuration; }
  bool IsGenerated() const { return mDuration >= kTime_Max; }
  bool HasVideo() const { return mHasVideo; }
  bool HasAudio() const { return mHasAudio; }
  const FrameRate& GetFrameRate() const { return mFrameRate; }

  // Media belongs to no project of its own; it is shared by the master clips that play it.
  Project* GetProject() const override { return nullptr; }

  // Not undoable (media is replaced, not edited); sends MediaChangedMessage.
  void SetName(std::string name);

 private:
  Media(std::string name, TickTime duration, bool hasVideo, bool hasAudio, FrameRate frameRate);

  std::string mName;
  TickTime mDuration;
  bool mHasVideo;
  bool mHasAudio;
  FrameRate mFrameRate;
};
