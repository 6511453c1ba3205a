#pragma once

#include <cstddef>
#include <cstdint>
#include <memory>
#include <string_view>

#include "Host/Rows/SliderParameter.h"

class AngleControl;
class ComponentParam;
class HotFloatControl;

// The row of an angle parameter (degrees, clockwise). An angle keeps whole turns (Rotation
// reaches far beyond one revolution), so the row shows it in two parts: the number of turns in a
// second field beside the base's, and the rest, in (-180, 180], in the base's field and on its
// slider, which always span -180 to 180. 720 shows as 2 turns and 0; a nudge of the rest to 1
// writes 721. A small dial beside the fields shows and turns the whole angle.
//
// A gesture keeps the turns it started with, so dragging the rest past -180 or 180 does not
// jump a turn mid-drag. Every gesture of any of the three controls is one undoable
// "MZ.ComponentParam.SetValue" (a keyframe at the edit time when the angle varies over time).
class AngleSliderParameter : public SliderParameter {
 public:
  static constexpr std::int32_t kTurnsFieldCookie = 101;
  static constexpr std::int32_t kDialCookie = 102;
  static constexpr int kDialSize = 18;
  static constexpr int kTurnsFieldWidth = 44;
  static constexpr double kTurnsLimit = 32759.0;
  // The effect that takes finer steps on its third parameter.
  static constexpr std::string_view kWriteOnMatchName = "XO.KRVN Write-on";
  static constexpr int kGraphMinimumHeight = 54;

  explicit AngleSliderParameter(const ParameterControlInfo& info);

  // An angle as whole turns and the rest in (-180, 180]: 720 -> {2, 0}, 900 -> {2, 180},
  // -190 -> {-1, 170}.
  struct Turns {
    double turns = 0.0;
    double degrees = 0.0;
  };
  static Turns SplitTurns(double angle);
  // The field's step for `param` of the effect `matchName`: from a hundredth r of the range, 1
  // when r > 0.1, else 0.1; 0.01 for the write-on effect's parameter at index 2 when r <= 0.01;
  // 0.1 for an exponential parameter.
  static double ComputeValueIncrement(const ComponentParam& param, std::string_view matchName,
                                      std::size_t paramIndex);

  void ListenToMessage(const Message& message) override;
  void PositionSelf(int top, int depth, int width) override;
  void SynchToCurrentTime() override;
  void RefreshSliderParameters() override;
  void SynchToFeedback(const ComponentParamRef& param) override;
  int GetValueGraphMinimumHeight() const override { return kGraphMinimumHeight; }
  int GetVelocityGraphMinimumHeight() const override { return kGraphMinimumHeight; }

  void OnHotFloatControlChanging(float value, std::int32_t cookie) override;
  void OnHotFloatControlChanged(float value, std::int32_t cookie) override;
  // The angle row always writes, whatever `toModel` says.
  void OnSliderValueChanging(float value, bool toModel) override;
  void OnSliderValueChanged(float value, bool toModel) override;

  HotFloatControl* GetTurnsField() const { return mTurnsField.get(); }
  AngleControl* GetDial() const { return mDial.get(); }
  // The turns the row writes the rest against (those of the value when the gesture began).
  double GetTurns() const { return mTurns; }
  // The whole angle as last read, and the edit time it was read at.
  double GetCachedValue() const { return mCachedValue; }
  TickTime GetCachedTime() const { return mCachedTime; }

 protected:
  void CreateControlsSelf() override;
  void DestroyControlsSelf() override;
  void ShowControls(bool show) override;
  void UpdateControlsEnabled(bool enabled) override;
  // The rest, in (-180, 180], against the row's turns.
  double ReadValue() const override;
  // The whole angle for a rest shown by the field or the slider.
  ParamValue ToParamValue(double degrees) const override;
  int GetDisplayDigits() const override;

 private:
  double ReadAngle(const ComponentParam& param) const;
  double RoundToPrecision(double degrees) const;
  // One step (`finished` false) or the end of a gesture that writes the whole `angle`.
  void WriteAngle(double angle, bool finished);
  void ShowTurnsAndDial(double angle);

  std::shared_ptr<HotFloatControl> mTurnsField;  // borrowed from the parameter cache
  std::shared_ptr<AngleControl> mDial;
  double mTurns = 0.0;
  double mCachedValue = 0.0;
  TickTime mCachedTime = kTime_Min;
};
