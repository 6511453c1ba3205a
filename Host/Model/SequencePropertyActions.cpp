#include "Host/Model/SequencePropertyActions.h"

#include <utility>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Model/EditPermissions.h"
#include "Host/Model/FunctionAction.h"
#include "Host/Model/MasterClip.h"
#include "Host/Model/Media.h"
#include "Host/Model/Project.h"
#include "Host/Model/Sequence.h"

namespace {

using Point = std::optional<TickTime>;
using Points = std::pair<Point, Point>;

TickTime LastPoint(const Sequence&) {
  return kTime_Max;
}

TickTime LastPoint(const MasterClip& clip) {
  const Media* media = clip.GetMedia().get();
  return media && !media->IsGenerated() ? media->GetDuration() : kTime_Max;
}

template <class Owner>
EditStatus SetPoints(const boost::intrusive_ptr<Owner>& owner, const char* name, Point in,
                     Point out) {
  if (!HOST_VERIFY(owner != nullptr, "Invalid in/out owner")) {
    return EditStatus::InvalidArgument;
  }
  if (EditPermissions::IsReadOnly(*owner)) {
    return EditStatus::ReadOnly;
  }
  const TickTime last = LastPoint(*owner);
  for (const Point& point : {in, out}) {
    if (point && (*point < 0 || !IsStorableTime(*point) || *point > last)) {
      return EditStatus::TimeOutOfRange;
    }
  }
  if (in && out && *in > *out) {
    return EditStatus::TimeOutOfRange;
  }
  const Points before{owner->GetInPoint(), owner->GetOutPoint()};
  const Points after{in, out};
  if (before == after) {
    return EditStatus::NoChange;
  }
  return ExecuteModelAction(owner->GetProject(), FunctionAction::MakeSetter(
                                                     name, before, after, [owner](const Points& p) {
                                                       owner->SetInPoint(p.first);
                                                       owner->SetOutPoint(p.second);
                                                     }));
}

}  // namespace

EditStatus SequencePropertyActions::SetInPoint(const SequenceRef& sequence,
                                               std::optional<TickTime> in) {
  return SetPoints(sequence, kSetInPoint, in, sequence ? sequence->GetOutPoint() : std::nullopt);
}

EditStatus SequencePropertyActions::SetOutPoint(const SequenceRef& sequence,
                                                std::optional<TickTime> out) {
  return SetPoints(sequence, kSetOutPoint, sequence ? sequence->GetInPoint() : std::nullopt, out);
}

EditStatus SequencePropertyActions::SetInOutPoints(const SequenceRef& sequence,
                                                   std::optional<TickTime> in,
                                                   std::optional<TickTime> out) {
  return SetPoints(sequence, kSetInOutPoints, in, out);
}

EditStatus SequencePropertyActions::SetInPoint(const MasterClipRef& clip,
                                               std::optional<TickTime> in) {
  return SetPoints(clip, kSetInPoint, in, clip ? clip->GetOutPoint() : std::nullopt);
}

EditStatus SequencePropertyActions::SetOutPoint(const MasterClipRef& clip,
                                                std::optional<TickTime> out) {
  return SetPoints(clip, kSetOutPoint, clip ? clip->GetInPoint() : std::nullopt, out);
}

EditStatus SequencePropertyActions::SetInOutPoints(const MasterClipRef& clip,
                                                   std::optional<TickTime> in,
                                                   std::optional<TickTime> out) {
  return SetPoints(clip, kSetInOutPoints, in, out);
}
