#include "Host/Toolkit/MenuRegistry.h"

#include "Host/Messaging/Diagnostics.h"

MenuRegistry& MenuRegistry::Instance() {
  static MenuRegistry registry;
  return registry;
}

bool MenuRegistry::Register(const Menu& menu) {
  if (!HOST_VERIFY(!menu.GetName().empty(), "Invalid menu name")) {
    return false;
  }
  mMenus.insert_or_assign(menu.GetName(), menu);
  return true;
}

bool MenuRegistry::RegisterFromText(std::string_view text, std::string* error) {
  const std::optional<std::vector<Menu>> menus = Menu::Parse(text, error);
  if (!menus) {
    return false;
  }
  for (const Menu& menu : *menus) {
    Register(menu);
  }
  return true;
}

const Menu* MenuRegistry::Find(std::string_view name) const {
  const auto it = mMenus.find(name);
  return it != mMenus.end() ? &it->second : nullptr;
}

bool MenuRegistry::Remove(std::string_view name) {
  const auto it = mMenus.find(name);
  if (it == mMenus.end()) {
    return false;
  }
  mMenus.erase(it);
  return true;
}
