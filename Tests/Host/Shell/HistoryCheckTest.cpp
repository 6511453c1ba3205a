#include <gtest/gtest.h>

#include <memory>
#include <string>

#include "Host/Messaging/MessagingTestScope.h"
#include "Host/Model/FunctionAction.h"
#include "Host/Model/Project.h"
#include "Host/Model/ProjectBuilder.h"
#include "Host/Model/Sequence.h"
#include "Host/Model/UndoStack.h"
#include "Host/Shell/HistoryCheck.h"

namespace {

class HistoryCheckTest : public ::testing::Test {
 protected:
  HistoryCheckTest() { sequence = builder.AddSequence("Edit"); }

  // A rename whose undo puts back `undoTo` (the old name when it is a sound edit).
  void Rename(const std::string& name, std::optional<std::string> undoTo = std::nullopt) {
    const std::string before = undoTo.value_or(project->GetName());
    ASSERT_TRUE(project->GetUndoStack().Execute(std::make_unique<FunctionAction>(
        "Test.Rename",
        [this, name] {
          project->SetName(name);
          return true;
        },
        [this, before] { project->SetName(before); })));
  }

  MessagingTestScope messaging;
  ProjectBuilder builder{"First"};
  ProjectRef project = builder.GetProject();
  SequenceRef sequence;
  HistoryCheck check;
};

TEST_F(HistoryCheckTest, SoundStepsPassAndTheHistoryStartsAfresh) {
  check.Start(project);
  Rename("Second");
  Rename("Third");
  EXPECT_EQ(check.Check(), "");
  EXPECT_EQ(project->GetName(), "Third");
  EXPECT_FALSE(project->GetUndoStack().CanUndo());
  // The next check starts from here, not from the start.
  Rename("Fourth");
  EXPECT_EQ(check.Check(), "");
  EXPECT_EQ(project->GetName(), "Fourth");
}

TEST_F(HistoryCheckTest, AnUndoThatDoesNotRestoreIsNamedWithTheLineThatDiffers) {
  check.Start(project);
  Rename("Second", "Second");  // its undo changes nothing
  Rename("Third");
  const std::string error = check.Check();
  EXPECT_NE(error.find("undoing all 2 steps does not return to the last check"), std::string::npos)
      << error;
  EXPECT_NE(error.find("was ' \"name\": \"First\",', is ' \"name\": \"Second\",'"),
            std::string::npos)
      << error;
}

TEST_F(HistoryCheckTest, ARedoThatDoesNotRepeatTheEditFails) {
  check.Start(project);
  int runs = 0;
  ASSERT_TRUE(project->GetUndoStack().Execute(std::make_unique<FunctionAction>(
      "Test.Drift",
      [this, &runs] {
        project->SetName("Run " + std::to_string(++runs));
        return true;
      },
      [this] { project->SetName("First"); })));
  const std::string error = check.Check();
  EXPECT_NE(error.find("redoing all 1 steps does not return to now"), std::string::npos) << error;
}

TEST_F(HistoryCheckTest, TheEditLineAndTheSelectionAreNotEditsThatUndoRestores) {
  check.Start(project);
  sequence->SetCurrentTime(5 * 254016000000LL);
  EXPECT_EQ(check.Check(), "");
}

TEST_F(HistoryCheckTest, StartForgetsTheStepsBeforeIt) {
  Rename("Before");
  check.Start(project);
  EXPECT_FALSE(project->GetUndoStack().CanUndo());
  EXPECT_TRUE(check.IsChecking(project));
  EXPECT_FALSE(check.IsChecking(Project::Create("Other")));
  EXPECT_EQ(check.Check(), "");
  EXPECT_EQ(project->GetName(), "Before");
}

}  // namespace
