#include "Host/Model/MarkerActions.h"

#include <memory>
#include <optional>
#include <utility>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Model/Action.h"
#include "Host/Model/EditPermissions.h"
#include "Host/Model/Markers.h"
#include "Host/Model/MasterClip.h"
#include "Host/Model/Project.h"
#include "Host/Model/Sequence.h"

namespace {

// One marker put in, taken out or replaced. Keeps the marker before and after and the indices
// it had, never the owner's other markers, so a long history of marker edits costs one marker a
// step. `before` empty: an add; `after` empty: a removal.
template <class Owner>
class MarkerEditAction : public Action {
 public:
  MarkerEditAction(const char* name, boost::intrusive_ptr<Owner> owner, std::size_t index,
                   std::optional<Marker> before, std::optional<Marker> after)
      : Action(name),
        mOwner(std::move(owner)),
        mIndexBefore(index),
        mBefore(std::move(before)),
        mAfter(std::move(after)) {}

  bool Do() override {
    bool done = false;
    mOwner->ChangeMarkers([this, &done](Markers& markers) {
      if (mBefore && !markers.Remove(mIndexBefore)) {
        return false;
      }
      if (mAfter) {
        const auto index = markers.Add(*mAfter);
        if (!index) {
          // Leaves the markers as they were.
          markers.InsertAt(mIndexBefore, *mBefore);
          return false;
        }
        mIndexAfter = *index;
      }
      done = true;
      return true;
    });
    return done;
  }

  void Undo() override {
    mOwner->ChangeMarkers([this](Markers& markers) {
      if (mAfter) {
        markers.Remove(mIndexAfter);
      }
      if (mBefore) {
        markers.InsertAt(mIndexBefore, *mBefore);
      }
      return true;
    });
  }

 private:
  boost::intrusive_ptr<Owner> mOwner;
  std::size_t mIndexBefore;
  std::size_t mIndexAfter = 0;
  std::optional<Marker> mBefore;
  std::optional<Marker> mAfter;
};

// Clearing has to keep every marker it removes; it is the one marker step that does.
template <class Owner>
class ClearMarkersAction : public Action {
 public:
  ClearMarkersAction(boost::intrusive_ptr<Owner> owner, Markers before)
      : Action(MarkerActions::kClearAllMarkers),
        mOwner(std::move(owner)),
        mBefore(std::move(before)) {}

  bool Do() override {
    mOwner->ChangeMarkers([](Markers& markers) {
      markers.Clear();
      return true;
    });
    return true;
  }
  void Undo() override { mOwner->SetMarkers(mBefore); }

 private:
  boost::intrusive_ptr<Owner> mOwner;
  Markers mBefore;
};

template <class Owner>
EditStatus CheckOwner(const boost::intrusive_ptr<Owner>& owner) {
  if (!HOST_VERIFY(owner != nullptr, "Invalid marker owner")) {
    return EditStatus::InvalidArgument;
  }
  return EditPermissions::IsReadOnly(*owner) ? EditStatus::ReadOnly : EditStatus::Done;
}

bool IsValidColor(const Marker& marker) {
  return marker.colorIndex >= 0 && marker.colorIndex <= 7;
}

template <class Owner>
EditStatus Add(const boost::intrusive_ptr<Owner>& owner, const Marker& marker) {
  if (const EditStatus status = CheckOwner(owner); status != EditStatus::Done) {
    return status;
  }
  if (!IsValidColor(marker) || !Markers().Add(marker)) {
    return EditStatus::InvalidArgument;
  }
  return ExecuteModelAction(owner->GetProject(),
                            std::make_unique<MarkerEditAction<Owner>>(
                                MarkerActions::kAddMarker, owner, 0, std::nullopt, marker));
}

template <class Owner>
EditStatus Remove(const boost::intrusive_ptr<Owner>& owner, std::size_t index) {
  if (const EditStatus status = CheckOwner(owner); status != EditStatus::Done) {
    return status;
  }
  if (index >= owner->GetMarkers().Size()) {
    return EditStatus::NotFound;
  }
  return ExecuteModelAction(owner->GetProject(), std::make_unique<MarkerEditAction<Owner>>(
                                                     MarkerActions::kRemoveMarker, owner, index,
                                                     owner->GetMarkers().At(index), std::nullopt));
}

template <class Owner>
EditStatus Change(const boost::intrusive_ptr<Owner>& owner, const char* name, std::size_t index,
                  const Marker& marker, EditStatus unstorable) {
  if (const EditStatus status = CheckOwner(owner); status != EditStatus::Done) {
    return status;
  }
  if (index >= owner->GetMarkers().Size()) {
    return EditStatus::NotFound;
  }
  if (!IsValidColor(marker)) {
    return EditStatus::InvalidArgument;
  }
  if (!Markers().Add(marker)) {
    return unstorable;
  }
  const Marker& before = owner->GetMarkers().At(index);
  if (before == marker) {
    return EditStatus::NoChange;
  }
  return ExecuteModelAction(owner->GetProject(), std::make_unique<MarkerEditAction<Owner>>(
                                                     name, owner, index, before, marker));
}

template <class Owner>
EditStatus Move(const boost::intrusive_ptr<Owner>& owner, std::size_t index, TickTime time) {
  if (owner == nullptr || index >= owner->GetMarkers().Size()) {
    return Change(owner, MarkerActions::kMoveMarker, index, Marker{}, EditStatus::TimeOutOfRange);
  }
  Marker moved = owner->GetMarkers().At(index);
  moved.time = time;
  return Change(owner, MarkerActions::kMoveMarker, index, moved, EditStatus::TimeOutOfRange);
}

template <class Owner>
EditStatus Clear(const boost::intrusive_ptr<Owner>& owner) {
  if (const EditStatus status = CheckOwner(owner); status != EditStatus::Done) {
    return status;
  }
  if (owner->GetMarkers().IsEmpty()) {
    return EditStatus::NoChange;
  }
  return ExecuteModelAction(
      owner->GetProject(), std::make_unique<ClearMarkersAction<Owner>>(owner, owner->GetMarkers()));
}

}  // namespace

EditStatus MarkerActions::AddMarker(const SequenceRef& sequence, const Marker& marker) {
  return Add(sequence, marker);
}

EditStatus MarkerActions::AddMarker(const MasterClipRef& clip, const Marker& marker) {
  return Add(clip, marker);
}

EditStatus MarkerActions::RemoveMarker(const SequenceRef& sequence, std::size_t index) {
  return Remove(sequence, index);
}

EditStatus MarkerActions::RemoveMarker(const MasterClipRef& clip, std::size_t index) {
  return Remove(clip, index);
}

EditStatus MarkerActions::MoveMarker(const SequenceRef& sequence, std::size_t index,
                                     TickTime time) {
  return Move(sequence, index, time);
}

EditStatus MarkerActions::MoveMarker(const MasterClipRef& clip, std::size_t index, TickTime time) {
  return Move(clip, index, time);
}

EditStatus MarkerActions::ChangeMarker(const SequenceRef& sequence, std::size_t index,
                                       const Marker& marker) {
  return Change(sequence, kChangeMarker, index, marker, EditStatus::InvalidArgument);
}

EditStatus MarkerActions::ChangeMarker(const MasterClipRef& clip, std::size_t index,
                                       const Marker& marker) {
  return Change(clip, kChangeMarker, index, marker, EditStatus::InvalidArgument);
}

EditStatus MarkerActions::ClearAllMarkers(const SequenceRef& sequence) {
  return Clear(sequence);
}

EditStatus MarkerActions::ClearAllMarkers(const MasterClipRef& clip) {
  return Clear(clip);
}
