#include "Host/Messaging/DebugFlags.h"

#include <string>

#include "Host/Messaging/Preferences.h"

namespace {

std::string KeyFor(std::string_view name) {
  return "Debug." + std::string(name);
}

}  // namespace

bool IsDebugFlagSet(std::string_view name) {
  return Preferences::Application().GetBool(KeyFor(name), false);
}

bool SetDebugFlag(std::string_view name, bool value) {
  return Preferences::Application().SetBool(KeyFor(name), value);
}
