#include "Host/Model/TransitionActions.h"

#include <bit>
#include <cmath>
#include <functional>
#include <utility>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Model/EditPermissions.h"
#include "Host/Model/FunctionAction.h"
#include "Host/Model/Project.h"
#include "Host/Model/SequenceActions.h"
#include "Host/Model/SequenceEditAction.h"
#include "Host/Model/SequenceEditing.h"
#include "Host/Model/TrackItem.h"

namespace {

bool ValidPercent(float value) {
  return std::isfinite(value) && value >= 0.0f && value <= 1.0f;
}

// Runs `change` on a copy of the transition's settings and executes the difference as one step.
EditStatus EditData(const TrackItemRef& transition, const char* name,
                    const std::function<bool(TransitionData&)>& change) {
  if (!HOST_VERIFY(transition && transition->IsTransition(), "Invalid TrackItem")) {
    return EditStatus::InvalidArgument;
  }
  if (EditPermissions::IsReadOnly(*transition)) {
    return EditStatus::ReadOnly;
  }
  TransitionData after = transition->GetTransitionData();
  if (!change(after)) {
    return EditStatus::InvalidArgument;
  }
  if (after == transition->GetTransitionData()) {
    return EditStatus::NoChange;
  }
  return ExecuteModelAction(
      transition->GetProject(),
      FunctionAction::MakeSetter(
          name, transition->GetTransitionData(), std::move(after),
          [transition](const TransitionData& data) { transition->SetTransitionData(data); }));
}

TickTime CutOffset(const TrackItem& transition, TransitionActions::Alignment alignment) {
  switch (alignment) {
    case TransitionActions::Alignment::StartAtCut:
      return 0;
    case TransitionActions::Alignment::EndAtCut:
      return transition.GetDuration();
    default:
      return transition.GetDuration() / 2;
  }
}

// The slide that puts the cut at the alignment's place; nullopt when there is no cut to align to.
std::optional<TickTime> AlignmentDelta(const TrackItem& transition,
                                       TransitionActions::Alignment alignment) {
  const SequenceEditing::TransitionClips clips = SequenceEditing::FindTransitionClips(transition);
  if (alignment == TransitionActions::Alignment::Custom || !clips.clipA || !clips.clipB) {
    return std::nullopt;
  }
  return clips.cut - CutOffset(transition, alignment) - transition.GetStart();
}

}  // namespace

EditStatus TransitionActions::SetStartPercent(const TrackItemRef& transition, float start,
                                              std::optional<float> end) {
  return EditData(transition, kSetStartPercent, [&](TransitionData& data) {
    if (!ValidPercent(start) || (end && !ValidPercent(*end))) {
      return false;
    }
    data.startPercent = start;
    if (end) {
      data.endPercent = *end;
    }
    return true;
  });
}

EditStatus TransitionActions::SetEndPercent(const TrackItemRef& transition, float end,
                                            std::optional<float> start) {
  return EditData(transition, kSetEndPercent, [&](TransitionData& data) {
    if (!ValidPercent(end) || (start && !ValidPercent(*start))) {
      return false;
    }
    data.endPercent = end;
    if (start) {
      data.startPercent = *start;
    }
    return true;
  });
}

EditStatus TransitionActions::SetStartPosition(const TrackItemRef& transition,
                                               ParamPoint position) {
  return EditData(transition, kSetStartPosition, [&](TransitionData& data) {
    if (!data.startPositionMovable || !std::isfinite(position.x) || !std::isfinite(position.y)) {
      return false;
    }
    data.startPosition = position;
    return true;
  });
}

EditStatus TransitionActions::SetEndPosition(const TrackItemRef& transition, ParamPoint position) {
  return EditData(transition, kSetEndPosition, [&](TransitionData& data) {
    if (!data.endPositionMovable || !std::isfinite(position.x) || !std::isfinite(position.y)) {
      return false;
    }
    data.endPosition = position;
    return true;
  });
}

EditStatus TransitionActions::SetBorderWidth(const TrackItemRef& transition, float width) {
  return EditData(transition, kSetBorderWidth, [&](TransitionData& data) {
    if (!std::isfinite(width) || width < 0.0f) {
      return false;
    }
    data.borderWidth = width;
    return true;
  });
}

