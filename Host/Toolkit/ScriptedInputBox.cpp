#include "Host/Toolkit/ScriptedInputBox.h"

std::optional<std::string> ScriptedInputBox::Answer(const InputBoxRequest& request) {
  mRequests.push_back(request);
  if (mAnswers.empty()) {
    return std::nullopt;
  }
  std::optional<std::string> answer = std::move(mAnswers.front());
  mAnswers.pop_front();
  return answer;
}
