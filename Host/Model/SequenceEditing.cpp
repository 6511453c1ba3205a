#include "Host/Model/SequenceEditing.h"

#include <algorithm>
#include <cmath>
#include <optional>
#include <set>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Model/Sequence.h"
#include "Host/Model/Track.h"
#include "Host/Model/TrackItem.h"
#include "Host/Time/FrameRate.h"
#include "Host/Time/TimePoint.h"

namespace {

using Limits = SequenceEditing::Limits;
using Edge = SequenceEditing::Edge;

constexpr TickTime kNoLimitBelow = kTime_Min;
constexpr TickTime kNoLimitAbove = kTime_Max;

TickTime FrameOf(const TrackItem& item) {
  return item.GetFrameRate().GetTicksPerFrame();
}

// Limits from the lowest and highest delta the constraints allow; none when they contradict
// (then nothing may move). A limit never points the wrong way: an item already beyond one may
// still move back.
Limits MakeLimits(TickTime lowest, TickTime highest) {
  if (lowest > highest) {
    return {};
  }
  return {std::min<TickTime>(0, lowest), std::max<TickTime>(0, highest)};
}

TickTime CutOf(const TrackItem& transition) {
  const auto offset = static_cast<TickTime>(std::llround(
      static_cast<double>(transition.GetDuration()) * transition.GetTransitionData().cutRatio));
  return transition.GetStart() + offset;
}

bool SetTransitionSpan(TrackItem& transition, TickTime start, TickTime end, TickTime cut) {
  if (!transition.SetTimes(start, end, transition.GetMediaIn())) {
    return false;
  }
  TransitionData data = transition.GetTransitionData();
  const TickTime duration = end - start;
  data.cutRatio = duration > 0 ? static_cast<double>(cut - start) / static_cast<double>(duration)
                               : data.cutRatio;
  transition.SetTransitionData(std::move(data));
  return true;
}

bool Shift(TrackItem& item, TickTime delta) {
  return item.SetTimes(item.GetStart() + delta, item.GetEnd() + delta, item.GetMediaIn());
}

bool ShiftFits(const TrackItem& item, TickTime delta) {
  return IsStorableTime(AddTimes(item.GetStart(), delta)) &&
         IsStorableTime(AddTimes(item.GetEnd(), delta));
}

// Items of the track that start at or after `time`, except those in `except`.
std::vector<TrackItemRef> ItemsFrom(const Track& track, TickTime time,
                                    const std::set<const TrackItem*>& except) {
  std::vector<TrackItemRef> found;
  for (const TrackItemRef& item : track.GetItems()) {
    if (item->GetStart() >= time && !except.contains(item.get())) {
      found.push_back(item);
    }
  }
  return found;
}

// The sequence of `item`, for batching its messages (null off a sequence).
Sequence* SequenceOf(const TrackItem& item) {
  return item.GetSequence();
}

class Batch {
 public:
  explicit Batch(Sequence* sequence) {
    if (sequence) {
      mBatch.emplace(*sequence);
    }
  }

 private:
  std::optional<Sequence::ScopedChangeBatch> mBatch;
};

}  // namespace

TickTime SequenceEditing::Limits::Clamp(TickTime delta) const {
  return std::clamp(delta, minimum, maximum);
}

SequenceEditing::TransitionClips SequenceEditing::FindTransitionClips(const TrackItem& transition) {
  TransitionClips clips;
  const Track* track = transition.GetTrack();
  if (!transition.IsTransition() || !track) {
    return clips;
  }
  const TickTime cut = CutOf(transition);
  clips.cut = cut;
  for (const TrackItemRef& item : track->GetItems()) {
    if (!item->IsClip()) {
      continue;
    }
    if (std::llabs(item->GetEnd() - cut) <= 1 && item->GetStart() < cut) {
      clips.clipA = item;
    } else if (std::llabs(item->GetStart() - cut) <= 1 && item->GetEnd() > cut) {
      clips.clipB = item;
    }
  }
  if (clips.clipA) {
    clips.cut = clips.clipA->GetEnd();
  } else if (clips.clipB) {
    clips.cut = clips.clipB->GetStart();
  }
  return clips;
}

TrackItemRef SequenceEditing::FindTransitionAt(const TrackItem& clip, Edge edge) {
  const Track* track = clip.GetTrack();
  if (!track || !clip.IsClip()) {
    return nullptr;
  }
  for (const TrackItemRef& item : track->GetItems()) {
    if (!item->IsTransition()) {
      continue;
    }
    const TransitionClips clips = FindTransitionClips(*item);
    if ((edge == Edge::End ? clips.clipA : clips.clipB).get() == &clip) {
      return item;
    }
  }
  return nullptr;
}

// --- Transition trims and slides ---

