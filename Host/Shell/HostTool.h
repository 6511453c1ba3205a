#pragma once

#include <array>
#include <optional>
#include <string_view>
#include <utility>

// The timeline tools. Each has its message on the tool station (ShellMessages.h).
enum class HostTool {
  kPointer,
  kTrackSelectForward,
  kRipple,
  kRoll,
  kRateStretch,
  kRazor,
  kSlip,
  kSlide,
  kPen,
  kHand,
  kZoom,
};

// The tools by the names scripts use ("pointer", "track-select-forward", "ripple", "roll",
// "rate-stretch", "razor", "slip", "slide", "pen", "hand", "zoom").
inline constexpr std::array<std::pair<std::string_view, HostTool>, 11> kHostToolNames = {{
    {"pointer", HostTool::kPointer},
    {"track-select-forward", HostTool::kTrackSelectForward},
    {"ripple", HostTool::kRipple},
    {"roll", HostTool::kRoll},
    {"rate-stretch", HostTool::kRateStretch},
    {"razor", HostTool::kRazor},
    {"slip", HostTool::kSlip},
    {"slide", HostTool::kSlide},
    {"pen", HostTool::kPen},
    {"hand", HostTool::kHand},
    {"zoom", HostTool::kZoom},
}};

inline std::optional<HostTool> HostToolFromName(std::string_view name) {
  for (const auto& [toolName, tool] : kHostToolNames) {
    if (toolName == name) {
      return tool;
    }
  }
  return std::nullopt;
}
