#pragma once

#include <map>
#include <string>
#include <string_view>

#include "Host/Toolkit/Menu.h"

// The menu resources by name (e.g. "HandlerEffectControls_Edit_Menu"). UI thread only.
class MenuRegistry {
 public:
  // The process-wide registry.
  static MenuRegistry& Instance();

  // Adds or replaces the menu under its name; a nameless menu is refused (false).
  bool Register(const Menu& menu);
  // Parses `text` (see Menu::Parse) and registers every menu in it; on a parse error nothing is
  // registered and *error tells why.
  bool RegisterFromText(std::string_view text, std::string* error = nullptr);
  // Null when unknown. The pointer is valid until that name is registered again or removed.
  const Menu* Find(std::string_view name) const;
  bool Remove(std::string_view name);
  void Clear() { mMenus.clear(); }

 private:
  std::map<std::string, Menu, std::less<>> mMenus;
};