SequenceEditing::Limits SequenceEditing::GetTrimTransitionLimits(const TrackItem& transition,
                                                                 Edge edge) {
  const TransitionClips clips = FindTransitionClips(transition);
  const TrackItem* a = clips.clipA.get();
  const TrackItem* b = clips.clipB.get();
  if (!a && !b) {
    return {};
  }
  const TickTime frame = FrameOf(transition);
  const TickTime start = transition.GetStart();
  const TickTime end = transition.GetEnd();
  if (edge == Edge::Start) {
    TickTime lowest = a ? a->GetStart() : b->GetStart();
    if (a && b) {
      lowest = std::max(lowest, b->GetMediaStartInSequence());
    }
    TickTime highest = end - frame;
    if (a) {
      highest = std::min(highest, clips.cut);
    }
    return MakeLimits(SubtractTimes(lowest, start), SubtractTimes(highest, start));
  }
  TickTime highest = b ? b->GetEnd() : a->GetEnd();
  if (a && b) {
    highest = std::min(highest, a->GetMediaEndInSequence());
  }
  TickTime lowest = start + frame;
  if (b) {
    lowest = std::max(lowest, clips.cut);
  }
  return MakeLimits(SubtractTimes(lowest, end), SubtractTimes(highest, end));
}

EditStatus SequenceEditing::TrimTransition(TrackItem& transition, Edge edge, TickTime delta) {
  if (!HOST_VERIFY(transition.IsTransition(), "Invalid TrackItem")) {
    return EditStatus::InvalidArgument;
  }
  if (delta == 0) {
    return EditStatus::NoChange;
  }
  if (GetTrimTransitionLimits(transition, edge).Clamp(delta) != delta) {
    return EditStatus::TimeOutOfRange;
  }
  const TickTime cut = FindTransitionClips(transition).cut;
  Batch batch(SequenceOf(transition));
  if (edge == Edge::Start) {
    SetTransitionSpan(transition, transition.GetStart() + delta, transition.GetEnd(), cut);
  } else {
    SetTransitionSpan(transition, transition.GetStart(), transition.GetEnd() + delta, cut);
  }
  return EditStatus::Done;
}

SequenceEditing::Limits SequenceEditing::GetSlideTransitionLimits(const TrackItem& transition) {
  const TransitionClips clips = FindTransitionClips(transition);
  const TrackItem* a = clips.clipA.get();
  const TrackItem* b = clips.clipB.get();
  if (!a || !b) {
    return {};
  }
  const TickTime start = transition.GetStart();
  const TickTime end = transition.GetEnd();
  const TickTime lowest =
      std::max({SubtractTimes(a->GetStart(), start), SubtractTimes(clips.cut, end),
                SubtractTimes(b->GetMediaStartInSequence(), start)});
  const TickTime highest =
      std::min({SubtractTimes(clips.cut, start), SubtractTimes(b->GetEnd(), end),
                SubtractTimes(a->GetMediaEndInSequence(), end)});
  return MakeLimits(lowest, highest);
}

EditStatus SequenceEditing::SlideTransition(TrackItem& transition, TickTime delta) {
  if (!HOST_VERIFY(transition.IsTransition(), "Invalid TrackItem")) {
    return EditStatus::InvalidArgument;
  }
  if (delta == 0) {
    return EditStatus::NoChange;
  }
  if (GetSlideTransitionLimits(transition).Clamp(delta) != delta) {
    return EditStatus::TimeOutOfRange;
  }
  const TickTime cut = FindTransitionClips(transition).cut;
  Batch batch(SequenceOf(transition));
  SetTransitionSpan(transition, transition.GetStart() + delta, transition.GetEnd() + delta, cut);
  return EditStatus::Done;
}

EditStatus SequenceEditing::SetTransitionDuration(TrackItem& transition, TickTime duration) {
  if (!HOST_VERIFY(transition.IsTransition(), "Invalid TrackItem")) {
    return EditStatus::InvalidArgument;
  }
  const TickTime frame = FrameOf(transition);
  if (duration < frame || !IsStorableTime(duration)) {
    return EditStatus::InvalidArgument;
  }
  const TransitionClips clips = FindTransitionClips(transition);
  const TrackItem* a = clips.clipA.get();
  const TrackItem* b = clips.clipB.get();
  TickTime start = transition.GetStart();
  TickTime end = transition.GetEnd();
  if (a && b) {
    const double ratio = transition.GetTransitionData().cutRatio;
    const TickTime before =
        static_cast<TickTime>(std::llround(static_cast<double>(duration) * ratio));
    const TickTime lowest = std::max(a->GetStart(), b->GetMediaStartInSequence());
    const TickTime highest = std::min(b->GetEnd(), a->GetMediaEndInSequence());
    start = std::clamp(SubtractTimes(clips.cut, before), std::min(lowest, clips.cut), clips.cut);
    end = std::clamp(AddTimes(start, duration), clips.cut, std::max(highest, clips.cut));
  } else if (b) {
    end = std::min(AddTimes(start, duration), b->GetEnd());
  } else if (a) {
    start = std::max(SubtractTimes(end, duration), a->GetStart());
  } else {
    return EditStatus::InvalidArgument;
  }
  if (end - start < frame) {
    return EditStatus::TimeOutOfRange;
  }
  if (start == transition.GetStart() && end == transition.GetEnd()) {
    return EditStatus::NoChange;
  }
  Batch batch(SequenceOf(transition));
  SetTransitionSpan(transition, start, end, clips.cut);
  return EditStatus::Done;
}

