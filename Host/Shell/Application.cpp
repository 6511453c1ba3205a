#include "Host/Shell/Application.h"

#include <algorithm>
#include <utility>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Messaging/Station.h"
#include "Host/Model/ModelMessages.h"
#include "Host/Model/Project.h"
#include "Host/Model/ProjectFile.h"
#include "Host/Model/Sequence.h"
#include "Host/Model/SequencePlayer.h"
#include "Host/Model/TrackItem.h"
#include "Host/Model/UndoStack.h"
#include "Host/Shell/Handler.h"
#include "Host/Shell/Module.h"
#include "Host/Shell/ProgramMonitorView.h"
#include "Host/Shell/ProjectDocument.h"
#include "Host/Shell/ShellMessages.h"
#include "Host/Shell/TimelineView.h"
#include "Host/Shell/WorkspaceFrame.h"
#include "Host/Toolkit/InputBox.h"
#include "Host/Toolkit/StandardCommands.h"
#include "Host/Toolkit/TabView.h"
#include "Host/Toolkit/ViewHost.h"

namespace {

Application* gInstance = nullptr;

std::wstring WidenASCII(std::string_view text) {
  std::wstring wide;
  wide.reserve(text.size());
  for (const char c : text)
    wide.push_back(static_cast<wchar_t>(static_cast<unsigned char>(c)));
  return wide;
}

template <class M>
void BroadcastToolMessage() {
  BroadcastMessage(kToolStation, M());
}

// Undo and redo of the open project, for the keys and menus of every panel.
class EditCommands : public CommandHandler {
 public:
  explicit EditCommands(Application& application) : mApplication(application) {}

  bool FindCommandStatus(CommandID command, CommandStatus& status) override {
    if (command != kCommandUndo && command != kCommandRedo)
      return false;
    const UndoStack* stack = mApplication.GetUndoStack();
    const bool undo = command == kCommandUndo;
    status = CommandStatus{};
    status.enabled = stack != nullptr && !stack->IsPerformingUndoOrRedo() &&
                     (undo ? stack->CanUndo() : stack->CanRedo());
    if (status.enabled)
      status.text =
          (undo ? "Undo " : "Redo ") + (undo ? stack->GetUndoName() : stack->GetRedoName());
    return true;
  }

  bool ObeyCommand(CommandID command) override {
    if (command != kCommandUndo && command != kCommandRedo)
      return false;
    UndoStack* stack = mApplication.GetUndoStack();
    if (stack != nullptr)
      command == kCommandUndo ? stack->Undo() : stack->Redo();
    return true;
  }

 private:
  Application& mApplication;  // owns this handler
};

// Opening another project and quitting, for the keys and menus of every panel.
class FileCommands : public CommandHandler {
 public:
  explicit FileCommands(Application& application) : mApplication(application) {}

  bool FindCommandStatus(CommandID command, CommandStatus& status) override {
    if (command != kCommandOpen && command != kCommandQuit)
      return false;
    status = CommandStatus{};
    status.enabled = command == kCommandOpen || mApplication.CanQuit();
    return true;
  }

  bool ObeyCommand(CommandID command) override {
    if (command == kCommandOpen) {
      mApplication.OpenProjectFromFile();
      return true;
    }
    if (command == kCommandQuit) {
      mApplication.Quit();
      return true;
    }
    return false;
  }

 private:
  Application& mApplication;  // owns this handler
};

// Playing and stepping the active sequence, for the keys of every panel.
class TransportCommands : public CommandHandler {
 public:
  explicit TransportCommands(Application& application) : mApplication(application) {}

  bool FindCommandStatus(CommandID command, CommandStatus& status) override {
    if (!IsTransport(command))
      return false;
    status = CommandStatus{};
    status.enabled = mApplication.GetActiveSequence() != nullptr;
    status.checked = command == kCommandPlayStop && mApplication.IsPlaying();
    return true;
  }

  bool ObeyCommand(CommandID command) override {
    switch (command) {
      case kCommandPlayStop:
        mApplication.TogglePlayback();
        return true;
      case kCommandGoToStart:
        mApplication.GoToSequenceStart();
        return true;
      case kCommandGoToEnd:
        mApplication.GoToSequenceEnd();
        return true;
      case kCommandStepBack:
        mApplication.StepFrames(-1);
        return true;
      case kCommandStepForward:
        mApplication.StepFrames(1);
        return true;
      default:
        return false;
    }
  }

