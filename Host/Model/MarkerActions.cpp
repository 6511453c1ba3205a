#include "Host/Model/MarkerActions.h"

#include <functional>
#include <utility>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Model/EditPermissions.h"
#include "Host/Model/FunctionAction.h"
#include "Host/Model/Markers.h"
#include "Host/Model/MasterClip.h"
#include "Host/Model/Project.h"
#include "Host/Model/Sequence.h"

namespace {

// Runs `change` on a copy of the owner's markers and executes the difference as one step.
template <class Owner>
EditStatus EditMarkers(const boost::intrusive_ptr<Owner>& owner, const char* name,
                       const std::function<EditStatus(Markers&)>& change) {
  if (!HOST_VERIFY(owner != nullptr, "Invalid marker owner")) {
    return EditStatus::InvalidArgument;
  }
  if (EditPermissions::IsReadOnly(*owner)) {
    return EditStatus::ReadOnly;
  }
  Markers after = owner->GetMarkers();
  if (const EditStatus status = change(after); status != EditStatus::Done) {
    return status;
  }
  if (after == owner->GetMarkers()) {
    return EditStatus::NoChange;
  }
  return ExecuteModelAction(
      owner->GetProject(),
      FunctionAction::MakeSetter(name, owner->GetMarkers(), std::move(after),
                                 [owner](const Markers& markers) { owner->SetMarkers(markers); }));
}

EditStatus Add(Markers& markers, const Marker& marker) {
  if (marker.colorIndex < 0 || marker.colorIndex > 7) {
    return EditStatus::InvalidArgument;
  }
  return markers.Add(marker) ? EditStatus::Done : EditStatus::InvalidArgument;
}

EditStatus Remove(Markers& markers, std::size_t index) {
  return markers.Remove(index) ? EditStatus::Done : EditStatus::NotFound;
}

EditStatus Move(Markers& markers, std::size_t index, TickTime time) {
  if (index >= markers.Size()) {
    return EditStatus::NotFound;
  }
  Marker moved = markers.At(index);
  moved.time = time;
  Markers trial = markers;
  trial.Remove(index);
  if (!trial.Add(moved)) {
    return EditStatus::TimeOutOfRange;
  }
  markers = std::move(trial);
  return EditStatus::Done;
}

EditStatus Clear(Markers& markers) {
  markers.Clear();
  return EditStatus::Done;
}

}  // namespace

EditStatus MarkerActions::AddMarker(const SequenceRef& sequence, const Marker& marker) {
  return EditMarkers(sequence, kAddMarker, [&](Markers& m) { return Add(m, marker); });
}

EditStatus MarkerActions::AddMarker(const MasterClipRef& clip, const Marker& marker) {
  return EditMarkers(clip, kAddMarker, [&](Markers& m) { return Add(m, marker); });
}

EditStatus MarkerActions::RemoveMarker(const SequenceRef& sequence, std::size_t index) {
  return EditMarkers(sequence, kRemoveMarker, [&](Markers& m) { return Remove(m, index); });
}

EditStatus MarkerActions::RemoveMarker(const MasterClipRef& clip, std::size_t index) {
  return EditMarkers(clip, kRemoveMarker, [&](Markers& m) { return Remove(m, index); });
}

EditStatus MarkerActions::MoveMarker(const SequenceRef& sequence, std::size_t index,
                                     TickTime time) {
  return EditMarkers(sequence, kMoveMarker, [&](Markers& m) { return Move(m, index, time); });
}

EditStatus MarkerActions::MoveMarker(const MasterClipRef& clip, std::size_t index, TickTime time) {
  return EditMarkers(clip, kMoveMarker, [&](Markers& m) { return Move(m, index, time); });
}

EditStatus MarkerActions::ClearAllMarkers(const SequenceRef& sequence) {
  return EditMarkers(sequence, kClearAllMarkers, Clear);
}

EditStatus MarkerActions::ClearAllMarkers(const MasterClipRef& clip) {
  return EditMarkers(clip, kClearAllMarkers, Clear);
}