// --- Roll ---

SequenceEditing::Limits SequenceEditing::GetRollLimits(const TrackItem& clipA,
                                                       const TrackItem& clipB) {
  if (!clipA.IsClip() || !clipB.IsClip() || clipA.GetTrack() == nullptr ||
      clipA.GetTrack() != clipB.GetTrack() || clipA.GetEnd() != clipB.GetStart()) {
    return {};
  }
  const TickTime cut = clipA.GetEnd();
  const TrackItemRef transition = FindTransitionAt(clipA, Edge::End);
  const TickTime before = transition ? cut - transition->GetStart() : 0;  // B's head it needs
  const TickTime after = transition ? transition->GetEnd() - cut : 0;     // A's tail it needs
  TickTime lowest = std::max(clipA.GetStart() + FrameOf(clipA) - cut,
                             SubtractTimes(AddTimes(clipB.GetMediaStartInSequence(), before), cut));
  TickTime highest =
      std::min(SubtractTimes(SubtractTimes(clipA.GetMediaEndInSequence(), after), cut),
               clipB.GetEnd() - FrameOf(clipB) - cut);
  if (transition) {
    lowest = std::max(lowest, clipA.GetStart() - transition->GetStart());
    highest = std::min(highest, clipB.GetEnd() - transition->GetEnd());
  }
  return MakeLimits(lowest, highest);
}

EditStatus SequenceEditing::Roll(TrackItem& clipA, TrackItem& clipB, TickTime delta) {
  if (delta == 0) {
    return EditStatus::NoChange;
  }
  if (!HOST_VERIFY(clipA.GetEnd() == clipB.GetStart(), "Roll needs adjacent clips")) {
    return EditStatus::InvalidArgument;
  }
  if (GetRollLimits(clipA, clipB).Clamp(delta) != delta) {
    return EditStatus::TimeOutOfRange;
  }
  const TrackItemRef transition = FindTransitionAt(clipA, Edge::End);
  const TickTime newCut = clipA.GetEnd() + delta;
  const TickTime bMediaIn = clipB.SequenceTimeToClipTime(SequenceTime(newCut)).Ticks();
  Batch batch(SequenceOf(clipA));
  clipA.SetTimes(clipA.GetStart(), newCut, clipA.GetMediaIn());
  clipB.SetTimes(newCut, clipB.GetEnd(), bMediaIn);
  if (transition) {
    Shift(*transition, delta);
  }
  return EditStatus::Done;
}

// --- Ripple trim ---

SequenceEditing::Limits SequenceEditing::GetRippleTrimLimits(const std::vector<TrackItemRef>& items,
                                                             Edge edge) {
  if (items.empty()) {
    return {};
  }
  std::set<const Track*> tracks;
  TickTime lowest = kNoLimitBelow;
  TickTime highest = kNoLimitAbove;
  for (const TrackItemRef& item : items) {
    if (!item || !item->IsClip() || !item->GetTrack() || !tracks.insert(item->GetTrack()).second) {
      return {};
    }
    const TickTime frame = FrameOf(*item);
    const TrackItemRef atEnd = FindTransitionAt(*item, Edge::End);
    if (edge == Edge::End) {
      const TickTime tail = atEnd ? atEnd->GetEnd() - item->GetEnd() : 0;
      lowest = std::max(lowest, item->GetStart() + frame - item->GetEnd());
      highest = std::min(highest, SubtractTimes(SubtractTimes(item->GetMediaEndInSequence(), tail),
                                                item->GetEnd()));
      if (atEnd) {
        lowest = std::max(lowest, item->GetStart() - atEnd->GetStart());
      }
    } else {
      const TrackItemRef atStart = FindTransitionAt(*item, Edge::Start);
      const TickTime firstShown = atStart ? atStart->GetStart() : item->GetStart();
      lowest = std::max(lowest, SubtractTimes(item->GetMediaStartInSequence(), firstShown));
      highest = std::min(highest, item->GetDuration() - frame);
      if (atEnd) {
        highest = std::min(highest, atEnd->GetStart() - item->GetStart());
      }
    }
  }
  return MakeLimits(lowest, highest);
}

