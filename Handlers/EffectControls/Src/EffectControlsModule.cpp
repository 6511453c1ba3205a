#include "Handlers/EffectControls/Public/EffectControlsModule.h"

#include <exception>
#include <new>
#include <string>
#include <string_view>
#include <utility>

#include "Handlers/EffectControls/Src/EffectControlsHandler.h"
#include "Host/Messaging/Diagnostics.h"
#include "Host/Shell/Handler.h"
#include "Host/Shell/ShellIdentifiers.h"
#include "Host/Toolkit/ShortcutManager.h"

namespace {

std::unique_ptr<Handler> CreateHandler(std::string_view handlerID) {
  try {
    return std::make_unique<EffectControlsHandler>(handlerID);
  } catch (const std::exception& failure) {
    ReportDebugAssertion(failure.what(), "EffectControlsHandler constructed", __FILE__, __LINE__,
                         __PRETTY_FUNCTION__);
    return nullptr;
  }
}

// Runs when the plug-in is loaded, before the host asks for anything.
[[maybe_unused]] const bool kRegistered = [] {
  Handler::RegisterFactory(kEffectControlsHandlerID, CreateHandler);
  Module::RegisterFactory(kEffectControlsModuleID, CreateModule);
  return true;
}();

}  // namespace

EffectControlsModule::EffectControlsModule(std::wstring name) : Module(std::move(name)) {}

EffectControlsModule::~EffectControlsModule() = default;

std::unique_ptr<Module> CreateModule(const std::wstring& name) {
  std::unique_ptr<Module> module;
  try {
    module = std::make_unique<EffectControlsModule>(name);
  } catch (const std::bad_alloc&) {
    return nullptr;
  }
  ShortcutManager::Instance().RegisterCommandContext(&EffectControlsHandler::SetUpCommandContext);
  return module;
}

void Weaklink() {}

void SelfRegistrationSymbol() {}
