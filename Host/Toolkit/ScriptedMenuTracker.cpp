#include "Host/Toolkit/ScriptedMenuTracker.h"

namespace {

void CollectEnabledCommands(const std::vector<PopupMenuEntry>& entries,
                            std::vector<CommandID>& commands) {
  for (const auto& entry : entries) {
    if (entry.kind == MenuItem::Kind::kCommand && entry.enabled)
      commands.push_back(entry.command);
    CollectEnabledCommands(entry.submenu, commands);
  }
}

}  // namespace

std::optional<CommandID> ScriptedMenuTracker::TrackPopupMenu(const PopupMenuRequest& request) {
  mRequests.push_back(request);
  if (mAnswers.empty()) {
    ++mUnanswered;
    return std::nullopt;
  }
  const Answer answer = mAnswers.front();
  mAnswers.pop_front();
  if (answer.pick < 0)
    return answer.command;
  std::vector<CommandID> enabled;
  CollectEnabledCommands(request.entries, enabled);
  if (enabled.empty())
    return std::nullopt;
  return enabled[static_cast<std::size_t>(answer.pick) % enabled.size()];
}
