#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <vector>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Messaging/FunctionListener.h"
#include "Host/Messaging/MessagingTestScope.h"
#include "Host/Messaging/Station.h"
#include "Host/Model/FunctionAction.h"
#include "Host/Model/ModelMessages.h"
#include "Host/Model/UndoStack.h"

namespace {

// Appends `text` to a log string on do, takes it off on undo; the log shows the model's state.
std::unique_ptr<Action> Append(std::string* log, std::string text,
                               std::string name = "Test.Append") {
  return std::make_unique<FunctionAction>(
      std::move(name),
      [log, text] {
        *log += text;
        return true;
      },
      [log, text] { log->resize(log->size() - text.size()); });
}

std::unique_ptr<Action> Failing() {
  return std::make_unique<FunctionAction>(
      "Test.Fail", [] { return false; }, [] {});
}

class UndoStackTest : public ::testing::Test {
 protected:
  MessagingTestScope messaging;
  std::string log;
  UndoStack stack{"Test.Undo"};
};

TEST_F(UndoStackTest, UndoAndRedoWalkTheHistoryInOrder) {
  ASSERT_TRUE(stack.Execute(Append(&log, "a", "A")));
  ASSERT_TRUE(stack.Execute(Append(&log, "b", "B")));
  EXPECT_EQ(log, "ab");
  EXPECT_EQ(stack.GetUndoName(), "B");

  EXPECT_TRUE(stack.Undo());
  EXPECT_EQ(log, "a");
  EXPECT_EQ(stack.GetRedoName(), "B");
  EXPECT_TRUE(stack.Undo());
  EXPECT_EQ(log, "");
  EXPECT_FALSE(stack.Undo());

  EXPECT_TRUE(stack.Redo());
  EXPECT_TRUE(stack.Redo());
  EXPECT_EQ(log, "ab");
  EXPECT_FALSE(stack.Redo());
  EXPECT_EQ(stack.GetUndoNames(), (std::vector<std::string>{"A", "B"}));
}

TEST_F(UndoStackTest, ANewActionDropsTheRedoSteps) {
  stack.Execute(Append(&log, "a"));
  stack.Execute(Append(&log, "b"));
  stack.Undo();
  stack.Execute(Append(&log, "c", "C"));
  EXPECT_EQ(log, "ac");
  EXPECT_FALSE(stack.CanRedo());
  EXPECT_EQ(stack.GetUndoName(), "C");
}

TEST_F(UndoStackTest, ACompoundIsOneStepUndoneInReverseOrder) {
  {
    UndoStack::ScopedCompound compound(stack, "Both");
    stack.Execute(Append(&log, "x"));
    stack.Execute(Append(&log, "yz"));
  }
  EXPECT_EQ(stack.GetUndoNames(), (std::vector<std::string>{"Both"}));
  stack.Undo();
  EXPECT_EQ(log, "");
  stack.Redo();
  EXPECT_EQ(log, "xyz");
}

TEST_F(UndoStackTest, NestedCompoundsMakeOneStepNamedByTheOutermost) {
  stack.BeginCompound("Outer");
  stack.Execute(Append(&log, "a"));
  stack.BeginCompound("Inner");
  stack.Execute(Append(&log, "b"));
  stack.EndCompound();
  stack.EndCompound();
  EXPECT_EQ(stack.GetUndoNames(), (std::vector<std::string>{"Outer"}));
}

TEST_F(UndoStackTest, AnEmptyCompoundLeavesNoStep) {
  { UndoStack::ScopedCompound compound(stack, "Nothing"); }
  EXPECT_FALSE(stack.CanUndo());
}

TEST_F(UndoStackTest, AFailedActionLeavesNoStep) {
  EXPECT_FALSE(stack.Execute(Failing()));
  EXPECT_FALSE(stack.CanUndo());
}

TEST_F(UndoStackTest, ACompoundActionThatFailsHalfwayTakesBackItsFirstPart) {
  auto compound = std::make_unique<CompoundAction>("Half");
  compound->Add(Append(&log, "a"));
  compound->Add(Failing());
  EXPECT_FALSE(stack.Execute(std::move(compound)));
  EXPECT_EQ(log, "");
  EXPECT_FALSE(stack.CanUndo());
}

TEST_F(UndoStackTest, NoActionStartsWhileAnUndoRuns) {
  // A listener that reacts to the undo by starting an edit: the edit must be refused, or the
  // history would record a step in the middle of taking one back.
  bool refused = false;
  auto sneaky = std::make_unique<FunctionAction>(
      "Test.Sneaky", [] { return true; }, [&] { refused = !stack.Execute(Append(&log, "!")); });
  stack.Execute(std::move(sneaky));
  ClearRecordedDebugAssertions();
  ASSERT_TRUE(stack.Undo());
  EXPECT_TRUE(refused);
  EXPECT_EQ(log, "");
  ASSERT_EQ(RecordedDebugAssertions().size(), 1u);
  EXPECT_EQ(RecordedDebugAssertions()[0].condition, "!mPerforming");
  EXPECT_FALSE(stack.IsPerformingUndoOrRedo());
  EXPECT_TRUE(stack.Redo());
}

TEST_F(UndoStackTest, AnActionExecutedFromInsideAnotherJoinsItsStepAfterIt) {
  auto outer = std::make_unique<FunctionAction>(
      "Outer",
      [&] {
        log += "o";
        stack.Execute(Append(&log, "n", "Nested"));
        return true;
      },
      [&] { log.resize(log.size() - 1); });
  stack.Execute(std::move(outer));
  EXPECT_EQ(log, "on");
  EXPECT_EQ(stack.GetUndoNames(), (std::vector<std::string>{"Outer"}));
  stack.Undo();
  EXPECT_EQ(log, "");
}

TEST_F(UndoStackTest, UndoWhileACompoundIsOpenIsRefused) {
  stack.Execute(Append(&log, "a"));
  stack.BeginCompound("Open");
  ClearRecordedDebugAssertions();
  EXPECT_FALSE(stack.Undo());
  EXPECT_EQ(RecordedDebugAssertions().size(), 1u);
  stack.EndCompound();
  EXPECT_EQ(log, "a");
}

TEST_F(UndoStackTest, TheHistoryIsLimitedToTheMaximumSteps) {
  stack.SetMaximumSteps(2);
  stack.Execute(Append(&log, "a", "A"));
  stack.Execute(Append(&log, "b", "B"));
  stack.Execute(Append(&log, "c", "C"));
  EXPECT_EQ(stack.GetUndoNames(), (std::vector<std::string>{"B", "C"}));
}

TEST_F(UndoStackTest, EveryHistoryChangeIsAnnounced) {
  std::vector<std::string> undoNames;
  FunctionListener listener([&](const Message& message) {
    if (const auto* changed = message.As<UndoHistoryChangedMessage>()) {
      undoNames.push_back(changed->undoName);
    }
  });
  AddListener("Test.Undo", listener);
  stack.Execute(Append(&log, "a", "A"));
  stack.Undo();
  stack.Redo();
  EXPECT_EQ(undoNames, (std::vector<std::string>{"A", "", "A"}));
}

}  // namespace

