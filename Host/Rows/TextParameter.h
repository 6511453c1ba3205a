#pragma once

#include <memory>
#include <string>

#include "Host/Rows/ParameterControl.h"

class TextButton;

// The row of a text parameter: the text in the value column, on a button that asks for a new
// text (an input box) and sets it at the edit time as one undoable step. `editable` false (a
// template whose texts are locked) shows the text without letting it change.
class TextParameter : public ParameterControl {
 public:
  static constexpr CommandID kEditTextCommand = 17902;

  TextParameter(const ParameterControlInfo& info, bool editable = true);

  void PositionSelf(int top, int depth, int width) override;
  void SynchToCurrentTime() override;
  bool FindCommandStatus(CommandID command, CommandStatus& status) override;
  bool ObeyCommand(CommandID command) override;

  bool IsEditable() const { return mEditable && !IsReadOnly() && IsParamEnabled(); }
  // The text at the edit time.
  std::string GetText() const;
  TextButton* GetButton() const { return mButton.get(); }

 protected:
  void CreateControlsSelf() override;
  void DestroyControlsSelf() override;
  void ShowControls(bool show) override;
  void UpdateControlsEnabled(bool enabled) override;

 private:
  std::shared_ptr<TextButton> mButton;
  bool mEditable;
};
