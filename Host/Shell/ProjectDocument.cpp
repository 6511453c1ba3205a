#include "Host/Shell/ProjectDocument.h"

#include <filesystem>
#include <optional>
#include <utility>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Messaging/Localization.h"
#include "Host/Model/Project.h"
#include "Host/Model/ProjectFile.h"
#include "Host/Model/UndoStack.h"
#include "Host/Toolkit/InputBox.h"
#include "Host/Toolkit/MenuTracker.h"
#include "Host/Toolkit/StandardCommands.h"

namespace {

constexpr std::string_view kSaveAsTitle = "$$$/Vantile/Shell/SaveAsTitle=Save Project";
constexpr std::string_view kSaveAsPrompt = "$$$/Vantile/Shell/SaveAsPrompt=File name:";
constexpr std::string_view kCloseMenuName = "Shell_SaveChangesBeforeClosing";

PopupMenuEntry CloseAnswer(CommandID command, std::string_view text) {
  PopupMenuEntry entry;
  entry.command = command;
  entry.text = LocalizeString(text);
  entry.enabled = true;
  return entry;
}

}  // namespace

ProjectDocument::ProjectDocument(ProjectRef project, std::string path)
    : mProject(std::move(project)), mPath(std::move(path)) {
  CommandHandler::RegisterFallbackHandler(*this);
}

ProjectDocument::~ProjectDocument() = default;

bool ProjectDocument::IsModified() const {
  return mProject != nullptr && !mProject->GetUndoStack().IsAtSavedState();
}

std::string ProjectDocument::GetTitle() const {
  std::string title = mProject != nullptr ? mProject->GetName() : std::string();
  if (!mPath.empty()) {
    title += " (" + std::filesystem::path(mPath).filename().string() + ")";
  }
  return IsModified() ? title + " *" : title;
}

ProjectDocument::SaveOutcome ProjectDocument::Save() {
  if (mPath.empty()) {
    return SaveAs();
  }
  return SaveTo(mPath);
}

ProjectDocument::SaveOutcome ProjectDocument::SaveAs() {
  const std::optional<std::string> answer = InputBox::Ask(kSaveAsTitle, kSaveAsPrompt, mPath);
  if (!answer || answer->empty()) {
    return SaveOutcome::kCancelled;
  }
  const SaveOutcome outcome = SaveTo(*answer);
  if (outcome == SaveOutcome::kSaved) {
    mPath = *answer;
  }
  return outcome;
}

ProjectDocument::SaveOutcome ProjectDocument::SaveTo(const std::string& path) {
  if (!HOST_VERIFY(mProject != nullptr, "Invalid Project")) {
    return SaveOutcome::kFailed;
  }
  std::string error;
  if (!ProjectFile::Save(*mProject, path, &error)) {
    mLastError = error.empty() ? "cannot write " + path : error;
    if (mReportFailure) {
      mReportFailure("Cannot save the project: " + mLastError);
    }
    return SaveOutcome::kFailed;
  }
  mLastError.clear();
  mProject->GetUndoStack().MarkSaved();
  return SaveOutcome::kSaved;
}

bool ProjectDocument::ConfirmClose() {
  if (!IsModified()) {
    return true;
  }
  PopupMenuRequest request;
  request.menuName = std::string(kCloseMenuName);
  request.entries = {CloseAnswer(kCommandSave, "$$$/Vantile/Shell/CloseSave=Save"),
                     CloseAnswer(kCommandDontSave, "$$$/Vantile/Shell/CloseDontSave=Don't Save"),
                     CloseAnswer(kCommandCancelClose, "$$$/Vantile/Shell/CloseCancel=Cancel")};
  const std::shared_ptr<MenuTracker> tracker = GetMenuTracker();
  const std::optional<CommandID> answer =
      tracker != nullptr ? tracker->TrackPopupMenu(request) : std::nullopt;
  if (answer == kCommandDontSave) {
    return true;
  }
  return answer == kCommandSave && Save() == SaveOutcome::kSaved;
}

bool ProjectDocument::FindCommandStatus(CommandID command, CommandStatus& status) {
  if (command != kCommandSave && command != kCommandSaveAs) {
    return false;
  }
  status = CommandStatus{};
  status.enabled = mProject != nullptr;
  return true;
}

bool ProjectDocument::ObeyCommand(CommandID command) {
  if (command == kCommandSave) {
    Save();
    return true;
  }
  if (command == kCommandSaveAs) {
    SaveAs();
    return true;
  }
  return false;
}
