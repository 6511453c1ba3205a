#pragma once

#include <memory>
#include <optional>
#include <string>
#include <string_view>

// What an input box asks: texts already localised.
struct InputBoxRequest {
  std::string title;
  std::string prompt;
  std::string initialText;
};

// Answers input boxes: the window front end shows a dialog; headless runs answer from their
// script. nullopt means cancelled. UI thread only.
class InputBoxResponder {
 public:
  InputBoxResponder() = default;
  InputBoxResponder(const InputBoxResponder&) = delete;
  InputBoxResponder& operator=(const InputBoxResponder&) = delete;
  virtual ~InputBoxResponder() = default;

  virtual std::optional<std::string> Answer(const InputBoxRequest& request) = 0;
};

// Asks the user for one line of text.
class InputBox {
 public:
  // `title` and `prompt` may be "$$$/" keys. The entered text, or nullopt when cancelled or no
  // responder is installed.
  static std::optional<std::string> Ask(std::string_view title, std::string_view prompt,
                                        std::string_view initialText);

  // The process-wide responder; returns the previous one.
  static std::shared_ptr<InputBoxResponder> SetResponder(
      std::shared_ptr<InputBoxResponder> responder);
  static std::shared_ptr<InputBoxResponder> GetResponder();
};
