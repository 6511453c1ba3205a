#pragma once

#include <memory>
#include <set>

#include "Host/Rows/ParameterControl.h"

class TextButton;

// The row of a button parameter: a push button labelled with the parameter's checkbox display
// name. A click sets the parameter to true as one undoable "MZ.ComponentParam.SetValue" step;
// the effect reads the press from there. A button has no keyframes and no stopwatch.
//
// Inside a group (group level not 0) the row is 31 pixels high with a 26-pixel button at least 80
// wide; elsewhere 20 with a 17-pixel button at least 140 wide; never wider than the row leaves
// room for. A click on a read-only or disabled row, or one the model refuses, changes nothing.
class ButtonParameter : public ParameterControl {
 public:
  static constexpr CommandID kButtonCommand = 1;
  static constexpr int kRowHeight = 20;
  static constexpr int kGroupRowHeight = 31;
  static constexpr int kButtonHeight = 17;
  static constexpr int kGroupButtonHeight = 26;
  static constexpr int kMinimumWidth = 140;
  static constexpr int kGroupMinimumWidth = 80;
  static constexpr int kLabelPadding = 15;

  explicit ButtonParameter(const ParameterControlInfo& info);

  int OwnHeight() const override;
  void PositionSelf(int top, int depth, int width) override;
  // Buttons have no keyframe times.
  void GetKeyframeTimes(std::set<TickTime>& times, TimeLine line) const override;
  bool CanTimeVary() const override { return false; }
  void SetTimeVarying(bool /*timeVarying*/) override {}
  // Name and label from the model; nothing else of a button changes with time.
  void SynchToCurrentTime() override { RefreshDisplayName(); }
  void RefreshDisplayName() override;

  bool ObeyCommand(CommandID command) override;
  // Nothing while the row sits in a line of buttons: the button carries the name.
  void DrawTitle(DC& dc, const Rect& rect, const Font& font, Color color) const override;

  // The button's width for its label, at least the minimum, before the row's width limits it.
  int GetPreferredButtonWidth() const;
  // Places the row at `top` with its button at `left` instead of after the name, for a group
  // that lines its buttons up side by side.
  void PositionInLine(int top, int depth, int width, int left);

  // True when a click would be taken (the row is enabled and not read only).
  bool CanClick() const;
  TextButton* GetButton() const { return mButton.get(); }

 protected:
  void CreateControlsSelf() override;
  void DestroyControlsSelf() override;
  void ShowControls(bool show) override;
  void UpdateControlsEnabled(bool enabled) override;

 private:
  bool IsInGroup() const { return GetGroupLevel() != 0; }
  void OnClick();
  void PlaceButton(int left, int width);

  std::shared_ptr<TextButton> mButton;
  bool mInLine = false;  // placed by a buttons group
};
