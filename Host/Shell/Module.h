#pragma once

#include <functional>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

// A loaded plug-in module. The application makes one per registered module factory at start-up
// (Application::LoadModules), named after its id, and keeps it until it shuts down. Subclasses add
// what their plug-in needs; the base only remembers the module's name.
class Module {
 public:
  // Makes the module named `name`; null when it cannot be made. Static registration calls
  // RegisterFactory with one of these before main runs.
  using Factory = std::function<std::unique_ptr<Module>(const std::wstring& name)>;

  explicit Module(std::wstring name);
  Module(const Module&) = delete;
  Module& operator=(const Module&) = delete;
  virtual ~Module();

  const std::wstring& GetName() const { return mName; }

  // The process-wide factory registry. Safe during static initialisation (the registry is made
  // on first use). Registering an id twice is refused: false, and the first factory stays.
  // An empty factory is refused too.
  static bool RegisterFactory(std::string_view id, Factory factory);
  // False when `id` was not registered (tests and plug-ins that unload).
  static bool UnregisterFactory(std::string_view id);
  // In registration order.
  static std::vector<std::string> GetRegisteredIDs();
  // A copy of the factory, or an empty function.
  static Factory FindFactory(std::string_view id);

 private:
  std::wstring mName;
};
