#include "Handlers/EffectControls/Src/TrackMenuParameter.h"

#include <string_view>
#include <variant>

#include "Host/Model/ComponentParam.h"
#include "Host/Model/ModelMessages.h"
#include "Host/Model/ParamValue.h"
#include "Host/Model/Sequence.h"
#include "Host/Toolkit/CommandStatus.h"
#include "Host/Toolkit/TextPopup.h"

namespace {

constexpr std::string_view kSeparatorString = "(-";

}  // namespace

TrackMenuParameter::TrackMenuParameter(const ParameterControlInfo& info) : ParameterControl(info) {}

void TrackMenuParameter::ListenToMessage(const Message& message) {
  if (const auto* changed = message.As<SequenceChangedMessage>()) {
    if (changed->structureChanged && changed->sequence == GetSequence()) {
      RebuildMenuFromSequence();
      SynchToCurrentTime();
    }
    return;
  }
  ParameterControl::ListenToMessage(message);
}

void TrackMenuParameter::PositionSelf(int top, int depth, int width) {
  ParameterControl::PositionSelf(top, depth, width);
  if (mPopup) {
    const int left = GetParameterIndentInPixels() + width / 2 - 20;
    PlaceView(*mPopup, Rect::FromSize(left, top + 2, kPopupWidth, kPopupHeight));
  }
}

void TrackMenuParameter::SynchToCurrentTime() {
  if (!mPopup) {
    return;
  }
  const int index = GetValueIndex();
  const CommandID command = index >= 0 ? kFirstItemCommand + index : kNoCommand;
  mSelectedCommand = command;
  if (!IsItemCommand(command) || !mPopup->SelectCommand(command)) {
    mPopup->SetSelectedIndex(-1);
  }
}

bool TrackMenuParameter::FindCommandStatus(CommandID command, CommandStatus& status) {
  if (!IsItemCommand(command)) {
    return ParameterControl::FindCommandStatus(command, status);
  }
  status.enabled = IsParamEnabled() && !IsReadOnly();
  const int index = GetValueIndex();
  status.checked = index >= 0 && kFirstItemCommand + index == command;
  return true;
}

bool TrackMenuParameter::ObeyCommand(CommandID command) {
  if (!IsItemCommand(command)) {
    return ParameterControl::ObeyCommand(command);
  }
  Choose(command);
  return true;
}

void TrackMenuParameter::RebuildMenu(const std::vector<std::string>& strings) {
  if (!mPopup || strings.empty()) {
    return;
  }
  mPopup->ClearItems();
  CommandID command = kFirstItemCommand;
  for (const std::string& text : strings) {
    if (command > kLastItemCommand) {
      break;
    }
    if (text == kSeparatorString) {
      mPopup->AddSeparator();
    } else if (!text.empty() && text.front() != '~') {
      mPopup->AddItem(text, command);
    }
    ++command;
  }
  mSelectedCommand = kFirstItemCommand;
  SynchToCurrentTime();
}

int TrackMenuParameter::GetValueIndex() const {
  const ParamValue value = GetValueAtEditTime();
  if (const auto* choice = std::get_if<ParamChoice>(&value)) {
    return choice->index;
  }
  return -1;
}

void TrackMenuParameter::CreateControlsSelf() {
  mPopup = AdoptControl(std::make_shared<TextPopup>(
      Rect::FromSize(0, -117, kPopupWidth, kPopupHeight), GetControlID(), this));
  if (mPopup) {
    mPopup->SetTitle(GetParam() ? GetParam()->GetDisplayName() : std::string());
  }
  ListenToSequence();
  RebuildMenuFromSequence();
}

void TrackMenuParameter::DestroyControlsSelf() {
  StopListeningToSequence();
  DestroyControl(mPopup);
}

void TrackMenuParameter::UpdateParamBinding(const SequenceRef& sequence,
                                            const ComponentRef& component,
                                            const ComponentParamRef& param,
                                            const TrackItemRef& trackItem,
                                            const StationName& playerStation) {
  const bool created = mPopup != nullptr;
  if (created) {
    StopListeningToSequence();
  }
  ParameterControl::UpdateParamBinding(sequence, component, param, trackItem, playerStation);
  if (created) {
    ListenToSequence();
    RebuildMenuFromSequence();
    SynchToCurrentTime();
  }
}

void TrackMenuParameter::ListenToSequence() {
  if (GetSequence() && mSequenceStation.empty()) {
    mSequenceStation = GetSequence()->GetStation();
    AddListener(mSequenceStation, *this);
  }
}

void TrackMenuParameter::StopListeningToSequence() {
  if (!mSequenceStation.empty()) {
    RemoveListener(mSequenceStation, *this);
    mSequenceStation.clear();
  }
}

void TrackMenuParameter::ShowControls(bool show) {
  ParameterControl::ShowControls(show);
  if (mPopup) {
    mPopup->SetVisible(show);
  }
}

void TrackMenuParameter::UpdateControlsEnabled(bool enabled) {
  if (mPopup) {
    mPopup->SetEnabled(enabled);
  }
}

void TrackMenuParameter::RebuildMenuFromSequence() {
  if (GetSequence()) {
    RebuildMenu(GetSequence()->GetTrackComboParamStrings());
  }
}

void TrackMenuParameter::Choose(CommandID command) {
  if (IsParamEnabled() && !IsReadOnly()) {
    ApplyValue(ParamChoice{static_cast<std::int32_t>(command - kFirstItemCommand)});
  }
  // The popup shows what the model holds, whether the choice was taken or not.
  SynchToCurrentTime();
}
