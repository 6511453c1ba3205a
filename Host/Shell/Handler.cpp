#include "Host/Shell/Handler.h"

#include <algorithm>
#include <utility>

#include "Host/Shell/Application.h"
#include "Host/Shell/WorkspaceFrame.h"

namespace {

struct HandlerFactoryEntry {
  std::string id;
  Handler::Factory factory;
};

std::vector<HandlerFactoryEntry>& HandlerFactories() {
  static std::vector<HandlerFactoryEntry> factories;
  return factories;
}

}  // namespace

Handler::Handler(std::string_view handlerID) : mHandlerID(handlerID) {}

Handler::~Handler() = default;

bool Handler::FindCommandStatus(CommandID command, CommandStatus& status) {
  if (command == kCommandSelectNextPanel || command == kCommandSelectPreviousPanel) {
    Application* application = Application::InstanceOrNull();
    status = CommandStatus{};
    status.enabled =
        application != nullptr && application->GetWorkspaceFrame().GetTabs().size() > 1;
    return true;
  }
  return CommandHandler::FindCommandStatus(command, status);
}

void Handler::UpdateCommandForDisableMenuAppStatus(CommandID /*command*/, CommandStatus& status) {
  status.enabled = false;
}

bool Handler::ObeyCommand(CommandID command) {
  switch (command) {
    case kCommandSelectFindBox:
      if (OnSelectFindBox())
        return true;
      break;
    case kCommandSelectNextPanel:
      if (OnSelectNextPanel())
        return true;
      break;
    case kCommandSelectPreviousPanel:
      if (OnSelectPreviousPanel())
        return true;
      break;
    default:
      break;
  }
  return CommandHandler::ObeyCommand(command);
}

bool Handler::OnSelectNextPanel() {
  Application* application = Application::InstanceOrNull();
  return application != nullptr && application->SelectAdjacentTab(+1);
}

bool Handler::OnSelectPreviousPanel() {
  Application* application = Application::InstanceOrNull();
  return application != nullptr && application->SelectAdjacentTab(-1);
}

bool Handler::RegisterFactory(std::string_view handlerID, Factory factory) {
  auto& factories = HandlerFactories();
  const bool taken = std::any_of(factories.begin(), factories.end(),
                                 [&](const HandlerFactoryEntry& e) { return e.id == handlerID; });
  if (!factory || handlerID.empty() || taken)
    return false;
  factories.push_back({std::string(handlerID), std::move(factory)});
  return true;
}

bool Handler::UnregisterFactory(std::string_view handlerID) {
  auto& factories = HandlerFactories();
  const auto found = std::find_if(factories.begin(), factories.end(),
                                  [&](const HandlerFactoryEntry& e) { return e.id == handlerID; });
  if (found == factories.end())
    return false;
  factories.erase(found);
  return true;
}

std::vector<std::string> Handler::GetRegisteredIDs() {
  std::vector<std::string> ids;
  for (const auto& entry : HandlerFactories())
    ids.push_back(entry.id);
  return ids;
}

Handler::Factory Handler::FindFactory(std::string_view handlerID) {
  for (const auto& entry : HandlerFactories()) {
    if (entry.id == handlerID)
      return entry.factory;
  }
  return {};
}
