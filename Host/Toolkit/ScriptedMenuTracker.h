#pragma once

#include <deque>
#include <optional>
#include <vector>

#include "Host/Toolkit/MenuTracker.h"

// Answers popup menus from a queue (the automation script's "menu-answer", or a test): each
// popup takes the next answer; with the queue empty the popup is dismissed. Keeps every
// request it saw.
class ScriptedMenuTracker : public MenuTracker {
 public:
  // nullopt dismisses the popup that takes it.
  void PushAnswer(std::optional<CommandID> answer) { mAnswers.push_back(answer); }
  std::size_t PendingAnswers() const { return mAnswers.size(); }
  const std::vector<PopupMenuRequest>& GetRequests() const { return mRequests; }
  // Popups shown while no answer was queued.
  int GetUnansweredCount() const { return mUnanswered; }

  std::optional<CommandID> TrackPopupMenu(const PopupMenuRequest& request) override;

 private:
  std::deque<std::optional<CommandID>> mAnswers;
  std::vector<PopupMenuRequest> mRequests;
  int mUnanswered = 0;
};