 private:
  static bool IsTransport(CommandID command) {
    return command == kCommandPlayStop || command == kCommandGoToStart ||
           command == kCommandGoToEnd || command == kCommandStepBack ||
           command == kCommandStepForward;
  }

  Application& mApplication;  // owns this handler
};

}  // namespace

Application::Application(Size workspaceSize)
    : mViewHost(std::make_unique<ViewHost>(workspaceSize)),
      mFrame(std::make_shared<WorkspaceFrame>()),
      mEditCommands(std::make_unique<EditCommands>(*this)),
      mFileCommands(std::make_unique<FileCommands>(*this)),
      mTransportCommands(std::make_unique<TransportCommands>(*this)) {
  mViewHost->SetRootView(mFrame);
  if (HOST_VERIFY(gInstance == nullptr, "There is one Application per process")) {
    gInstance = this;
    CommandHandler::RegisterFallbackHandler(*mEditCommands);
    CommandHandler::RegisterFallbackHandler(*mFileCommands);
    CommandHandler::RegisterFallbackHandler(*mTransportCommands);
  }
}

Application::~Application() {
  CloseAllTabs();
  // Handlers may still reach the application (window classes, tabs) while they go.
  while (!mHandlers.empty()) {
    std::unique_ptr<Handler> handler = std::move(mHandlers.back().handler);
    mHandlers.pop_back();
    handler.reset();
  }
  while (!mModules.empty())
    mModules.pop_back();
  CloseProject();
  mViewHost->SetRootView(nullptr);
  mFrame->Destroy();
  if (gInstance == this)
    gInstance = nullptr;
}

Application& Application::Instance() {
  return RequireInterface(gInstance, "Application");
}

Application* Application::InstanceOrNull() {
  return gInstance;
}

// --- Modules and handlers ---

std::size_t Application::LoadModules() {
  std::size_t loaded = 0;
  for (const std::string& id : Module::GetRegisteredIDs()) {
    if (std::find(mLoadedModuleIDs.begin(), mLoadedModuleIDs.end(), id) != mLoadedModuleIDs.end())
      continue;
    mLoadedModuleIDs.push_back(id);
    const Module::Factory factory = Module::FindFactory(id);
    if (!factory)
      continue;
    std::unique_ptr<Module> module = factory(WidenASCII(id));
    if (module == nullptr)
      continue;
    mModules.push_back(std::move(module));
    ++loaded;
  }
  return loaded;
}

Handler* Application::CreateHandler(std::string_view handlerID) {
  if (Handler* existing = FindHandler(handlerID))
    return existing;
  const Handler::Factory factory = Handler::FindFactory(handlerID);
  if (!factory)
    return nullptr;
  std::unique_ptr<Handler> handler = factory(handlerID);
  if (handler == nullptr)
    return nullptr;
  Handler* raw = handler.get();
  CommandHandler::RegisterFallbackHandler(*raw);
  mHandlers.push_back({std::string(handlerID), std::move(handler)});
  return raw;
}

std::size_t Application::CreateHandlers() {
  for (const std::string& id : Handler::GetRegisteredIDs())
    CreateHandler(id);
  return mHandlers.size();
}

Handler* Application::FindHandler(std::string_view handlerID) const {
  for (const auto& slot : mHandlers) {
    if (slot.id == handlerID)
      return slot.handler.get();
  }
  return nullptr;
}

std::vector<Handler*> Application::GetHandlers() const {
  std::vector<Handler*> handlers;
  for (const auto& slot : mHandlers)
    handlers.push_back(slot.handler.get());
  return handlers;
}

// --- Window classes and windows ---

bool Application::AddWindowClass(std::string_view type, std::string_view handlerID, int flags) {
  if (type.empty() || handlerID.empty() || FindWindowClass(type) != nullptr)
    return false;
  mWindowClasses.push_back({std::string(type), std::string(handlerID), flags});
  return true;
}

bool Application::RemoveWindowClass(std::string_view type) {
  const auto found = std::find_if(mWindowClasses.begin(), mWindowClasses.end(),
                                  [&](const WindowClassEntry& e) { return e.type == type; });
  if (found == mWindowClasses.end())
    return false;
  mWindowClasses.erase(found);
  std::erase_if(mWindows, [&](const WindowEntry& w) { return w.type == type; });
  return true;
}

