#pragma once

#include <functional>
#include <memory>
#include <optional>

#include "Host/Toolkit/DropEffect.h"
#include "Host/Toolkit/Geometry.h"
#include "Host/Toolkit/KeyModifiers.h"

class DataObject;
class ViewBase;
class ViewHost;

// One in-process drag: carries the data over the drop targets of a window and delivers the
// drop. Made and owned by the ViewHost (ViewHost::StartDrag), which feeds it the pointer.
//
// The drop target is the nearest enabled view that accepts drops at or above the deepest view
// under the pointer. Entering a target calls DragEnterSelf, moving over it DragOverSelf,
// leaving it DragLeaveSelf. A target answers one effect; an effect outside the allowed ones
// counts as none. The drop goes to the target only when its last answer was an effect; a
// target that refuses the drop (DropSelf false) makes the result none. UI thread only.
class DragDrop {
 public:
  DragDrop(ViewHost& host, std::shared_ptr<const DataObject> data, DropEffect allowedEffects,
           std::weak_ptr<ViewBase> source, std::function<void(DropEffect)> onFinished);
  ~DragDrop();
  DragDrop(const DragDrop&) = delete;
  DragDrop& operator=(const DragDrop&) = delete;

  const DataObject& GetData() const { return *mData; }
  DropEffect GetAllowedEffects() const { return mAllowed; }
  // The current target's last answer (none without a target).
  DropEffect GetCurrentEffect() const { return mEffect; }
  ViewBase* GetCurrentTarget() const;

  // The pointer is at `point` (window coordinates).
  void Move(Point point, KeyModifiers modifiers);
  // Drops at `point` and finishes; returns the effect (none when nothing took the data).
  DropEffect Drop(Point point, KeyModifiers modifiers);
  // Leaves the current target and finishes with none.
  void Cancel();
  bool IsFinished() const { return mFinished; }

 private:
  std::shared_ptr<ViewBase> FindTarget(Point point) const;
  DropEffect Accept(DropEffect effect) const;
  void Finish(DropEffect effect);

  ViewHost& mHost;  // owns this drag
  std::shared_ptr<const DataObject> mData;
  DropEffect mAllowed;
  std::weak_ptr<ViewBase> mSource;
  std::function<void(DropEffect)> mOnFinished;
  std::weak_ptr<ViewBase> mTarget;
  DropEffect mEffect = kDropEffectNone;
  std::optional<Point> mLastPoint;
  bool mFinished = false;
};
