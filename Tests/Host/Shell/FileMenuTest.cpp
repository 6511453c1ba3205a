// The program's File menu and its commands: open another project, save, quit.
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
#include "Host/Shell/Application.h"
#include "Host/Shell/ProjectDocument.h"
#include "Host/Shell/WorkspaceFrame.h"
#include "Host/Toolkit/InputBox.h"
#include "Host/Toolkit/ScriptedInputBox.h"
#include "Host/Toolkit/ScriptedMenuTracker.h"
#include "Host/Toolkit/StandardCommands.h"
#include "Host/Toolkit/ViewHost.h"

namespace {

class FileMenuTest : public ::testing::Test {
 protected:
  FileMenuTest() {
    std::filesystem::remove_all(folder);
    std::filesystem::create_directories(folder);
    previousMenus = SetMenuTrackerForTesting(menus);
    previousBoxes = InputBox::SetResponder(boxes);
    application.SetFailureReporter(
        [this](const std::string& message) { reported.push_back(message); });
    ProjectRef other = Project::Create("Other");
    ProjectFile::Save(*other, otherFile);
    application.OpenProject(Project::Create("First"), firstFile);
  }
  ~FileMenuTest() override {
    SetMenuTrackerForTesting(previousMenus);
    InputBox::SetResponder(previousBoxes);
    std::filesystem::remove_all(folder);
  }

  // One undoable change of the open project: its name.
  void Rename(const std::string& name) {
    // The action lives in the project's own history: it must not hold the project.
    Project* project = application.GetProject().get();
    const std::string before = project->GetName();
    project->GetUndoStack().Execute(std::make_unique<FunctionAction>(
        "Test.Rename",
        [project, name] {
          project->SetName(name);
          return true;
        },
        [project, before] { project->SetName(before); }));
  }

  void ClickFileButton() {
    const Rect button = application.GetWorkspaceFrame().GetFileMenuButtonRect();
    const Point inside{button.left + 2, button.top + 2};
    application.GetViewHost().MouseDown(MouseButton::kLeft, inside, KeyModifiers{});
    application.GetViewHost().MouseUp(MouseButton::kLeft, inside, KeyModifiers{});
  }

  MessagingTestScope messaging;
  // One folder a process: ctest runs the cases of this file side by side.
  const std::string folder =
      (std::filesystem::temp_directory_path() / ("FileMenuTest-" + std::to_string(::getpid())))
          .string();
  const std::string firstFile = folder + "/first.json";
  const std::string otherFile = folder + "/other.json";
  Application application;
  std::shared_ptr<ScriptedMenuTracker> menus = std::make_shared<ScriptedMenuTracker>();
  std::shared_ptr<ScriptedInputBox> boxes = std::make_shared<ScriptedInputBox>();
  std::shared_ptr<MenuTracker> previousMenus;
  std::shared_ptr<InputBoxResponder> previousBoxes;
  std::vector<std::string> reported;
};

}  // namespace

TEST_F(FileMenuTest, OpenReplacesTheProjectAndItsDocument) {
  boxes->PushAnswer(otherFile);
  EXPECT_TRUE(application.DoCommand(kCommandOpen));
  EXPECT_EQ(application.GetProject()->GetName(), "Other");
  EXPECT_EQ(application.GetDocument()->GetPath(), otherFile);
  EXPECT_FALSE(application.GetDocument()->IsModified());
  EXPECT_TRUE(reported.empty());
  // The new document saves where it came from and reports through the same reporter.
  Rename("Renamed");
  EXPECT_TRUE(application.DoCommand(kCommandSave));
  EXPECT_EQ(ProjectFile::Load(otherFile).project->GetName(), "Renamed");
}

TEST_F(FileMenuTest, OpeningAsksToSaveChangesAndCancelKeepsEverything) {
  Rename("Changed");
  boxes->PushAnswer(otherFile);
  menus->PushAnswer(kCommandCancelClose);
  EXPECT_FALSE(application.OpenProjectFromFile());
  EXPECT_EQ(application.GetProject()->GetName(), "Changed");
  EXPECT_TRUE(application.GetDocument()->IsModified());
  // Cancelling the file question asks nothing more.
  boxes->PushAnswer(std::nullopt);
  EXPECT_FALSE(application.OpenProjectFromFile());
  EXPECT_EQ(menus->GetRequests().size(), 1u);
}

TEST_F(FileMenuTest, AFileThatDoesNotLoadIsReportedAndTheProjectStays) {
  boxes->PushAnswer(folder + "/missing.json");
  EXPECT_FALSE(application.OpenProjectFromFile());
  EXPECT_EQ(application.GetProject()->GetName(), "First");
  ASSERT_EQ(reported.size(), 1u);
  EXPECT_NE(reported.front().find("Cannot open the project: " + folder + "/missing.json"),
            std::string::npos)
      << reported.front();
}

TEST_F(FileMenuTest, TheFileButtonShowsTheUndoStepAndTheKeysAndSavesFromTheMenu) {
  Rename("Changed");
  menus->PushAnswer(kCommandSave);
  ClickFileButton();
  ASSERT_EQ(menus->GetRequests().size(), 1u);
  const PopupMenuRequest& request = menus->GetRequests().front();
  EXPECT_EQ(request.menuName, "Workspace_File_Menu");
  bool sawUndo = false;
  bool sawSave = false;
  bool sawQuit = false;
  for (const PopupMenuEntry& entry : request.entries) {
    if (entry.command == kCommandUndo) {
      sawUndo = entry.enabled && entry.text == "Undo Test.Rename";
    } else if (entry.command == kCommandSave) {
      sawSave = entry.enabled && entry.shortcut == "Ctrl+S";
    } else if (entry.command == kCommandQuit) {
      sawQuit = !entry.enabled;  // no window to close
    }
  }
  EXPECT_TRUE(sawUndo);
  EXPECT_TRUE(sawSave);
  EXPECT_TRUE(sawQuit);
  EXPECT_FALSE(application.GetDocument()->IsModified());
  EXPECT_EQ(ProjectFile::Load(firstFile).project->GetName(), "Changed");
}

TEST_F(FileMenuTest, QuitAsksTheFrontEndToClose) {
  int closes = 0;
  application.SetQuitHandler([&] { ++closes; });
  EXPECT_TRUE(application.DoCommand(kCommandQuit));
  EXPECT_EQ(closes, 1);
}