const WindowClassEntry* Application::FindWindowClass(std::string_view type) const {
  for (const auto& entry : mWindowClasses) {
    if (entry.type == type)
      return &entry;
  }
  return nullptr;
}

bool Application::AddWindow(std::string_view type, std::string_view title, WindowID id,
                            WindowContextID context) {
  const bool exists = std::any_of(mWindows.begin(), mWindows.end(), [&](const WindowEntry& w) {
    return w.type == type && w.id == id;
  });
  if (type.empty() || exists)
    return false;
  mWindows.push_back({std::string(type), std::string(title), id, context});
  return true;
}

// --- Workspace and tabs ---

ViewBase* Application::GetParentForNewViews() {
  return mFrame.get();
}

void Application::SetWorkspaceMaximized(bool maximized) {
  mFrame->SetMaximized(maximized);
}

void Application::SetEditingLayout(bool editing) {
  if (editing == mFrame->HasEditingViews())
    return;
  if (!editing) {
    mFrame->SetEditingViews(nullptr, nullptr);
    return;
  }
  mFrame->SetEditingViews(std::make_shared<ProgramMonitorView>(*this),
                          std::make_shared<TimelineView>(*this));
}

TabView* Application::OpenTab(std::string_view handlerID) {
  Handler* handler = FindHandler(handlerID);
  if (handler == nullptr)
    return nullptr;
  if (handler->IsSingleInstance()) {
    if (TabView* open = mFrame->FindTab(handlerID)) {
      SaveTabState(*open);
      open->Destroy();
      mFrame->TabsChanged();
    }
  }
  TabView* view = handler->CreateTabViewSelf(mFrame.get(), GetSavedTabState(handlerID));
  mFrame->TabsChanged();
  if (view != nullptr && view->GetParent() == mFrame.get())
    view->BringToFront(true, true);
  return view;
}

TabView* Application::OpenWindow(std::string_view type) {
  const WindowClassEntry* entry = FindWindowClass(type);
  return entry != nullptr ? OpenTab(entry->handlerID) : nullptr;
}

std::size_t Application::OpenAllWindows() {
  // Opening may register more windows: walk a copy.
  const std::vector<WindowEntry> windows = mWindows;
  for (const auto& window : windows) {
    const WindowClassEntry* entry = FindWindowClass(window.type);
    if (entry != nullptr && mFrame->FindTab(entry->handlerID) == nullptr)
      OpenTab(entry->handlerID);
  }
  return mFrame->GetTabs().size();
}

TabView* Application::FindTab(std::string_view handlerID) const {
  return mFrame->FindTab(handlerID);
}

bool Application::CloseTab(std::string_view handlerID) {
  TabView* tab = mFrame->FindTab(handlerID);
  if (tab == nullptr)
    return false;
  Handler* handler = FindHandler(handlerID);
  if (handler != nullptr && !handler->AllowClose())
    return false;
  if (handler != nullptr && handler->ShouldHideWhenClosed()) {
    tab->Hide();
  } else {
    SaveTabState(*tab);
    tab->Destroy();
  }
  mFrame->TabsChanged();
  return true;
}

bool Application::SelectAdjacentTab(int direction) {
  const auto tabs = mFrame->GetTabs();
  if (tabs.size() < 2)
    return false;
  const auto front = std::find(tabs.begin(), tabs.end(), mFrame->GetFrontTab());
  const auto count = static_cast<std::ptrdiff_t>(tabs.size());
  const std::ptrdiff_t index = front == tabs.end() ? 0 : front - tabs.begin();
  const std::ptrdiff_t next = ((index + (direction < 0 ? -1 : 1)) % count + count) % count;
  tabs[static_cast<std::size_t>(next)]->BringToFront(true, true);
  return true;
}

PropertyList Application::GetSavedTabState(std::string_view handlerID) const {
  const auto found = mTabStates.find(handlerID);
  return found != mTabStates.end() ? found->second : PropertyList();
}

void Application::SetSavedTabState(std::string_view handlerID, PropertyList state) {
  mTabStates.insert_or_assign(std::string(handlerID), std::move(state));
}

void Application::SaveTabState(TabView& tab) {
  Handler* handler = FindHandler(tab.GetHandlerID());
  if (handler != nullptr && !handler->ShouldSaveStateWhenDestroyed())
    return;
  PropertyList state;
  tab.SaveState(state);
  SetSavedTabState(tab.GetHandlerID(), std::move(state));
}

