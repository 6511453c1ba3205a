#pragma once

#include <memory>

#include "Host/Rows/ParameterControl.h"

class CheckBoxControl;

// The row of an on/off parameter: a check box in the value column. A click sets the value at
// the edit time as one undoable step (a keyframe when the parameter varies over time).
class CheckboxParameter : public ParameterControl {
 public:
  explicit CheckboxParameter(const ParameterControlInfo& info);

  void ListenToMessage(const Message& message) override;
  void PositionSelf(int top, int depth, int width) override;
  void SynchToCurrentTime() override;

  CheckBoxControl* GetCheckBox() const { return mCheckBox.get(); }

 protected:
  void CreateControlsSelf() override;
  void DestroyControlsSelf() override;
  void ShowControls(bool show) override;
  void UpdateControlsEnabled(bool enabled) override;

 private:
  std::shared_ptr<CheckBoxControl> mCheckBox;
};
