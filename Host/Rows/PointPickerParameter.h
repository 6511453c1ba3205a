#pragma once

#include <cstdint>
#include <memory>

#include "Host/Model/ParamValue.h"
#include "Host/Rows/ParameterControl.h"

class HotFloatControl;

// The row of a two-dimensional point parameter (position, anchor, a scale with two axes): two
// number fields, X then Y, in the value column. Dragging or typing one coordinate writes the
// point with the other coordinate as it stands at the edit time, so only the one the user
// touched changes; a drag is one undoable step, a typed value too.
class PointPickerParameter : public ParameterControl {
 public:
  static constexpr std::int32_t kXCookie = 1;
  static constexpr std::int32_t kYCookie = 2;
  static constexpr int kFieldWidth = 60;
  static constexpr int kFieldGap = 8;

  explicit PointPickerParameter(const ParameterControlInfo& info);

  void ListenToMessage(const Message& message) override;
  void PositionSelf(int top, int depth, int width) override;
  int GetTitleRightEdge() const override;
  void SynchToCurrentTime() override;
  void RefreshSliderParameters() override;

  // The point at the edit time.
  ParamPoint GetPoint() const;
  HotFloatControl* GetXField() const { return mX.get(); }
  HotFloatControl* GetYField() const { return mY.get(); }

 protected:
  // The point to write when the user set coordinate X (`isX`) or Y to `value`, given the point
  // at the edit time. The base replaces that coordinate only.
  virtual ParamPoint MakePoint(const ParamPoint& current, bool isX, double value) const;
  // Right edge of the fields (where a subclass may put more).
  int GetFieldsRight() const;

  void CreateControlsSelf() override;
  void DestroyControlsSelf() override;
  void ShowControls(bool show) override;
  void UpdateControlsEnabled(bool enabled) override;

 private:
  void OnFieldChanging(double value, std::int32_t cookie);
  void OnFieldChanged(double value, std::int32_t cookie);

  std::shared_ptr<HotFloatControl> mX;
  std::shared_ptr<HotFloatControl> mY;
};
