#include "Host/Shell/Module.h"

#include <algorithm>
#include <utility>

namespace {

struct ModuleFactoryEntry {
  std::string id;
  Module::Factory factory;
};

std::vector<ModuleFactoryEntry>& ModuleFactories() {
  static std::vector<ModuleFactoryEntry> factories;
  return factories;
}

}  // namespace

Module::Module(std::wstring name) : mName(std::move(name)) {}

Module::~Module() = default;

bool Module::RegisterFactory(std::string_view id, Factory factory) {
  auto& factories = ModuleFactories();
  if (!factory || id.empty() ||
      std::any_of(factories.begin(), factories.end(),
                  [id](const ModuleFactoryEntry& e) { return e.id == id; })) {
    return false;
  }
  factories.push_back({std::string(id), std::move(factory)});
  return true;
}

bool Module::UnregisterFactory(std::string_view id) {
  auto& factories = ModuleFactories();
  const auto found = std::find_if(factories.begin(), factories.end(),
                                  [id](const ModuleFactoryEntry& e) { return e.id == id; });
  if (found == factories.end())
    return false;
  factories.erase(found);
  return true;
}

std::vector<std::string> Module::GetRegisteredIDs() {
  std::vector<std::string> ids;
  for (const auto& entry : ModuleFactories())
    ids.push_back(entry.id);
  return ids;
}

Module::Factory Module::FindFactory(std::string_view id) {
  for (const auto& entry : ModuleFactories()) {
    if (entry.id == id)
      return entry.factory;
  }
  return {};
}
