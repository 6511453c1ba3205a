#include "Host/Shell/MarkerEditor.h"

#include <charconv>
#include <string>
#include <string_view>

#include "Host/Messaging/Localization.h"
#include "Host/Toolkit/InputBox.h"

namespace {

constexpr std::string_view kTitle = "$$$/Vantile/Host/MarkerEditor/Title=Marker";

std::optional<std::string> AskText(std::string_view promptKey, const std::string& current) {
  return InputBox::Ask(kTitle, promptKey, current);
}

std::optional<int> ParseColor(std::string_view text) {
  while (!text.empty() && text.front() == ' ') {
    text.remove_prefix(1);
  }
  while (!text.empty() && text.back() == ' ') {
    text.remove_suffix(1);
  }
  int value = -1;
  const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), value);
  if (error != std::errc{} || end != text.data() + text.size() || value < 0 || value > 7) {
    return std::nullopt;
  }
  return value;
}

// Asks until the answer can be taken; nullopt when a box is cancelled.
std::optional<int> AskColor(int current) {
  std::string prompt = LocalizeString("$$$/Vantile/Host/MarkerEditor/Color=Colour (0 to 7)");
  std::string answerText = std::to_string(current);
  for (;;) {
    const auto answer = InputBox::Ask(kTitle, prompt, answerText);
    if (!answer) {
      return std::nullopt;
    }
    if (const auto color = ParseColor(*answer)) {
      return color;
    }
    answerText = *answer;
    prompt = LocalizeString(
        "$$$/Vantile/Host/MarkerEditor/BadColor=The colour must be a number from 0 to 7. Colour "
        "(0 to 7)");
  }
}

std::optional<TickTime> AskDuration(const Marker& marker, const MarkerEditorLimits& limits) {
  std::string prompt = LocalizeString("$$$/Vantile/Host/MarkerEditor/Duration=Duration");
  std::string answerText = limits.display.FormatTimecode(marker.duration);
  for (;;) {
    const auto answer = InputBox::Ask(kTitle, prompt, answerText);
    if (!answer) {
      return std::nullopt;
    }
    answerText = *answer;
    const TimecodeParseResult parsed = limits.display.ParseTimecode(*answer);
    if (!parsed.Ok()) {
      prompt =
          parsed.message + " " + LocalizeString("$$$/Vantile/Host/MarkerEditor/Duration=Duration");
      continue;
    }
    const TickTime duration = *parsed.time;
    if (duration < 0) {
      prompt = LocalizeString(
          "$$$/Vantile/Host/MarkerEditor/NegativeDuration=A duration cannot be negative. "
          "Duration");
      continue;
    }
    if (duration > limits.latestEnd - marker.time) {
      prompt = LocalizeString(
          "$$$/Vantile/Host/MarkerEditor/TooLong=The marker would run past the end of the "
          "sequence. Duration");
      continue;
    }
    return duration;
  }
}

}  // namespace

std::optional<Marker> MarkerEditor::Edit(const Marker& marker, const MarkerEditorLimits& limits) {
  Marker edited = marker;
  const auto name = AskText("$$$/Vantile/Host/MarkerEditor/Name=Name", marker.name);
  if (!name) {
    return std::nullopt;
  }
  edited.name = *name;
  const auto comment = AskText("$$$/Vantile/Host/MarkerEditor/Comment=Comments", marker.comment);
  if (!comment) {
    return std::nullopt;
  }
  edited.comment = *comment;
  const auto color = AskColor(marker.colorIndex);
  if (!color) {
    return std::nullopt;
  }
  edited.colorIndex = *color;
  const auto duration = AskDuration(marker, limits);
  if (!duration) {
    return std::nullopt;
  }
  edited.duration = *duration;
  return edited;
}
