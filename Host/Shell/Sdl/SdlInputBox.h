#pragma once

#include <optional>
#include <string>

#include "Host/Toolkit/Geometry.h"
#include "Host/Toolkit/InputBox.h"

class SdlWindow;

// Input boxes drawn over an SDL window: a title, a prompt and one line of text, which starts as
// the request's initial text. Typing appends, Backspace removes the last character, Return or
// the OK button accepts, Escape, the Cancel button or closing the window cancels.
class SdlInputBox : public InputBoxResponder {
 public:
  // The window must outlive the responder.
  explicit SdlInputBox(SdlWindow& window) : mWindow(window) {}

  std::optional<std::string> Answer(const InputBoxRequest& request) override;

  static constexpr Size kBoxSize{380, 140};

 private:
  SdlWindow& mWindow;  // not owned
};
