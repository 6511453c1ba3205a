#pragma once

#include "Host/Rows/FloatSliderParameter.h"

// The row of a scalar parameter of a video effect. Every step of a drag is announced with
// ParameterControlValueChangingMessage on the row's station before it is shown or written, also
// a step that only shows the value (to-model false), so a monitor can follow the drag live. An
// edit still open when the player stops ends there, committing what was set.
class VideoFloatSliderParameter : public FloatSliderParameter {
 public:
  explicit VideoFloatSliderParameter(const ParameterControlInfo& info);

  void OnSliderValueChanging(float value, bool toModel) override;
  void OnPlayerIsStopped() override;
};
