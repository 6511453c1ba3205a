#include "Host/Model/SequenceEditAction.h"

#include <algorithm>
#include <memory>
#include <optional>
#include <utility>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Model/EditPermissions.h"
#include "Host/Model/Project.h"
#include "Host/Model/Sequence.h"
#include "Host/Model/Track.h"
#include "Host/Model/TrackItem.h"

SequenceEditAction::SequenceEditAction(std::string name, SequenceRef sequence, Edit edit)
    : Action(std::move(name)), mSequence(std::move(sequence)), mEdit(std::move(edit)) {}

SequenceEditAction::~SequenceEditAction() = default;

std::vector<SequenceEditAction::TrackState> SequenceEditAction::Capture() const {
  std::vector<TrackState> state;
  for (const auto* tracks : {&mSequence->GetVideoTracks(), &mSequence->GetAudioTracks()}) {
    for (const TrackRef& track : *tracks) {
      TrackState trackState{track, {}};
      for (const TrackItemRef& item : track->GetItems()) {
        trackState.items.push_back({item, item->GetStart(), item->GetEnd(), item->GetMediaIn(),
                                    item->GetTransitionData()});
      }
      state.push_back(std::move(trackState));
    }
  }
  return state;
}

void SequenceEditAction::Restore(const std::vector<TrackState>& state) {
  Sequence::ScopedChangeBatch batch(*mSequence);
  for (const TrackState& trackState : state) {
    Track& track = *trackState.track;
    const std::vector<TrackItemRef> current = track.GetItems();
    for (const TrackItemRef& item : current) {
      const bool kept = std::any_of(trackState.items.begin(), trackState.items.end(),
                                    [&](const ItemState& s) { return s.item == item; });
      if (!kept) {
        track.RemoveItem(item.get());
      }
    }
    for (const ItemState& s : trackState.items) {
      if (s.item->GetTrack() != &track) {
        if (Track* other = s.item->GetTrack()) {
          other->RemoveItem(s.item.get());
        }
        track.AddItem(s.item);
      }
      s.item->SetTimes(s.start, s.end, s.mediaIn);
      s.item->SetTransitionData(s.transition);
    }
  }
}

bool SequenceEditAction::Do() {
  if (!HOST_VERIFY(mSequence != nullptr, "Invalid Sequence")) {
    return false;
  }
  if (mRecorded) {
    Restore(mAfter);
    return true;
  }
  mBefore = Capture();
  {
    Sequence::ScopedChangeBatch batch(*mSequence);
    mStatus = mEdit ? mEdit() : EditStatus::InvalidArgument;
  }
  if (mStatus != EditStatus::Done) {
    return false;
  }
  mAfter = Capture();
  mRecorded = true;
  return true;
}

void SequenceEditAction::Undo() {
  Restore(mBefore);
}

EditStatus SequenceEditAction::Execute(std::string name, const SequenceRef& sequence, Edit edit) {
  if (!HOST_VERIFY(sequence != nullptr, "Invalid Sequence")) {
    return EditStatus::InvalidArgument;
  }
  if (EditPermissions::IsReadOnly(*sequence)) {
    return EditStatus::ReadOnly;
  }
  // The action is gone when the stack refuses it; the edit's answer is kept here.
  auto answer = std::make_shared<std::optional<EditStatus>>();
  auto action = std::make_unique<SequenceEditAction>(
      std::move(name), sequence, [edit = std::move(edit), answer] {
        *answer = edit ? edit() : EditStatus::InvalidArgument;
        return **answer;
      });
  const EditStatus status = ExecuteModelAction(sequence->GetProject(), std::move(action));
  if (status != EditStatus::Done && answer->has_value() && **answer != EditStatus::Done) {
    return **answer;
  }
  return status;
}
