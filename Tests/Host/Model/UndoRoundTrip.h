#pragma once

#include <gtest/gtest.h>

#include <functional>
#include <string>
#include <utility>
#include <vector>

#include "Host/Model/ModelTypes.h"
#include "Host/Model/Project.h"
#include "Host/Model/UndoStack.h"
#include "Tests/Host/Model/MessageRecorder.h"

// Checks one undoable edit: do, check the state and the messages, undo, check the exact
// original state, redo, check the exact edited state. Failures are reported through GoogleTest
// with the step's name; the project is left as it was before the edit.
class UndoRoundTrip {
 public:
  struct Step {
    std::string name = {};                   // the undo step the edit must make
    std::function<EditStatus()> edit = {};   // must return Done
    std::function<void()> checkEdited = {};  // optional: expectations on the edited model
    // Optional: the messages the edit sends, in order. Without it the edit must send at least one.
    std::vector<std::string> messages = {};
  };

  // `describe` prints the state compared (DescribeForTest of the project, or of what the edit
  // touches); `recorder` listens where the edit is expected to announce itself. The project and
  // the recorder must outlive the checker.
  UndoRoundTrip(Project& project, std::function<std::string()> describe, MessageRecorder& recorder)
      : mProject(project), mDescribe(std::move(describe)), mRecorder(recorder) {}

  // The edit's messages must come again, in any order, on undo and on redo.
  void Check(const Step& step) {
    SCOPED_TRACE(step.name);
    UndoStack& undo = mProject.GetUndoStack();
    const std::string before = mDescribe();
    const std::size_t steps = undo.GetUndoNames().size();
    mRecorder.Clear();
    ASSERT_EQ(step.edit(), EditStatus::Done);
    EXPECT_EQ(undo.GetUndoNames().size(), steps + 1);
    EXPECT_EQ(undo.GetUndoName(), step.name);
    const std::string after = mDescribe();
    EXPECT_NE(after, before);
    if (step.checkEdited) {
      step.checkEdited();
    }
    if (step.messages.empty()) {
      EXPECT_FALSE(mRecorder.names.empty());
    } else {
      EXPECT_EQ(mRecorder.names, step.messages);
    }
    const std::vector<std::string> sent = mRecorder.Sorted();

    mRecorder.Clear();
    ASSERT_TRUE(undo.Undo());
    EXPECT_EQ(mDescribe(), before);
    EXPECT_EQ(mRecorder.Sorted(), sent) << "messages of the undo";

    mRecorder.Clear();
    ASSERT_TRUE(undo.Redo());
    EXPECT_EQ(mDescribe(), after);
    EXPECT_EQ(mRecorder.Sorted(), sent) << "messages of the redo";
    EXPECT_EQ(undo.GetUndoName(), step.name);

    ASSERT_TRUE(undo.Undo());
    mRecorder.Clear();
  }

 private:
  Project& mProject;
  std::function<std::string()> mDescribe;
  MessageRecorder& mRecorder;
};
