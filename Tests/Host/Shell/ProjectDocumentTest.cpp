#include <gtest/gtest.h>
#include <unistd.h>

#include <filesystem>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "Host/Messaging/MessagingTestScope.h"
#include "Host/Model/FunctionAction.h"
#include "Host/Model/Project.h"
#include "Host/Model/ProjectFile.h"
#include "Host/Model/UndoStack.h"
#include "Host/Shell/ProjectDocument.h"
#include "Host/Toolkit/InputBox.h"
#include "Host/Toolkit/ScriptedInputBox.h"
#include "Host/Toolkit/ScriptedMenuTracker.h"
#include "Host/Toolkit/StandardCommands.h"

namespace {

class ProjectDocumentTest : public ::testing::Test {
 protected:
  ProjectDocumentTest() {
    std::filesystem::remove_all(folder);
    std::filesystem::create_directories(folder);
    previousMenus = SetMenuTrackerForTesting(menus);
    previousBoxes = InputBox::SetResponder(boxes);
  }
  ~ProjectDocumentTest() override {
    SetMenuTrackerForTesting(previousMenus);
    InputBox::SetResponder(previousBoxes);
    std::filesystem::remove_all(folder);
  }

  // One undoable change of the project: its name.
  void Rename(const std::string& name) {
    const std::string before = project->GetName();
    project->GetUndoStack().Execute(std::make_unique<FunctionAction>(
        "Test.Rename",
        [this, name] {
          project->SetName(name);
          return true;
        },
        [this, before] { project->SetName(before); }));
  }

  std::string NameInFile(const std::string& path) const {
    const ProjectLoadResult loaded = ProjectFile::Load(path);
    return loaded ? loaded.project->GetName() : "(" + loaded.error + ")";
  }

  MessagingTestScope messaging;
  // One folder a process: ctest runs the cases of this file side by side.
  const std::string folder = (std::filesystem::temp_directory_path() /
                              ("ProjectDocumentTest-" + std::to_string(::getpid())))
                                 .string();
  const std::string file = folder + "/project.json";
  ProjectRef project = Project::Create("First");
  std::shared_ptr<ScriptedMenuTracker> menus = std::make_shared<ScriptedMenuTracker>();
  std::shared_ptr<ScriptedInputBox> boxes = std::make_shared<ScriptedInputBox>();
  std::shared_ptr<MenuTracker> previousMenus;
  std::shared_ptr<InputBoxResponder> previousBoxes;
};

}  // namespace

TEST_F(ProjectDocumentTest, SavingWritesTheFileAndUndoingBackToItIsUnmodified) {
  ProjectDocument document(project, file);
  EXPECT_FALSE(document.IsModified());
  Rename("Second");
  EXPECT_TRUE(document.IsModified());
  EXPECT_EQ(document.GetTitle(), "Second (project.json) *");
  EXPECT_EQ(document.Save(), ProjectDocument::SaveOutcome::kSaved);
  EXPECT_FALSE(document.IsModified());
  EXPECT_EQ(NameInFile(file), "Second");
  project->GetUndoStack().Undo();
  EXPECT_TRUE(document.IsModified());
  project->GetUndoStack().Redo();
  EXPECT_FALSE(document.IsModified());
}

TEST_F(ProjectDocumentTest, CtrlSIsTheSaveCommandOfEveryPanel) {
  ProjectDocument document(project, file);
  Rename("Second");
  CommandStatus status;
  ASSERT_TRUE(CommandHandler::FindFallbackCommandStatus(kCommandSave, status));
  EXPECT_TRUE(status.enabled);
  EXPECT_TRUE(CommandHandler::ObeyFallbackCommand(kCommandSave));
  EXPECT_EQ(NameInFile(file), "Second");
  EXPECT_FALSE(document.IsModified());
}

TEST_F(ProjectDocumentTest, AProjectWithoutAFileAsksForOneAndCancellingWritesNothing) {
  ProjectDocument document(project, "");
  Rename("Second");
  boxes->PushAnswer(std::nullopt);
  EXPECT_EQ(document.Save(), ProjectDocument::SaveOutcome::kCancelled);
  EXPECT_TRUE(document.IsModified());
  EXPECT_TRUE(document.GetPath().empty());
  boxes->PushAnswer(file);
  EXPECT_EQ(document.Save(), ProjectDocument::SaveOutcome::kSaved);
  EXPECT_EQ(document.GetPath(), file);
  EXPECT_EQ(NameInFile(file), "Second");
  // From then on Ctrl+S writes there without asking.
  Rename("Third");
  EXPECT_EQ(document.Save(), ProjectDocument::SaveOutcome::kSaved);
  EXPECT_EQ(boxes->PendingAnswers(), 0u);
  EXPECT_EQ(NameInFile(file), "Third");
}

TEST_F(ProjectDocumentTest, AFailedSaveKeepsTheChangesTheOldFileAndSaysWhy) {
  ProjectDocument document(project, file);
  ASSERT_EQ(document.Save(), ProjectDocument::SaveOutcome::kSaved);
  Rename("Second");
  std::vector<std::string> reported;
  document.SetFailureReporter([&](const std::string& reason) { reported.push_back(reason); });
  boxes->PushAnswer(folder + "/no-such-folder/other.json");
  EXPECT_EQ(document.SaveAs(), ProjectDocument::SaveOutcome::kFailed);
  EXPECT_TRUE(document.IsModified());
  EXPECT_EQ(document.GetPath(), file);  // still the file it came from
  ASSERT_EQ(reported.size(), 1u);
  EXPECT_FALSE(document.GetLastError().empty());
  EXPECT_EQ(reported.front(), "Cannot save the project: " + document.GetLastError());
  EXPECT_EQ(NameInFile(file), "First");
  // The next save that works clears the reason.
  EXPECT_EQ(document.Save(), ProjectDocument::SaveOutcome::kSaved);
  EXPECT_TRUE(document.GetLastError().empty());
}

TEST_F(ProjectDocumentTest, ClosingAsksOnlyWhenThereAreChangesAndEachAnswerDoesWhatItSays) {
  ProjectDocument document(project, file);
  EXPECT_TRUE(document.ConfirmClose());
  EXPECT_TRUE(menus->GetRequests().empty());

  Rename("Second");
  menus->PushAnswer(kCommandCancelClose);
  EXPECT_FALSE(document.ConfirmClose());
  menus->PushAnswer(std::nullopt);  // the popup dismissed
  EXPECT_FALSE(document.ConfirmClose());
  EXPECT_FALSE(std::filesystem::exists(file));

  menus->PushAnswer(kCommandDontSave);
  EXPECT_TRUE(document.ConfirmClose());
  EXPECT_FALSE(std::filesystem::exists(file));

  menus->PushAnswer(kCommandSave);
  EXPECT_TRUE(document.ConfirmClose());
  EXPECT_EQ(NameInFile(file), "Second");
  ASSERT_EQ(menus->GetRequests().size(), 4u);
  EXPECT_EQ(menus->GetRequests().back().entries.size(), 3u);
}

TEST_F(ProjectDocumentTest, ASaveThatFailsWhileClosingKeepsTheProjectOpen) {
  ProjectDocument document(project, folder + "/no-such-folder/project.json");
  Rename("Second");
  menus->PushAnswer(kCommandSave);
  EXPECT_FALSE(document.ConfirmClose());
  EXPECT_TRUE(document.IsModified());
  EXPECT_FALSE(document.GetLastError().empty());
}
