#pragma once

#include <deque>
#include <optional>
#include <string>
#include <utility>
#include <vector>

#include "Host/Toolkit/InputBox.h"

// Answers input boxes from a queue (the automation script's "input-answer", or a test): each
// box takes the next answer; with the queue empty the box is cancelled. Keeps every request
// until ForgetRequests.
class ScriptedInputBox : public InputBoxResponder {
 public:
  // nullopt cancels the box that takes it.
  void PushAnswer(std::optional<std::string> answer) { mAnswers.push_back(std::move(answer)); }
  std::size_t PendingAnswers() const { return mAnswers.size(); }
  const std::vector<InputBoxRequest>& GetRequests() const { return mRequests; }
  // A long script's runner forgets what it has looked at, so the record does not grow.
  void ForgetRequests() { mRequests.clear(); }

  std::optional<std::string> Answer(const InputBoxRequest& request) override;

 private:
  std::deque<std::optional<std::string>> mAnswers;
  std::vector<InputBoxRequest> mRequests;
};