TEST_F(UndoStackTest, UndoAndRedoBackToTheSavedStateMakeItSavedAgain) {
  EXPECT_TRUE(stack.IsAtSavedState());  // a new history starts saved
  stack.Execute(Append(&log, "a"));
  EXPECT_FALSE(stack.IsAtSavedState());
  stack.MarkSaved();
  EXPECT_TRUE(stack.IsAtSavedState());
  stack.Execute(Append(&log, "b"));
  EXPECT_FALSE(stack.IsAtSavedState());
  stack.Undo();
  EXPECT_TRUE(stack.IsAtSavedState());
  stack.Undo();
  EXPECT_FALSE(stack.IsAtSavedState());
  stack.Redo();
  EXPECT_TRUE(stack.IsAtSavedState());
  // A failed action changes nothing, so it leaves the saved state saved.
  stack.Execute(Failing());
  EXPECT_TRUE(stack.IsAtSavedState());
}

TEST_F(UndoStackTest, ANewStepAfterUndoingPastTheSavedStateLosesItForGood) {
  stack.Execute(Append(&log, "a"));
  stack.MarkSaved();
  stack.Undo();
  stack.Execute(Append(&log, "b"));
  EXPECT_EQ(log, "b");
  EXPECT_FALSE(stack.IsAtSavedState());
  // Undoing to the same depth reaches a state that was never saved.
  stack.Undo();
  EXPECT_FALSE(stack.IsAtSavedState());
  stack.Redo();
  stack.MarkSaved();
  EXPECT_TRUE(stack.IsAtSavedState());
}

TEST_F(UndoStackTest, TheSavedStateFollowsTheHistoryWhenOldStepsAreDropped) {
  stack.SetMaximumSteps(2);
  stack.Execute(Append(&log, "a"));
  stack.Execute(Append(&log, "b"));
  stack.MarkSaved();
  stack.Execute(Append(&log, "c"));  // drops "a"
  stack.Undo();
  EXPECT_EQ(log, "ab");
  EXPECT_TRUE(stack.IsAtSavedState());
  // Saved before "a": once "a" is dropped, undoing everything stops short of it.
  stack.Clear();
  log.clear();
  stack.MarkSaved();
  stack.Execute(Append(&log, "a"));
  stack.Execute(Append(&log, "b"));
  stack.Execute(Append(&log, "c"));
  stack.Undo();
  stack.Undo();
  EXPECT_EQ(log, "a");
  EXPECT_FALSE(stack.IsAtSavedState());
}

TEST_F(UndoStackTest, ClearingKeepsWhetherTheModelIsSaved) {
  stack.Execute(Append(&log, "a"));
  stack.MarkSaved();
  stack.Clear();
  EXPECT_TRUE(stack.IsAtSavedState());
  stack.Execute(Append(&log, "b"));
  stack.Clear();
  EXPECT_FALSE(stack.IsAtSavedState());
}
