#include "Host/Toolkit/ScriptedMenuTracker.h"

std::optional<CommandID> ScriptedMenuTracker::TrackPopupMenu(const PopupMenuRequest& request) {
  mRequests.push_back(request);
  if (mAnswers.empty()) {
    ++mUnanswered;
    return std::nullopt;
  }
  const std::optional<CommandID> answer = mAnswers.front();
  mAnswers.pop_front();
  return answer;
}
