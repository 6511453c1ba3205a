#include "Host/Model/IntroOutroActions.h"

#include <algorithm>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Model/EditPermissions.h"
#include "Host/Model/FunctionAction.h"
#include "Host/Model/MasterClip.h"
#include "Host/Model/Project.h"
#include "Host/Model/TrackItem.h"

namespace {

enum class Region { Intro, Outro };

EditStatus SetRegion(const TrackItemRef& clip, Region region, TickTime duration) {
  if (!HOST_VERIFY(clip != nullptr, "Invalid TrackItem")) {
    return EditStatus::InvalidArgument;
  }
  if (!IntroOutroActions::CanResize(*clip)) {
    return EditStatus::InvalidArgument;
  }
  if (EditPermissions::IsReadOnly(*clip)) {
    return EditStatus::ReadOnly;
  }
  const TickTime maximum = region == Region::Intro
                               ? IntroOutroActions::GetMaximumIntroDuration(*clip)
                               : IntroOutroActions::GetMaximumOutroDuration(*clip);
  if (duration < 0 || duration > maximum) {
    return EditStatus::TimeOutOfRange;
  }
  const TickTime current =
      region == Region::Intro ? clip->GetIntroDuration() : clip->GetOutroDuration();
  if (duration == current) {
    return EditStatus::NoChange;
  }
  const char* name = region == Region::Intro ? IntroOutroActions::kSetIntroDuration
                                             : IntroOutroActions::kSetOutroDuration;
  return ExecuteModelAction(
      clip->GetProject(),
      FunctionAction::MakeSetter(name, current, duration, [clip, region](TickTime value) {
        if (region == Region::Intro) {
          clip->SetIntroDuration(value);
        } else {
          clip->SetOutroDuration(value);
        }
      }));
}

}  // namespace

bool IntroOutroActions::CanResize(const TrackItem& clip) {
  const MasterClip* master = clip.GetMasterClip().get();
  return clip.IsGraphicsClip() && master && !master->IsMasterGraphic() &&
         !clip.AreIntroOutroLocked();
}

TickTime IntroOutroActions::GetMinimumGap(const TrackItem& clip) {
  return clip.GetFrameRate().GetTicksPerFrame();
}

TickTime IntroOutroActions::GetMaximumIntroDuration(const TrackItem& clip) {
  return std::max<TickTime>(
      0, clip.GetDuration() - clip.GetEffectiveOutroDuration() - GetMinimumGap(clip));
}

TickTime IntroOutroActions::GetMaximumOutroDuration(const TrackItem& clip) {
  return std::max<TickTime>(
      0, clip.GetDuration() - clip.GetEffectiveIntroDuration() - GetMinimumGap(clip));
}

EditStatus IntroOutroActions::SetIntroDuration(const TrackItemRef& clip, TickTime duration) {
  return SetRegion(clip, Region::Intro, duration);
}

EditStatus IntroOutroActions::SetOutroDuration(const TrackItemRef& clip, TickTime duration) {
  return SetRegion(clip, Region::Outro, duration);
}