EditStatus TransitionActions::SetBorderColor(const TrackItemRef& transition, ParamColor color) {
  return EditData(transition, kSetBorderColor, [&](TransitionData& data) {
    if (!IsFinite(ParamValue(color))) {
      return false;
    }
    data.borderColor = color;
    return true;
  });
}

EditStatus TransitionActions::SetSwitchSources(const TrackItemRef& transition, bool switchSources) {
  return EditData(transition, kSetSwitchSources, [&](TransitionData& data) {
    data.switchSources = switchSources;
    return true;
  });
}

EditStatus TransitionActions::SetReverse(const TrackItemRef& transition, bool reverse) {
  return EditData(transition, kSetReverse, [&](TransitionData& data) {
    data.reverse = reverse;
    return true;
  });
}

EditStatus TransitionActions::SetDirection(const TrackItemRef& transition,
                                           const std::vector<std::uint32_t>& directions) {
  return EditData(transition, kSetOrientation, [&](TransitionData& data) {
    const std::size_t allowedCount = data.takesDirectionPair ? 2 : 1;
    if (directions.empty() || directions.size() > allowedCount) {
      return false;
    }
    for (std::uint32_t code : directions) {
      if (!std::has_single_bit(code) || (data.allowedDirections & code) == 0) {
        return false;
      }
    }
    data.directions = directions;
    return true;
  });
}

EditStatus TransitionActions::SetAntiAliasQuality(const TrackItemRef& transition, int quality) {
  return EditData(transition, kSetAntiAliasQuality, [&](TransitionData& data) {
    if (quality < kTransitionAntiAliasOff || quality > kTransitionAntiAliasHigh) {
      return false;
    }
    data.antiAliasQuality = quality;
    return true;
  });
}

EditStatus TransitionActions::SetPrivateData(const TrackItemRef& transition,
                                             ParamBlob privateData) {
  return EditData(transition, kSetPrivateData, [&](TransitionData& data) {
    data.privateData = std::move(privateData);
    return true;
  });
}

EditStatus TransitionActions::SetDuration(const TrackItemRef& transition, TickTime duration) {
  if (!HOST_VERIFY(transition && transition->IsTransition() && transition->GetSequence(),
                   "Invalid TrackItem")) {
    return EditStatus::InvalidArgument;
  }
  if (duration <= 0) {
    return EditStatus::InvalidArgument;
  }
  return SequenceEditAction::Execute(kSetDuration, SequenceRef(transition->GetSequence()), [=] {
    return SequenceEditing::SetTransitionDuration(*transition, duration);
  });
}

TransitionActions::Alignment TransitionActions::GetAlignment(const TrackItem& transition) {
  const SequenceEditing::TransitionClips clips = SequenceEditing::FindTransitionClips(transition);
  const TickTime offset = clips.cut - transition.GetStart();
  if (offset == 0) {
    return Alignment::StartAtCut;
  }
  if (offset == transition.GetDuration()) {
    return Alignment::EndAtCut;
  }
  // Within a tick of the middle: odd tick durations have no exact middle.
  if (std::llabs(2 * offset - transition.GetDuration()) <= 1) {
    return Alignment::CenterAtCut;
  }
  return Alignment::Custom;
}

bool TransitionActions::CanAlign(const TrackItemRef& transition, Alignment alignment) {
  if (!transition || !transition->IsTransition() || EditPermissions::IsReadOnly(*transition)) {
    return false;
  }
  const std::optional<TickTime> delta = AlignmentDelta(*transition, alignment);
  return delta && SequenceEditing::GetSlideTransitionLimits(*transition).Clamp(*delta) == *delta;
}

EditStatus TransitionActions::SetAlignment(const TrackItemRef& transition, Alignment alignment) {
  if (!HOST_VERIFY(transition && transition->IsTransition(), "Invalid TrackItem")) {
    return EditStatus::InvalidArgument;
  }
  const std::optional<TickTime> delta = AlignmentDelta(*transition, alignment);
  if (!delta) {
    return alignment == Alignment::Custom ? EditStatus::NoChange : EditStatus::InvalidArgument;
  }
  if (*delta == 0) {
    return EditStatus::NoChange;
  }
  return SequenceActions::SlideTransition(transition, *delta);
}
