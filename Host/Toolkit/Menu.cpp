#include "Host/Toolkit/Menu.h"

#include <cctype>
#include <charconv>
#include <set>

#include "Host/Toolkit/ShortcutManager.h"

Menu& Menu::AddCommand(CommandID command, std::string text) {
  MenuItem item;
  item.command = command;
  item.text = std::move(text);
  mItems.push_back(std::move(item));
  return *this;
}

Menu& Menu::AddCommand(std::string commandName, std::string text) {
  MenuItem item;
  item.commandName = std::move(commandName);
  item.text = std::move(text);
  mItems.push_back(std::move(item));
  return *this;
}

Menu& Menu::AddSeparator() {
  MenuItem item;
  item.kind = MenuItem::Kind::kSeparator;
  mItems.push_back(std::move(item));
  return *this;
}

Menu& Menu::AddSubmenu(std::string text, const Menu& submenu) {
  MenuItem item;
  item.kind = MenuItem::Kind::kSubmenu;
  item.text = std::move(text);
  item.submenu = submenu.mItems;
  mItems.push_back(std::move(item));
  return *this;
}

std::optional<CommandID> Menu::ResolveCommand(const MenuItem& item,
                                              const ShortcutManager& shortcuts) {
  if (item.kind != MenuItem::Kind::kCommand) {
    return std::nullopt;
  }
  if (item.command != kNoCommand) {
    return item.command;
  }
  return shortcuts.FindCommandID(item.commandName);
}

namespace {

struct Token {
  std::string text;
  bool quoted = false;
};

// Splits a line into words and quoted texts; false when a quote is not closed.
bool Tokenize(std::string_view line, std::vector<Token>& tokens, std::string& problem) {
  std::size_t i = 0;
  while (i < line.size()) {
    const char c = line[i];
    if (std::isspace(static_cast<unsigned char>(c))) {
      ++i;
      continue;
    }
    Token token;
    if (c == '"') {
      token.quoted = true;
      ++i;
      bool closed = false;
      while (i < line.size()) {
        const char d = line[i++];
        if (d == '"') {
          closed = true;
          break;
        }
        if (d == '\\' && i < line.size() && (line[i] == '"' || line[i] == '\\')) {
          token.text += line[i++];
        } else {
          token.text += d;
        }
      }
      if (!closed) {
        problem = "the text is not closed with a quote";
        return false;
      }
      if (i < line.size() && !std::isspace(static_cast<unsigned char>(line[i]))) {
        problem = "a quoted text must be followed by a space";
        return false;
      }
    } else {
      while (i < line.size() && !std::isspace(static_cast<unsigned char>(line[i]))) {
        token.text += line[i++];
      }
    }
    tokens.push_back(std::move(token));
  }
  return true;
}

bool ParseCommandID(std::string_view word, CommandID& id) {
  const auto [end, ec] = std::from_chars(word.data(), word.data() + word.size(), id);
  return ec == std::errc() && end == word.data() + word.size() && id > 0;
}

}  // namespace

std::optional<std::vector<Menu>> Menu::Parse(std::string_view text, std::string* error) {
  std::vector<Menu> menus;
  std::set<std::string, std::less<>> names;
  // Open blocks: the menu's item list, then one list per open submenu.
  std::vector<std::vector<MenuItem>*> open;
  int lineNumber = 0;
  int menuLine = 0;
  const auto fail = [&](int line, std::string_view problem) -> std::optional<std::vector<Menu>> {
    if (error != nullptr) {
      *error = "line " + std::to_string(line) + ": " + std::string(problem);
    }
    return std::nullopt;
  };

  while (!text.empty()) {
    const std::size_t newline = text.find('\n');
    std::string_view line = text.substr(0, newline);
    text = newline == std::string_view::npos ? std::string_view{} : text.substr(newline + 1);
    ++lineNumber;

    std::vector<Token> tokens;
    std::string problem;
    if (!Tokenize(line, tokens, problem)) {
      return fail(lineNumber, problem);
    }
    if (tokens.empty() || (!tokens[0].quoted && tokens[0].text.starts_with('#'))) {
      continue;
    }
    const std::string& verb = tokens[0].text;
    if (tokens[0].quoted) {
      return fail(lineNumber, "a line must begin with menu, item, separator, submenu or end");
    }
    if (open.empty()) {
      if (verb != "menu") {
        return fail(lineNumber, "expected \"menu NAME\"");
      }
      if (tokens.size() != 2 || tokens[1].quoted) {
        return fail(lineNumber, "menu needs exactly one name");
      }
      if (!names.insert(tokens[1].text).second) {
        return fail(lineNumber, "menu \"" + tokens[1].text + "\" is defined twice");
      }
      menus.emplace_back(tokens[1].text);
      open.push_back(&menus.back().mItems);
      menuLine = lineNumber;
      continue;
    }
    std::vector<MenuItem>& items = *open.back();
    if (verb == "item") {
      if (tokens.size() != 3 || tokens[1].quoted || !tokens[2].quoted) {
        return fail(lineNumber, "item needs a command id or name and a quoted text");
      }
      MenuItem item;
      if (std::isdigit(static_cast<unsigned char>(tokens[1].text[0]))) {
        if (!ParseCommandID(tokens[1].text, item.command)) {
          return fail(lineNumber, "\"" + tokens[1].text + "\" is not a valid command id");
        }
      } else {
        item.commandName = tokens[1].text;
      }
      item.text = tokens[2].text;
      items.push_back(std::move(item));
    } else if (verb == "separator") {
      if (tokens.size() != 1) {
        return fail(lineNumber, "separator takes nothing");
      }
      MenuItem item;
      item.kind = MenuItem::Kind::kSeparator;
      items.push_back(std::move(item));
    } else if (verb == "submenu") {
      if (tokens.size() != 2 || !tokens[1].quoted) {
        return fail(lineNumber, "submenu needs a quoted text");
      }
      MenuItem item;
      item.kind = MenuItem::Kind::kSubmenu;
      item.text = tokens[1].text;
      items.push_back(std::move(item));
      open.push_back(&items.back().submenu);
    } else if (verb == "end") {
      if (tokens.size() != 1) {
        return fail(lineNumber, "end takes nothing");
      }
      open.pop_back();
    } else if (verb == "menu") {
      return fail(lineNumber, "menu inside a menu (missing \"end\"?)");
    } else {
      return fail(lineNumber, "unknown statement \"" + verb + "\"");
    }
  }
  if (!open.empty()) {
    return fail(menuLine, "menu \"" + menus.back().GetName() + "\" is not closed with \"end\"");
  }
  return menus;
}
