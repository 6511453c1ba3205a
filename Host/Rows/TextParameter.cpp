#include "Host/Rows/TextParameter.h"

#include <algorithm>
#include <optional>
#include <variant>

#include "Host/Model/ParamValue.h"
#include "Host/Toolkit/InputBox.h"
#include "Host/Toolkit/TextButton.h"

TextParameter::TextParameter(const ParameterControlInfo& info, bool editable)
    : ParameterControl(info), mEditable(editable) {}

void TextParameter::PositionSelf(int top, int depth, int width) {
  ParameterControl::PositionSelf(top, depth, width);
  if (mButton) {
    const int left = GetControlsLeft() + 10;
    PlaceView(*mButton, Rect::FromSize(left, top + 1, std::max(width - left - 4, 0), 18));
  }
}

void TextParameter::SynchToCurrentTime() {
  if (mButton) {
    mButton->SetLabel(GetText());
  }
}

bool TextParameter::FindCommandStatus(CommandID command, CommandStatus& status) {
  if (command == kEditTextCommand) {
    status.enabled = IsEditable();
    return true;
  }
  return ParameterControl::FindCommandStatus(command, status);
}

bool TextParameter::ObeyCommand(CommandID command) {
  if (command != kEditTextCommand) {
    return ParameterControl::ObeyCommand(command);
  }
  if (!IsEditable()) {
    return true;
  }
  const std::string current = GetText();
  const std::optional<std::string> answer =
      InputBox::Ask("$$$/Vantile/Host/Rows/EditTextTitle=Edit Text", GetName(), current);
  if (answer && *answer != current) {
    ApplyValue(*answer);
  }
  SynchToCurrentTime();
  return true;
}

std::string TextParameter::GetText() const {
  const ParamValue value = GetValueAtEditTime();
  if (const auto* text = std::get_if<std::string>(&value)) {
    return *text;
  }
  return {};
}

void TextParameter::CreateControlsSelf() {
  mButton =
      AdoptControl(std::make_shared<TextButton>(Rect{}, std::string(), kEditTextCommand, this));
}

void TextParameter::DestroyControlsSelf() {
  DestroyControl(mButton);
}

void TextParameter::ShowControls(bool show) {
  ParameterControl::ShowControls(show);
  if (mButton) {
    mButton->SetVisible(show);
  }
}

void TextParameter::UpdateControlsEnabled(bool enabled) {
  if (mButton) {
    mButton->SetEnabled(enabled && mEditable);
  }
}
