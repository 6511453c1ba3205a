#pragma once

#include <cstdint>
#include <string>

// Numeric command identifiers; the host's and the panels' ids share one space.
using CommandID = std::int32_t;

// No command (a menu separator, an unanswered popup).
inline constexpr CommandID kNoCommand = 0;

// How a checked menu item is marked.
enum class CommandMark { kCheck, kBullet, kDash };

// The state of a command as its handler reports it; a command nobody answers for is disabled.
struct CommandStatus {
  bool enabled = false;
  bool checked = false;
  CommandMark mark = CommandMark::kCheck;  // shown only while checked
  std::string text;                        // replaces the menu item's text when not empty

  friend bool operator==(const CommandStatus&, const CommandStatus&) = default;
};
