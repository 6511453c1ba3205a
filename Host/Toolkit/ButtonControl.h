#pragma once

#include <cstdint>
#include <memory>
#include <string>

#include "Host/Toolkit/CommandStatus.h"
#include "Host/Toolkit/SubView.h"

class DC;

// What every push button shares: it looks pressed while the left button is held over it,
// clicks on release inside it (or on Space and Return while it has the focus), and then sends
// its command from itself up the commander chain. The chain starts at the button's super
// commander, the `commander` given at construction (its parent view when null), so a row that
// is no view can receive its buttons' commands. Resting over the button shows its tool tip.
// Buttons take the focus on click unless SetTakesFocusOnClick(false) ("no focus"). UI thread only.
class ButtonControl : public SubView {
 public:
  ~ButtonControl() override;

  void SetCommand(CommandID command) { mCommand = command; }
  CommandID GetCommand() const { return mCommand; }

  // True while the left button is held down over the button.
  bool IsPressed() const { return mTracking && mInside; }
  bool IsHovered() const { return mHovered; }

  // Clicks as the user would; nothing when the button is disabled or hidden. True when the
  // command was handled.
  bool Click(KeyModifiers modifiers = kKeyModifierNone);

  void LeftButtonDownSelf(Point point, KeyModifiers modifiers) override;
  void LeftButtonUpSelf(Point point, KeyModifiers modifiers) override;
  void MouseMoveSelf(Point point, KeyModifiers modifiers) override;
  void MouseLeaveSelf() override;
  void HideSelf() override;
  void DestroySelf() override;
  bool KeyDownSelf(const KeyEvent& event) override;

 protected:
  ButtonControl(CommandID command, Commander* commander);

  // What a click does; the default sends the command. True when someone handled it.
  virtual bool ClickSelf(KeyModifiers modifiers);
  // Sends the command from this button up the chain; false when nobody handled it (or there is
  // no command).
  bool SendCommand();

  // The face under the picture or label: pressed, hovered or plain, with a 1-pixel border when
  // `framed`.
  void PaintFace(DC& dc, const Rect& rect, bool framed) const;

 private:
  CommandID mCommand = kNoCommand;
  bool mTracking = false;  // the left button went down on the button
  bool mInside = false;    // the pointer is over the button while tracking
  bool mHovered = false;
};
