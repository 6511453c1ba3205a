#include "Handlers/EffectControls/Src/VideoFloatSliderParameter.h"

#include "Host/Messaging/Station.h"

VideoFloatSliderParameter::VideoFloatSliderParameter(const ParameterControlInfo& info)
    : FloatSliderParameter(info) {}

void VideoFloatSliderParameter::OnSliderValueChanging(float value, bool toModel) {
  if (!GetStation().empty()) {
    BroadcastMessage(GetStation(), ParameterControlValueChangingMessage());
  }
  FloatSliderParameter::OnSliderValueChanging(value, toModel);
}

void VideoFloatSliderParameter::OnPlayerIsStopped() {
  ReleaseParamActor();
  FloatSliderParameter::OnPlayerIsStopped();
}