void Application::CloseAllTabs() {
  for (TabView* tab : mFrame->GetTabs()) {
    SaveTabState(*tab);
    tab->Destroy();
  }
  mFrame->TabsChanged();
}

// --- Project and sequence ---

void Application::OpenProject(ProjectRef project, std::string path) {
  CloseProject();
  mProject = std::move(project);
  if (mProject == nullptr)
    return;
  mDocument = std::make_unique<ProjectDocument>(mProject, std::move(path));
  mDocument->SetFailureReporter(mReportFailure);
  SequenceRef sequence = mProject->GetActiveSequence();
  if (sequence == nullptr && !mProject->GetSequences().empty())
    sequence = mProject->GetSequences().front();
  if (sequence != nullptr)
    ActivateSequence(sequence);
}

bool Application::OpenProjectFromFile() {
  const std::string offered = mDocument != nullptr ? mDocument->GetPath() : std::string();
  const std::optional<std::string> path =
      InputBox::Ask("$$$/Vantile/Shell/OpenTitle=Open Project",
                    "$$$/Vantile/Shell/OpenPrompt=File name:", offered);
  if (!path || path->empty())
    return false;
  if (mDocument != nullptr && !mDocument->ConfirmClose())
    return false;
  ProjectLoadResult loaded = ProjectFile::Load(*path);
  if (!loaded) {
    if (mReportFailure)
      mReportFailure("Cannot open the project: " + (loaded.error.starts_with(*path)
                                                        ? loaded.error
                                                        : *path + ": " + loaded.error));
    return false;
  }
  OpenProject(std::move(loaded.project), *path);
  return true;
}

void Application::SetFailureReporter(std::function<void(const std::string&)> reporter) {
  mReportFailure = std::move(reporter);
  if (mDocument != nullptr)
    mDocument->SetFailureReporter(mReportFailure);
}

void Application::Quit() {
  if (mQuit)
    mQuit();
}

bool Application::TogglePlayback() {
  const SequenceRef sequence = GetActiveSequence();
  if (sequence == nullptr)
    return false;
  if (mPlayer == nullptr || mPlayer->GetSequence() != sequence)
    mPlayer = SequencePlayer::Create(sequence, mPlayerClock);
  if (mPlayer->IsPlaying()) {
    mPlayer->Stop();
    return true;
  }
  // At the end, playing starts again from the start, as editors do.
  const TickTime end = sequence->GetEnd();
  if (sequence->GetCurrentTime() >= end)
    sequence->SetCurrentTime(0);
  return mPlayer->Play(0, end);
}

bool Application::IsPlaying() const {
  return mPlayer != nullptr && mPlayer->IsPlaying() &&
         mPlayer->GetSequence() == GetActiveSequence();
}

bool Application::StepFrames(int frames) {
  const SequenceRef sequence = GetActiveSequence();
  if (sequence == nullptr)
    return false;
  if (mPlayer != nullptr)
    mPlayer->Stop();
  const TickTime frame = sequence->GetVideoFrameRate().GetTicksPerFrame();
  const TickTime wanted = AddTimes(sequence->GetCurrentTime(), frame * frames);
  sequence->SetCurrentTime(std::clamp<TickTime>(wanted, 0, sequence->GetEnd()));
  return true;
}

bool Application::GoToSequenceStart() {
  const SequenceRef sequence = GetActiveSequence();
  if (sequence == nullptr)
    return false;
  if (mPlayer != nullptr)
    mPlayer->Stop();
  sequence->SetCurrentTime(0);
  return true;
}

bool Application::GoToSequenceEnd() {
  const SequenceRef sequence = GetActiveSequence();
  if (sequence == nullptr)
    return false;
  if (mPlayer != nullptr)
    mPlayer->Stop();
  sequence->SetCurrentTime(sequence->GetEnd());
  return true;
}

void Application::SetPlayerClock(std::shared_ptr<PlayerClock> clock) {
  mPlayerClock = std::move(clock);
  mPlayer.reset();
}

