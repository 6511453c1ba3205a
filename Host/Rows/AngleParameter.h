#pragma once

#include <cstdint>
#include <memory>

#include "Host/Rows/ParameterControl.h"

class AngleControl;
class HotFloatControl;

// The row of an angle parameter (degrees, clockwise, whole turns kept): a number field in the
// value column and, while the row is expanded, a dial under it. Both edit the angle through the
// edit contract: a drag of either is one undoable step, a typed angle too.
class AngleParameter : public ParameterControl {
 public:
  static constexpr std::int32_t kFieldCookie = 1;
  static constexpr std::int32_t kDialCookie = 2;
  static constexpr int kDialSize = 40;
  static constexpr int kControlAreaHeight = kDialSize + 8;

  explicit AngleParameter(const ParameterControlInfo& info);

  bool CanExpand() const override { return true; }
  void ListenToMessage(const Message& message) override;
  void PositionSelf(int top, int depth, int width) override;
  int GetTitleRightEdge() const override;
  void SynchToCurrentTime() override;
  void RefreshSliderParameters() override;

  // The angle at the edit time, in degrees.
  double GetAngle() const;
  HotFloatControl* GetHotText() const { return mField.get(); }
  AngleControl* GetDial() const { return mDial.get(); }

  // A step of a gesture (field scrub or dial drag) and its end. The angle is rounded to the
  // parameter's digits before it is written.
  virtual void OnAngleChanging(double degrees);
  virtual void OnAngleChanged(double degrees);
  double RoundToPrecision(double degrees) const;

 protected:
  int GetControlAreaHeight() const override { return kControlAreaHeight; }
  void CreateControlsSelf() override;
  void DestroyControlsSelf() override;
  void ShowControls(bool show) override;
  void UpdateControlsEnabled(bool enabled) override;

 private:
  std::shared_ptr<HotFloatControl> mField;
  std::shared_ptr<AngleControl> mDial;
};
