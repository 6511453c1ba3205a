#include "Handlers/EffectControls/Src/TimecodeParameter.h"

#include <cmath>

#include "Host/Model/ComponentParam.h"
#include "Host/Model/Sequence.h"
#include "Host/Toolkit/ControlMessages.h"
#include "Host/Toolkit/HotTimecodeControl.h"

TimecodeParameter::TimecodeParameter(const ParameterControlInfo& info) : ParameterControl(info) {}

void TimecodeParameter::ListenToMessage(const Message& message) {
  if (const auto* changing = message.As<HotTimecodeValueChangingMessage>()) {
    OnTimecodeChanging(changing->time);
  } else if (const auto* changed = message.As<HotTimecodeValueChangedMessage>()) {
    OnTimecodeChanged(changed->time);
  } else {
    ParameterControl::ListenToMessage(message);
  }
}

void TimecodeParameter::PositionSelf(int top, int depth, int width) {
  ParameterControl::PositionSelf(top, depth, width);
  if (mField) {
    const int left = GetParameterIndentInPixels() + width / 2 - 20;
    PlaceView(*mField, Rect::FromSize(left, top + 4, kFieldWidth, kFieldHeight));
  }
}

void TimecodeParameter::SynchToCurrentTime() {
  if (!mField) {
    return;
  }
  mField->SetQuantizeFrameRate(GetTimebase());
  const TickTime time = GetTime();
  if (!mField->IsEditing() && mField->GetTime() != time) {
    mField->SetTime(time);
  }
}

TickTime TimecodeParameter::GetTime() const {
  const std::optional<double> ticks = AsScalar(GetValueAtEditTime());
  if (!ticks || !std::isfinite(*ticks)) {
    return kTime_Zero;
  }
  return static_cast<TickTime>(std::llround(*ticks));
}

std::optional<FrameRate> TimecodeParameter::GetTimebase() const {
  return GetParam() ? GetParam()->GetParameterTimebase() : std::nullopt;
}

TickTime TimecodeParameter::Quantize(TickTime time) const {
  const std::optional<FrameRate> timebase = GetTimebase();
  if (!timebase) {
    return time;
  }
  return FrameToTime(ToFrame(time, *timebase), *timebase);
}

void TimecodeParameter::OnTimecodeChanging(TickTime time) {
  if (SetEditValue(static_cast<double>(Quantize(time)))) {
    RedrawKeyframeView();
  } else {
    SynchToCurrentTime();
  }
}

void TimecodeParameter::OnTimecodeChanged(TickTime time) {
  const bool open = SynchParamActor();
  const bool written = open && SetEditValue(static_cast<double>(Quantize(time)));
  if (written) {
    CommitEdit();
  }
  ReleaseParamActor();
  RedrawKeyframeView();
  // What the model took (limited to the range, or refused) is what the field shows.
  SynchToCurrentTime();
}

void TimecodeParameter::CreateControlsSelf() {
  const FrameRate display = GetSequence() ? GetSequence()->GetVideoTimeDisplay() : kFrameRate_25;
  mField = AdoptControl(std::make_shared<HotTimecodeControl>(
      Rect::FromSize(0, -115, kFieldWidth, kFieldHeight), display, kTime_Zero, this));
  if (mField) {
    mField->SetMinTime(kTime_Zero);
    AddListener(mField->GetStation(), *this);
  }
}

void TimecodeParameter::DestroyControlsSelf() {
  if (mField) {
    RemoveListener(mField->GetStation(), *this);
  }
  DestroyControl(mField);
}

void TimecodeParameter::ShowControls(bool show) {
  ParameterControl::ShowControls(show);
  if (mField) {
    mField->SetVisible(show);
  }
}

void TimecodeParameter::UpdateControlsEnabled(bool enabled) {
  if (mField) {
    mField->SetEnabled(enabled);
  }
}
