#pragma once

#include <cstdint>
#include <string>

#include "Host/Toolkit/ButtonControl.h"
#include "Host/Toolkit/ControlStation.h"
#include "Host/Toolkit/Font.h"

// A check box with an optional label to its right. A click (or Space) flips the state and
// broadcasts CheckBoxControlChangedMessage (id, new state) on the box's station, then sends the
// command when one is set. SetChecked from code sends nothing.
class CheckBoxControl : public ButtonControl {
 public:
  static constexpr int kBoxSize = 13;

  // `label` may be a "$$$/" key. `id` travels in the message.
  CheckBoxControl(const Rect& bounds, std::int32_t id, std::string label = {}, bool checked = false,
                  Commander* commander = nullptr);

  const StationName& GetStation() const { return mStation.GetName(); }

  void SetChecked(bool checked);
  bool IsChecked() const { return mChecked; }
  std::int32_t GetControlID() const { return mID; }
  void SetLabel(std::string label);
  const std::string& GetLabel() const { return mLabel; }

  void PaintSelf(DC& dc) override;

 protected:
  bool ClickSelf(KeyModifiers modifiers) override;

 private:
  ControlStation mStation{"CheckBoxControl"};
  std::int32_t mID;
  std::string mLabel;
  bool mChecked;
};
