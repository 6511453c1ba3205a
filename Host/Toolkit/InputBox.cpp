#include "Host/Toolkit/InputBox.h"

#include <utility>

#include "Host/Messaging/Localization.h"

namespace {

std::shared_ptr<InputBoxResponder>& InstalledResponder() {
  static std::shared_ptr<InputBoxResponder> responder;
  return responder;
}

}  // namespace

std::optional<std::string> InputBox::Ask(std::string_view title, std::string_view prompt,
                                         std::string_view initialText) {
  // Held for the call: the responder may replace itself while it answers.
  const std::shared_ptr<InputBoxResponder> responder = InstalledResponder();
  if (responder == nullptr) {
    return std::nullopt;
  }
  InputBoxRequest request;
  request.title = LocalizeString(title);
  request.prompt = LocalizeString(prompt);
  request.initialText = std::string(initialText);
  return responder->Answer(request);
}

std::shared_ptr<InputBoxResponder> InputBox::SetResponder(
    std::shared_ptr<InputBoxResponder> responder) {
  return std::exchange(InstalledResponder(), std::move(responder));
}

std::shared_ptr<InputBoxResponder> InputBox::GetResponder() {
  return InstalledResponder();
}
