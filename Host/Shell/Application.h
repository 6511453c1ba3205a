#pragma once

#include <functional>
#include <map>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "Host/Messaging/PropertyList.h"
#include "Host/Model/ModelRefs.h"
#include "Host/Model/ModelTypes.h"
#include "Host/Shell/HostTool.h"
#include "Host/Shell/ShellIdentifiers.h"
#include "Host/Time/TickTime.h"
#include "Host/Toolkit/CommandStatus.h"
#include "Host/Toolkit/Geometry.h"

class CommandHandler;
class Handler;
class Module;
class PlayerClock;
class SequencePlayer;
class ProjectDocument;
class TabView;
class UndoStack;
class ViewBase;
class ViewHost;
class WorkspaceFrame;

// A window type a handler registered: opening a window of that type asks the handler for a tab.
struct WindowClassEntry {
  std::string type;
  std::string handlerID;
  int flags = 0;
};

// A window the user can open (the host's window menu lists them).
struct WindowEntry {
  std::string type;
  std::string title;  // may be a "$$$/" key
  WindowID id = kDefaultWindowID;
  WindowContextID context = kDefaultWindowContextID;
};

// The host application: one per process. It loads the registered plug-in modules, creates their
// handlers, keeps the workspace (a view host whose root is the workspace frame holding the panel
// tabs), the open project and its active sequence, the current tool, and routes commands from
// the focused view's chain to the handlers.
//
// Ownership: the application owns modules, handlers, the view host and the frame; it holds the
// project by reference. Destruction closes the tabs (saving their state), deletes the handlers
// in reverse order of creation, then the modules, then closes the project; Instance() stays
// valid until all of that is done. UI thread only.
class Application {
 public:
  // Makes the process-wide instance; a second live instance is refused with a debug assertion
  // (the first one stays the instance).
  explicit Application(Size workspaceSize = {960, 540});
  ~Application();
  Application(const Application&) = delete;
  Application& operator=(const Application&) = delete;

  // The live instance; throws NullInterfaceException("Application") when there is none.
  static Application& Instance();
  static Application* InstanceOrNull();

  // --- Modules and handlers ---
  // Calls every registered module factory not called yet, with the module's name; a factory
  // that returns null is skipped. Returns how many modules were loaded by this call.
  std::size_t LoadModules();
  const std::vector<std::unique_ptr<Module>>& GetModules() const { return mModules; }
  // The handler of `handlerID`, made by its factory on first request and registered as a
  // fallback command handler. Null when no factory is registered or it made nothing.
  Handler* CreateHandler(std::string_view handlerID);
  // Creates a handler for every registered handler factory; returns how many exist afterwards.
  std::size_t CreateHandlers();
  Handler* FindHandler(std::string_view handlerID) const;
  std::vector<Handler*> GetHandlers() const;

  // --- Window classes and windows (registered by handlers) ---
  // False when the type is taken already, or the handler id is empty.
  bool AddWindowClass(std::string_view type, std::string_view handlerID, int flags);
  bool RemoveWindowClass(std::string_view type);
  const WindowClassEntry* FindWindowClass(std::string_view type) const;
  // False when a window of that type and id exists already.
  bool AddWindow(std::string_view type, std::string_view title, WindowID id,
                 WindowContextID context);
  const std::vector<WindowEntry>& GetWindows() const { return mWindows; }

  // --- Workspace and tabs ---
  ViewHost& GetViewHost() { return *mViewHost; }
  WorkspaceFrame& GetWorkspaceFrame() { return *mFrame; }
  // The view new panel views hang under (their parent and super commander): the frame.
  ViewBase* GetParentForNewViews();
  void SetWorkspaceMaximized(bool maximized);
  // A timeline and a program monitor beside the tabs (see WorkspaceFrame::SetEditingViews), or
  // the tabs alone.
  void SetEditingLayout(bool editing);
  // Asks the handler for its tab (with the tab's saved state), brings it to the front and
  // focuses it. A single-instance handler's open tab is closed first (its state saved).
  TabView* OpenTab(std::string_view handlerID);
  // The tab of the window's class; null for an unknown type.
  TabView* OpenWindow(std::string_view type);
  // Opens every registered window; returns how many tabs are open afterwards.
  std::size_t OpenAllWindows();
  TabView* FindTab(std::string_view handlerID) const;
  // Closes the handler's tab: refused (false) when the handler does not allow it now. Hides it
  // when the handler asks so, else saves its state (when asked) and destroys it.
  bool CloseTab(std::string_view handlerID);
  // Brings the tab after (before) the front one to the front; false with fewer than two tabs.
  bool SelectAdjacentTab(int direction);
  // The state a tab saved when it was last destroyed (empty when none).
  PropertyList GetSavedTabState(std::string_view handlerID) const;
  void SetSavedTabState(std::string_view handlerID, PropertyList state);

