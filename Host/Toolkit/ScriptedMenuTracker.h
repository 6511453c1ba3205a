#pragma once

#include <deque>
#include <optional>
#include <vector>

#include "Host/Toolkit/MenuTracker.h"

// Answers popup menus from a queue (the automation script's "menu-answer", or a test): each
// popup takes the next answer; with the queue empty the popup is dismissed. Keeps every
// request it saw until ForgetRequests.
class ScriptedMenuTracker : public MenuTracker {
 public:
  // nullopt dismisses the popup that takes it.
  void PushAnswer(std::optional<CommandID> answer) { mAnswers.push_back(Answer{answer, -1}); }
  // The popup that takes it chooses its `index`-th enabled command (submenus included, in the
  // order shown), counting round past the last; a popup with none enabled is dismissed. For
  // answers drawn at random before anyone knows what the menu will hold.
  void PushPick(int index) { mAnswers.push_back(Answer{std::nullopt, index < 0 ? 0 : index}); }
  std::size_t PendingAnswers() const { return mAnswers.size(); }
  const std::vector<PopupMenuRequest>& GetRequests() const { return mRequests; }
  // A long script's runner forgets what it has looked at, so the record does not grow.
  void ForgetRequests() { mRequests.clear(); }
  // Popups shown while no answer was queued.
  int GetUnansweredCount() const { return mUnanswered; }

  std::optional<CommandID> TrackPopupMenu(const PopupMenuRequest& request) override;

 private:
  struct Answer {
    std::optional<CommandID> command;
    int pick = -1;  // >= 0: a pick, `command` unused
  };

  std::deque<Answer> mAnswers;
  std::vector<PopupMenuRequest> mRequests;
  int mUnanswered = 0;
};
