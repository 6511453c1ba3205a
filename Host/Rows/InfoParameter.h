#pragma once

#include <memory>
#include <string>

#include "Host/Rows/ParameterControl.h"

class Static;

// The row of an information parameter: its value shown as text in the value column, never
// edited and never varying over time.
class InfoParameter : public ParameterControl {
 public:
  explicit InfoParameter(const ParameterControlInfo& info);

  bool CanTimeVary() const override { return false; }
  void PositionSelf(int top, int depth, int width) override;
  void SynchToCurrentTime() override;

  Static* GetLabel() const { return mLabel.get(); }
  // The value as the row shows it.
  std::string GetText() const;

 protected:
  void CreateControlsSelf() override;
  void DestroyControlsSelf() override;
  void ShowControls(bool show) override;
  void UpdateControlsEnabled(bool enabled) override;

 private:
  std::shared_ptr<Static> mLabel;
};
