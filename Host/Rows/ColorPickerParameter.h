#pragma once

#include <memory>

#include "Host/Model/ParamValue.h"
#include "Host/Rows/ParameterControl.h"
#include "Host/Toolkit/Color.h"

class ColorPickerControl;

// The row of a colour parameter: a swatch in the value column showing the colour at the edit
// time. A picked colour is set at the edit time as one undoable step (a keyframe when the
// parameter varies over time). The swatch shows 8 bits a channel; a pick replaces red, green
// and blue and keeps the parameter's own alpha, so nothing the swatch cannot show is lost
// unless the user replaces it.
class ColorPickerParameter : public ParameterControl {
 public:
  static constexpr int kSwatchWidth = 40;
  static constexpr int kSwatchHeight = 14;

  explicit ColorPickerParameter(const ParameterControlInfo& info);

  void ListenToMessage(const Message& message) override;
  void PositionSelf(int top, int depth, int width) override;
  void SynchToCurrentTime() override;

  // The colour at the edit time; the default colour when the parameter holds none.
  ParamColor GetParamColor() const;
  // Sets red, green and blue at the edit time through the edit contract (alpha kept); false
  // when refused or unchanged.
  bool SetColor(Color color);

  // Channels limited to [0, 1] and rounded to 8 bits.
  static Color ToColor(const ParamColor& color);
  // `color`'s red, green and blue with `alpha`.
  static ParamColor ToParamColor(Color color, float alpha);

  ColorPickerControl* GetSwatch() const { return mSwatch.get(); }

 protected:
  void CreateControlsSelf() override;
  void DestroyControlsSelf() override;
  void ShowControls(bool show) override;
  void UpdateControlsEnabled(bool enabled) override;

 private:
  std::shared_ptr<ColorPickerControl> mSwatch;
};
