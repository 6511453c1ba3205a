#pragma once

#include <functional>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include "Host/Shell/TabViewCreator.h"
#include "Host/Toolkit/CommandHandler.h"

// Host commands every handler answers through its base.
inline constexpr CommandID kCommandSelectFindBox = 11311;
inline constexpr CommandID kCommandSelectNextPanel = 11916;
inline constexpr CommandID kCommandSelectPreviousPanel = 11917;

// A panel plug-in's handler: registers the panel with the host (commands, window class,
// window, menus, stations), makes its tab view on request, and answers the commands that reach
// it after the focused view's chain declined them (the application registers every handler it
// creates as a fallback command handler). Made by the factory registered under its id and
// owned by the application. UI thread only.
class Handler : public CommandHandler, public TabViewCreator {
 public:
  // Makes the handler for `handlerID`; null when it cannot be made. Static registration calls
  // RegisterFactory with one of these before main runs.
  using Factory = std::function<std::unique_ptr<Handler>(std::string_view handlerID)>;

  explicit Handler(std::string_view handlerID);
  ~Handler() override;

  const std::string& GetHandlerID() const { return mHandlerID; }

  // --- CommandHandler part ---
  // Answers the panel navigation commands; others are unknown here.
  bool FindCommandStatus(CommandID command, CommandStatus& status) override;
  // While the application has its menus disabled (a modal state), the handler may adjust the
  // status it reported. The base disables the command.
  virtual void UpdateCommandForDisableMenuAppStatus(CommandID command, CommandStatus& status);
  // 11311 goes to OnSelectFindBox, 11916 to OnSelectNextPanel, 11917 to OnSelectPreviousPanel;
  // true when that call handled it. Everything else is passed on (false).
  bool ObeyCommand(CommandID command) override;
  // The shortcut context the panel applies when it comes on duty; empty: the global one.
  virtual std::string GetContextName() const { return {}; }
  // Whether the panel may close now.
  virtual bool AllowClose() { return true; }
  // The base has no find box: not handled.
  virtual bool OnSelectFindBox() { return false; }
  // Bring the next (previous) tab of the workspace to the front and focus it; false when
  // there is no other tab.
  virtual bool OnSelectNextPanel();
  virtual bool OnSelectPreviousPanel();

  // The process-wide factory registry. Safe during static initialisation. Registering an id
  // twice, an empty id or an empty factory is refused (false; the first factory stays).
  static bool RegisterFactory(std::string_view handlerID, Factory factory);
  static bool UnregisterFactory(std::string_view handlerID);
  // In registration order.
  static std::vector<std::string> GetRegisteredIDs();
  // A copy of the factory, or an empty function.
  static Factory FindFactory(std::string_view handlerID);

 private:
  std::string mHandlerID;
};
