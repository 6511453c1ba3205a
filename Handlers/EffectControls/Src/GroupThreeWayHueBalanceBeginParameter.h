#pragma once

#include <array>
#include <memory>

#include "Handlers/EffectControls/Src/GroupWheelSetBeginParameter.h"
#include "Host/Toolkit/CommandStatus.h"

class PictureButton;
class Static;

// Shadows, midtones and highlights wheels side by side, each over an angle and a magnitude
// child (children 0 to 5 in that order), with a label and a reset button above each; child 6,
// a check box, links the wheels: while it is on, a gesture on any wheel moves all three to its
// values, as one undo step. The reset buttons (commands 18513, 18514, 18515) set their wheel to
// its parameters' defaults, one undo step each.
//
// With W the row's width and I the parameter indent, D = (W - I - 40) / 3 (never below zero):
// columns at x = I + 20, I + 25 + D and I + 30 + 2D; the label and the reset button on the line
// under the group's band (top + 20), the wheels D x D at top + 38; the children from
// top + 38 + D + 12; the group that high plus its visible children.
class GroupThreeWayHueBalanceBeginParameter : public GroupWheelSetBeginParameter {
 public:
  static constexpr CommandID kResetShadowsCommand = 18513;
  static constexpr CommandID kResetMidtonesCommand = 18514;
  static constexpr CommandID kResetHighlightsCommand = 18515;
  static constexpr std::size_t kLinkChild = 6;
  static constexpr int kLabelTop = 20;
  static constexpr int kWheelTop = 38;

  explicit GroupThreeWayHueBalanceBeginParameter(const ParameterControlInfo& info);
  ~GroupThreeWayHueBalanceBeginParameter() override;

  int Height() const override;
  void PositionSelf(int top, int depth, int width) override;
  bool FindCommandStatus(CommandID command, CommandStatus& status) override;
  bool ObeyCommand(CommandID command) override;

  int GetWheelDiameter() const;
  // The link check box's value at the edit time.
  bool IsLinked() const;
  PictureButton* GetResetButton(std::size_t wheel) const { return mResets.at(wheel).get(); }
  Static* GetLabel(std::size_t wheel) const { return mLabels.at(wheel).get(); }

 protected:
  void CreateControlsSelf() override;
  void DestroyControlsSelf() override;
  void ShowControls(bool show) override;
  int GetExpandedAreaHeight() const override;
  std::vector<std::size_t> LinkedWheels(std::size_t index) const override;

 private:
  std::array<std::shared_ptr<Static>, 3> mLabels;
  std::array<std::shared_ptr<PictureButton>, 3> mResets;
};