  // --- Project and sequence ---
  // Closes the open project (SequenceClosedMessage for each opened sequence), takes `project`,
  // and activates its active sequence, else its first one. `path` is the file it was read from
  // (empty: none yet); the document saves there.
  void OpenProject(ProjectRef project, std::string path = {});
  void CloseProject();
  const ProjectRef& GetProject() const { return mProject; }
  // The open project's file: saving and whether it changed. Null without a project.
  ProjectDocument* GetDocument() const { return mDocument.get(); }
  // Asks for a project file through the input box and opens it in place of the open one (which
  // may first ask to save its changes). False when cancelled or the file does not load (the
  // failure reporter is told why); the open project then stays.
  bool OpenProjectFromFile();
  // Told what a person must read when opening or saving failed (every document gets it).
  void SetFailureReporter(std::function<void(const std::string&)> reporter);
  // What "cmd.file.quit" (Ctrl+Q) does: the window front end closes its window, which asks to
  // save changes first. Without one the command is disabled.
  void SetQuitHandler(std::function<void()> quit) { mQuit = std::move(quit); }
  bool CanQuit() const { return static_cast<bool>(mQuit); }
  void Quit();

  // --- Playback of the active sequence ---
  // Plays from the edit line to the sequence's end in real time (the edit line follows), or
  // stops. False without an active sequence or with nothing left to play.
  bool TogglePlayback();
  bool IsPlaying() const;
  // Stops playback and moves the edit line by whole video frames (limited to the sequence).
  bool StepFrames(int frames);
  // Stops playback and moves the edit line to the sequence's start or end.
  bool GoToSequenceStart();
  bool GoToSequenceEnd();
  // The clock playback runs by (tests use a manual one); null: the steady clock.
  void SetPlayerClock(std::shared_ptr<PlayerClock> clock);
  // Makes `sequence` (of the open project) the active one: SequenceOpenedMessage the first time,
  // then the project's SequenceActivatedMessage, and on the sequence-activation station
  // SequenceActivatedMessage and SequenceFocusedMessage. False for a sequence of no open project.
  bool ActivateSequence(const SequenceRef& sequence);
  SequenceRef GetActiveSequence() const;
  // The open project's history; null without a project.
  UndoStack* GetUndoStack() const;

  // --- Selection, time and tools ---
  // Sets the active sequence's clip selection to the track items with these ids (project-file
  // ids). Nothing changes and `error` says why when there is no active sequence or an id names
  // no track item of it.
  bool SelectTrackItems(const std::vector<ObjectID>& ids, std::string* error = nullptr);
  void ClearSelection();
  // TrackItemSelectionOpenedMessage on the track-item-activation station.
  void OpenTrackItemSelection(std::vector<TrackItemRef> items);
  // Moves the active sequence's edit line. False without an active sequence.
  bool SetEditTime(TickTime time);
  // Broadcasts the tool's message on the tool station.
  void SelectTool(HostTool tool);
  HostTool GetTool() const { return mTool; }

  // --- Commands ---
  // From the focused view up its chain, then to the fallbacks: the application's own (undo and
  // redo through the open project's history), then the handlers. True when handled.
  bool DoCommand(CommandID command);
  // As the chain and the handlers report it; while menus are disabled the handlers adjust it.
  CommandStatus GetCommandStatus(CommandID command);
  void SetMenusDisabled(bool disabled) { mMenusDisabled = disabled; }
  bool AreMenusDisabled() const { return mMenusDisabled; }

 private:
  struct HandlerSlot {
    std::string id;
    std::unique_ptr<Handler> handler;
  };

  void CloseAllTabs();
  void SaveTabState(TabView& tab);

  std::vector<std::unique_ptr<Module>> mModules;
  std::vector<std::string> mLoadedModuleIDs;
  std::vector<HandlerSlot> mHandlers;  // creation order
  std::vector<WindowClassEntry> mWindowClasses;
  std::vector<WindowEntry> mWindows;
  std::map<std::string, PropertyList, std::less<>> mTabStates;

  std::unique_ptr<ViewHost> mViewHost;
  std::shared_ptr<WorkspaceFrame> mFrame;

  ProjectRef mProject;
  std::vector<SequenceRef> mOpenedSequences;
  HostTool mTool = HostTool::kPointer;
  bool mMenusDisabled = false;
  std::unique_ptr<CommandHandler> mEditCommands;  // undo and redo
  std::unique_ptr<ProjectDocument> mDocument;     // save and save as
  std::unique_ptr<CommandHandler> mFileCommands;  // open and quit
  std::function<void(const std::string&)> mReportFailure;
  std::function<void()> mQuit;
  std::unique_ptr<CommandHandler> mTransportCommands;
  std::shared_ptr<PlayerClock> mPlayerClock;
  std::shared_ptr<SequencePlayer> mPlayer;  // of the active sequence, made on first use
};
