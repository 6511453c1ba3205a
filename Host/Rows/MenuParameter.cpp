#include "Host/Rows/MenuParameter.h"

#include <algorithm>
#include <variant>

#include "Host/Model/ComponentParam.h"
#include "Host/Model/ParamValue.h"
#include "Host/Toolkit/PopupControl.h"
#include "Host/Toolkit/TextPopup.h"

MenuParameter::MenuParameter(const ParameterControlInfo& info) : ParameterControl(info) {}

void MenuParameter::ListenToMessage(const Message& message) {
  if (const auto* chosen = message.As<PopupControlChangedMessage>()) {
    if (!ChooseItem(chosen->index)) {
      SynchToCurrentTime();  // refused: the popup shows the model again
    }
    return;
  }
  ParameterControl::ListenToMessage(message);
}

void MenuParameter::PositionSelf(int top, int depth, int width) {
  ParameterControl::PositionSelf(top, depth, width);
  if (mPopup) {
    const int left = GetControlsLeft() + 10;
    const int room = std::max(20, width - left - 4);
    PlaceView(*mPopup, Rect::FromSize(left, top + 2, std::min(kPopupWidth, room), kPopupHeight));
  }
}

void MenuParameter::SynchToCurrentTime() {
  if (!mPopup) {
    return;
  }
  const int choice = GetChoice();
  mPopup->SetSelectedIndex(choice >= 0 && choice < mPopup->GetItemCount() ? choice : -1);
}

void MenuParameter::RefreshSliderParameters() {
  if (!mPopup || !GetParam()) {
    return;
  }
  mPopup->SetItems(GetParam()->GetMenuEntries());
  SynchToCurrentTime();
}

int MenuParameter::GetChoice() const {
  const ParamValue value = GetValueAtEditTime();
  if (const auto* choice = std::get_if<ParamChoice>(&value)) {
    return choice->index;
  }
  return -1;
}

bool MenuParameter::ChooseItem(int index) {
  const ComponentParamRef& param = GetParam();
  if (!param || index < 0 || index >= static_cast<int>(param->GetMenuEntries().size()) ||
      index == GetChoice()) {
    return false;
  }
  return ApplyValue(ParamChoice{index});
}

void MenuParameter::CreateControlsSelf() {
  mPopup = AdoptControl(std::make_shared<TextPopup>(Rect::FromSize(0, 0, kPopupWidth, kPopupHeight),
                                                    GetControlID(), this));
  if (mPopup) {
    mPopup->SetTitle(GetParam() ? GetParam()->GetDisplayName() : std::string());
    AddListener(mPopup->GetStation(), *this);
  }
}

void MenuParameter::DestroyControlsSelf() {
  if (mPopup) {
    RemoveListener(mPopup->GetStation(), *this);
  }
  DestroyControl(mPopup);
}

void MenuParameter::ShowControls(bool show) {
  ParameterControl::ShowControls(show);
  if (mPopup) {
    mPopup->SetVisible(show);
  }
}

void MenuParameter::UpdateControlsEnabled(bool enabled) {
  if (mPopup) {
    mPopup->SetEnabled(enabled);
  }
}