void Application::CloseProject() {
  if (mProject == nullptr)
    return;
  // Listeners drop their references as the sequences close; the project goes last.
  const std::vector<SequenceRef> opened = std::move(mOpenedSequences);
  mOpenedSequences.clear();
  for (const SequenceRef& sequence : opened)
    BroadcastMessage(kSequenceActivationStation, SequenceClosedMessage(sequence));
  mPlayer.reset();
  mDocument.reset();
  mProject.reset();
}

bool Application::ActivateSequence(const SequenceRef& sequence) {
  if (!HOST_VERIFY(sequence != nullptr, "Invalid Sequence") || mProject == nullptr ||
      sequence->GetProject() != mProject.get()) {
    return false;
  }
  if (std::find(mOpenedSequences.begin(), mOpenedSequences.end(), sequence) ==
      mOpenedSequences.end()) {
    mOpenedSequences.push_back(sequence);
    BroadcastMessage(kSequenceActivationStation, SequenceOpenedMessage(sequence));
  }
  mProject->SetActiveSequence(sequence);
  BroadcastMessage(kSequenceActivationStation, SequenceActivatedMessage(sequence));
  BroadcastMessage(kSequenceActivationStation, SequenceFocusedMessage(sequence));
  return true;
}

SequenceRef Application::GetActiveSequence() const {
  return mProject != nullptr ? mProject->GetActiveSequence() : SequenceRef();
}

UndoStack* Application::GetUndoStack() const {
  return mProject != nullptr ? &mProject->GetUndoStack() : nullptr;
}

// --- Selection, time and tools ---

bool Application::SelectTrackItems(const std::vector<ObjectID>& ids, std::string* error) {
  const SequenceRef sequence = GetActiveSequence();
  if (sequence == nullptr) {
    if (error != nullptr)
      *error = "there is no active sequence to select in";
    return false;
  }
  std::vector<TrackItemRef> items;
  for (const ObjectID id : ids) {
    TrackItemRef item = sequence->FindTrackItem(id);
    if (item == nullptr) {
      if (error != nullptr) {
        *error = "sequence '" + sequence->GetName() + "' has no track item with id " +
                 std::to_string(id);
      }
      return false;
    }
    items.push_back(std::move(item));
  }
  sequence->SetSelection(items);
  return true;
}

void Application::ClearSelection() {
  if (const SequenceRef sequence = GetActiveSequence())
    sequence->ClearSelection();
}

void Application::OpenTrackItemSelection(std::vector<TrackItemRef> items) {
  BroadcastMessage(kTrackItemActivationStation, TrackItemSelectionOpenedMessage(std::move(items)));
}

bool Application::SetEditTime(TickTime time) {
  const SequenceRef sequence = GetActiveSequence();
  if (sequence == nullptr)
    return false;
  sequence->SetCurrentTime(time);
  return true;
}

void Application::SelectTool(HostTool tool) {
  mTool = tool;
  switch (tool) {
    case HostTool::kPointer:
      return BroadcastToolMessage<PointerToolSelectedMessage>();
    case HostTool::kTrackSelectForward:
      return BroadcastToolMessage<TrackSelectForwardToolSelectedMessage>();
    case HostTool::kRipple:
      return BroadcastToolMessage<RippleToolSelectedMessage>();
    case HostTool::kRoll:
      return BroadcastToolMessage<RollToolSelectedMessage>();
    case HostTool::kRateStretch:
      return BroadcastToolMessage<RateStretchToolSelectedMessage>();
    case HostTool::kRazor:
      return BroadcastToolMessage<RazorToolSelectedMessage>();
    case HostTool::kSlip:
      return BroadcastToolMessage<SlipToolSelectedMessage>();
    case HostTool::kSlide:
      return BroadcastToolMessage<SlideToolSelectedMessage>();
    case HostTool::kPen:
      return BroadcastToolMessage<PenToolSelectedMessage>();
    case HostTool::kHand:
      return BroadcastToolMessage<HandToolSelectedMessage>();
    case HostTool::kZoom:
      return BroadcastToolMessage<ZoomToolSelectedMessage>();
  }
}

// --- Commands ---

bool Application::DoCommand(CommandID command) {
  return mViewHost->DoCommand(command);
}

CommandStatus Application::GetCommandStatus(CommandID command) {
  CommandStatus status = mViewHost->GetCommandStatus(command);
  if (mMenusDisabled) {
    for (const auto& slot : mHandlers)
      slot.handler->UpdateCommandForDisableMenuAppStatus(command, status);
  }
  return status;
}
