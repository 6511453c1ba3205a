#include "Host/Model/UndoStack.h"

#include <utility>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Model/ModelMessages.h"

namespace {

// Sets a flag for a scope; the flag must be clear on entry.
class ScopedFlag {
 public:
  explicit ScopedFlag(bool& flag) : mFlag(flag) { mFlag = true; }
  ScopedFlag(const ScopedFlag&) = delete;
  ScopedFlag& operator=(const ScopedFlag&) = delete;
  ~ScopedFlag() { mFlag = false; }

 private:
  bool& mFlag;
};

}  // namespace

UndoStack::UndoStack(StationName station) : mStation(std::move(station)) {}

UndoStack::~UndoStack() = default;

bool UndoStack::Execute(std::unique_ptr<Action> action) {
  if (!HOST_VERIFY(!mPerforming, "No action may start while an undo or redo runs")) {
    return false;
  }
  if (!HOST_VERIFY(action != nullptr, "Invalid Action")) {
    return false;
  }
  const bool topLevel = mTransaction == nullptr;
  if (topLevel) {
    mTransaction = std::make_unique<CompoundAction>(action->GetName(), action->GetUndoText());
  }
  const std::size_t slot = mTransaction->Size();
  bool done = false;
  try {
    done = action->Do();
  } catch (...) {
    if (topLevel) {
      // Take back what joined the step before the failure, so no change is left unrecorded.
      auto partial = std::move(mTransaction);
      partial->Undo();
    }
    throw;
  }
  if (done) {
    mTransaction->InsertDone(slot, std::move(action));
  }
  if (topLevel) {
    auto step = std::move(mTransaction);
    if (!step->IsEmpty()) {
      PushStep(std::move(step));
    }
  }
  return done;
}

bool UndoStack::Undo() {
  if (!HOST_VERIFY(!mPerforming, "No undo may start while an undo or redo runs") ||
      !HOST_VERIFY(mTransaction == nullptr,
                   "No undo may start while an action is being executed")) {
    return false;
  }
  if (mDone.empty()) {
    return false;
  }
  {
    ScopedFlag performing(mPerforming);
    std::unique_ptr<Action> step = std::move(mDone.back());
    mDone.pop_back();
    step->Undo();
    mUndone.push_back(std::move(step));
  }
  NotifyHistoryChanged();
  return true;
}

bool UndoStack::Redo() {
  if (!HOST_VERIFY(!mPerforming, "No redo may start while an undo or redo runs") ||
      !HOST_VERIFY(mTransaction == nullptr,
                   "No redo may start while an action is being executed")) {
    return false;
  }
  if (mUndone.empty()) {
    return false;
  }
  bool done = false;
  {
    ScopedFlag performing(mPerforming);
    std::unique_ptr<Action> step = std::move(mUndone.back());
    mUndone.pop_back();
    done = step->Do();
    if (done) {
      mDone.push_back(std::move(step));
    } else {
      // The model no longer matches what the later steps expect.
      ForgetUndoneSteps();
    }
  }
  NotifyHistoryChanged();
  return done;
}

bool UndoStack::CanUndo() const {
  return !mDone.empty() && !mPerforming && !mTransaction;
}

bool UndoStack::CanRedo() const {
  return !mUndone.empty() && !mPerforming && !mTransaction;
}

std::string UndoStack::GetUndoName() const {
  return mDone.empty() ? std::string() : mDone.back()->GetName();
}

std::string UndoStack::GetUndoText() const {
  return mDone.empty() ? std::string() : mDone.back()->GetUndoText();
}

std::string UndoStack::GetRedoName() const {
  return mUndone.empty() ? std::string() : mUndone.back()->GetName();
}

std::vector<std::string> UndoStack::GetUndoNames() const {
  std::vector<std::string> names;
  for (const auto& step : mDone) {
    names.push_back(step->GetName());
  }
  return names;
}

std::vector<std::string> UndoStack::GetRedoNames() const {
  std::vector<std::string> names;
  for (auto it = mUndone.rbegin(); it != mUndone.rend(); ++it) {
    names.push_back((*it)->GetName());
  }
  return names;
}

void UndoStack::BeginCompound(std::string name, std::string undoText) {
  if (!HOST_VERIFY(!mPerforming, "No action may start while an undo or redo runs")) {
    return;
  }
  if (mCompoundDepth++ == 0) {
    if (mTransaction) {
      // Opened from inside an action's Do: the compound joins that step.
      --mCompoundDepth;
      ++mNestedCompounds;
      return;
    }
    mTransaction = std::make_unique<CompoundAction>(std::move(name), std::move(undoText));
  }
}

void UndoStack::EndCompound() {
  if (mNestedCompounds > 0 && mCompoundDepth == 0) {
    --mNestedCompounds;
    return;
  }
  if (!HOST_VERIFY(mCompoundDepth > 0, "EndCompound without BeginCompound")) {
    return;
  }
  if (--mCompoundDepth == 0) {
    auto step = std::move(mTransaction);
    if (step && !step->IsEmpty()) {
      PushStep(std::move(step));
    }
  }
}

UndoStack::ScopedCompound::ScopedCompound(UndoStack& stack, std::string name, std::string undoText)
    : mStack(stack) {
  mStack.BeginCompound(std::move(name), std::move(undoText));
}

UndoStack::ScopedCompound::~ScopedCompound() {
  mStack.EndCompound();
}

void UndoStack::MarkSaved() {
  mSavedDepth = mDone.size();
  NotifyHistoryChanged();
}

bool UndoStack::IsAtSavedState() const {
  return mSavedDepth == mDone.size();
}

void UndoStack::Clear() {
  const bool saved = IsAtSavedState();
  mDone.clear();
  mUndone.clear();
  mSavedDepth = saved ? std::optional<std::size_t>(0) : std::nullopt;
  NotifyHistoryChanged();
}

void UndoStack::SetMaximumSteps(std::size_t steps) {
  mMaximumSteps = steps < 1 ? 1 : steps;
  if (mDone.size() > mMaximumSteps) {
    DropOldestSteps(mDone.size() - mMaximumSteps);
  }
}

void UndoStack::PushStep(std::unique_ptr<Action> step) {
  ForgetUndoneSteps();
  mDone.push_back(std::move(step));
  if (mDone.size() > mMaximumSteps) {
    DropOldestSteps(1);
  }
  NotifyHistoryChanged();
}

void UndoStack::DropOldestSteps(std::size_t count) {
  mDone.erase(mDone.begin(), mDone.begin() + static_cast<std::ptrdiff_t>(count));
  if (mSavedDepth) {
    mSavedDepth =
        *mSavedDepth >= count ? std::optional<std::size_t>(*mSavedDepth - count) : std::nullopt;
  }
}

void UndoStack::ForgetUndoneSteps() {
  mUndone.clear();
  if (mSavedDepth && *mSavedDepth > mDone.size()) {
    mSavedDepth.reset();
  }
}

void UndoStack::NotifyHistoryChanged() {
  if (!mStation.empty()) {
    BroadcastMessage(mStation, UndoHistoryChangedMessage(GetUndoName(), GetRedoName()));
  }
}