EditStatus SequenceEditing::RippleTrim(const std::vector<TrackItemRef>& items, Edge edge,
                                       TickTime delta) {
  if (items.empty() || !items.front()) {
    return EditStatus::InvalidArgument;
  }
  if (delta == 0) {
    return EditStatus::NoChange;
  }
  if (GetRippleTrimLimits(items, edge).Clamp(delta) != delta) {
    return EditStatus::TimeOutOfRange;
  }
  // What follows each trimmed item on its track moves by `shift`.
  const TickTime shift = edge == Edge::End ? delta : -delta;
  std::set<const TrackItem*> trimmed;
  for (const TrackItemRef& item : items) {
    trimmed.insert(item.get());
  }
  std::vector<TrackItemRef> followers;
  for (const TrackItemRef& item : items) {
    for (const TrackItemRef& follower : ItemsFrom(*item->GetTrack(), item->GetEnd(), trimmed)) {
      followers.push_back(follower);
    }
    if (TrackItemRef transition = FindTransitionAt(*item, Edge::End);
        transition && transition->GetStart() < item->GetEnd()) {
      followers.push_back(transition);
    }
  }
  for (const TrackItemRef& follower : followers) {
    if (!ShiftFits(*follower, shift)) {
      return EditStatus::TimeOutOfRange;
    }
  }
  Batch batch(SequenceOf(*items.front()));
  for (const TrackItemRef& item : items) {
    if (edge == Edge::End) {
      item->SetTimes(item->GetStart(), item->GetEnd() + delta, item->GetMediaIn());
    } else {
      const TickTime mediaIn =
          item->SequenceTimeToClipTime(SequenceTime(item->GetStart()) + delta).Ticks();
      item->SetTimes(item->GetStart(), item->GetEnd() - delta, mediaIn);
    }
  }
  for (const TrackItemRef& follower : followers) {
    Shift(*follower, shift);
  }
  return EditStatus::Done;
}

// --- Plain trim ---

SequenceEditing::Limits SequenceEditing::GetTrimLimits(const TrackItem& clip, Edge edge) {
  const Track* track = clip.GetTrack();
  if (!clip.IsClip() || !track || FindTransitionAt(clip, edge)) {
    return {};
  }
  const TickTime frame = FrameOf(clip);
  if (edge == Edge::End) {
    TickTime next = kNoLimitAbove;
    for (const TrackItemRef& item : track->GetItems()) {
      if (item.get() != &clip && item->GetStart() >= clip.GetEnd()) {
        next = std::min(next, item->GetStart());
      }
    }
    const TickTime highest = std::min(next, clip.GetMediaEndInSequence());
    return MakeLimits(clip.GetStart() + frame - clip.GetEnd(),
                      SubtractTimes(highest, clip.GetEnd()));
  }
  TickTime previous = kNoLimitBelow;
  for (const TrackItemRef& item : track->GetItems()) {
    if (item.get() != &clip && item->GetEnd() <= clip.GetStart()) {
      previous = std::max(previous, item->GetEnd());
    }
  }
  const TickTime lowest = std::max(previous, clip.GetMediaStartInSequence());
  return MakeLimits(SubtractTimes(lowest, clip.GetStart()), clip.GetDuration() - frame);
}

EditStatus SequenceEditing::Trim(TrackItem& clip, Edge edge, TickTime delta) {
  if (delta == 0) {
    return EditStatus::NoChange;
  }
  if (GetTrimLimits(clip, edge).Clamp(delta) != delta) {
    return EditStatus::TimeOutOfRange;
  }
  Batch batch(SequenceOf(clip));
  if (edge == Edge::End) {
    clip.SetTimes(clip.GetStart(), clip.GetEnd() + delta, clip.GetMediaIn());
  } else {
    const TickTime mediaIn =
        clip.SequenceTimeToClipTime(SequenceTime(clip.GetStart()) + delta).Ticks();
    clip.SetTimes(clip.GetStart() + delta, clip.GetEnd(), mediaIn);
  }
  return EditStatus::Done;
}

EditStatus SequenceEditing::RemoveItems(const std::vector<TrackItemRef>& items) {
  std::vector<TrackItemRef> removable;
  for (const TrackItemRef& item : items) {
    if (item && item->GetTrack() &&
        std::find(removable.begin(), removable.end(), item) == removable.end()) {
      removable.push_back(item);
    }
  }
  if (removable.empty()) {
    return EditStatus::NoChange;
  }
  Batch batch(SequenceOf(*removable.front()));
  for (const TrackItemRef& item : removable) {
    item->GetTrack()->RemoveItem(item.get());
  }
  return EditStatus::Done;
}
