#pragma once

#include <memory>

#include "Host/Rows/ParameterControl.h"

class TextPopup;

// The row of a menu parameter (a choice among the texts of the parameter's description): a
// popup in the value column showing the choice at the edit time. Choosing an item sets it at
// the edit time as one undoable step (a keyframe when the parameter varies over time; a choice
// holds until the next keyframe). Choosing what is shown already changes nothing.
class MenuParameter : public ParameterControl {
 public:
  static constexpr int kPopupWidth = 150;
  static constexpr int kPopupHeight = 17;

  explicit MenuParameter(const ParameterControlInfo& info);

  void ListenToMessage(const Message& message) override;
  void PositionSelf(int top, int depth, int width) override;
  void SynchToCurrentTime() override;
  // Re-reads the items from the parameter's description.
  void RefreshSliderParameters() override;

  // The index at the edit time; -1 when the parameter holds no choice.
  int GetChoice() const;
  // Sets the choice at the edit time through the edit contract; false when refused (read
  // only, an index the menu does not have) or unchanged. The popup then shows the model.
  bool ChooseItem(int index);

  TextPopup* GetPopup() const { return mPopup.get(); }

 protected:
  void CreateControlsSelf() override;
  void DestroyControlsSelf() override;
  void ShowControls(bool show) override;
  void UpdateControlsEnabled(bool enabled) override;

 private:
  std::shared_ptr<TextPopup> mPopup;
};
