#include "Host/Toolkit/DragDrop.h"

#include <utility>

#include "Host/Toolkit/DataObject.h"
#include "Host/Toolkit/ViewBase.h"
#include "Host/Toolkit/ViewHost.h"

DragDrop::DragDrop(ViewHost& host, std::shared_ptr<const DataObject> data,
                   DropEffect allowedEffects, std::weak_ptr<ViewBase> source,
                   std::function<void(DropEffect)> onFinished)
    : mHost(host),
      mData(std::move(data)),
      mAllowed(allowedEffects),
      mSource(std::move(source)),
      mOnFinished(std::move(onFinished)) {}

DragDrop::~DragDrop() = default;

ViewBase* DragDrop::GetCurrentTarget() const {
  return mTarget.lock().get();
}

std::shared_ptr<ViewBase> DragDrop::FindTarget(Point point) const {
  for (ViewBase* view = mHost.GetViewAt(point); view != nullptr; view = view->GetParent()) {
    if (view->AcceptsDrops()) {
      return view->IsEnabledInTree() ? view->shared_from_this() : nullptr;
    }
  }
  return nullptr;
}

DropEffect DragDrop::Accept(DropEffect effect) const {
  return (effect & ~mAllowed) == 0 ? effect : kDropEffectNone;
}

void DragDrop::Move(Point point, KeyModifiers modifiers) {
  if (mFinished) {
    return;
  }
  mLastPoint = point;
  const std::shared_ptr<ViewBase> target = FindTarget(point);
  const std::shared_ptr<ViewBase> current = mTarget.lock();
  if (target != current) {
    mTarget.reset();
    mEffect = kDropEffectNone;
    if (current != nullptr) {
      current->DragLeaveSelf();
    }
    if (target != nullptr && !mFinished) {
      mTarget = target;
      mEffect = Accept(target->DragEnterSelf(*mData, modifiers, target->WindowToLocal(point)));
    }
  } else if (target != nullptr) {
    mEffect = Accept(target->DragOverSelf(*mData, modifiers, target->WindowToLocal(point)));
  }
}

DropEffect DragDrop::Drop(Point point, KeyModifiers modifiers) {
  if (mFinished) {
    return kDropEffectNone;
  }
  if (mLastPoint != point) {
    Move(point, modifiers);
  }
  DropEffect result = kDropEffectNone;
  if (const std::shared_ptr<ViewBase> target = mTarget.lock()) {
    mTarget.reset();
    if (mEffect != kDropEffectNone &&
        target->DropSelf(*mData, mEffect, target->WindowToLocal(point))) {
      result = mEffect;
    } else if (mEffect == kDropEffectNone) {
      target->DragLeaveSelf();
    }
  }
  Finish(result);
  return result;
}

void DragDrop::Cancel() {
  if (mFinished) {
    return;
  }
  if (const std::shared_ptr<ViewBase> target = mTarget.lock()) {
    mTarget.reset();
    target->DragLeaveSelf();
  }
  Finish(kDropEffectNone);
}

void DragDrop::Finish(DropEffect effect) {
  mFinished = true;
  mEffect = effect;
  if (const std::shared_ptr<ViewBase> source = mSource.lock()) {
    source->DragFinishedSelf(effect);
  }
  if (mOnFinished) {
    mOnFinished(effect);
  }
}
