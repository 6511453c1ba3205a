#pragma once

#include <cstdint>
#include <string>
#include <string_view>

#include "Host/Toolkit/ControlStation.h"
#include "Host/Toolkit/Font.h"
#include "Host/Toolkit/SubView.h"
#include "Host/Toolkit/TextEditBuffer.h"

class Message;

// "Hot text": a value shown as blue text that the user scrubs by dragging horizontally and
// types into after a click. The base runs the gestures; subclasses say what the text is and
// what scrubbing and typing do to their value.
//
// Gestures: a press followed by a horizontal move of kDragThreshold pixels or more scrubs;
// every pixel from the press is one unit, ten with Shift held, a tenth with Ctrl held (changing
// the modifiers mid-drag does not jump). A press released without scrubbing starts typing: the
// control takes the focus and selects its text; Enter (or Tab) applies it, Escape leaves the
// value as it was, and so does text the control cannot read. Losing the focus applies the text
// on the next idle turn of the message loop; going away (CommitPendingInput, or at the latest
// Destroy) applies it at once, so typed text is only ever dropped by Escape. While focused and not
// typing, Up and Down step the value by one unit (Shift: ten), Enter starts typing, and typed
// characters start typing. Disabled controls take no input. UI thread only.
class HotTextControl : public SubView {
 public:
  static constexpr int kDragThreshold = 3;
  static constexpr double kCoarseFactor = 10.0;  // Shift
  static constexpr double kFineFactor = 0.1;     // Ctrl

  ~HotTextControl() override;

  // Messages go out here (see ControlMessages.h).
  const StationName& GetStation() const { return mStation.GetName(); }
  const StationName& GetStationID() const { return GetStation(); }
  // The owner's number for this control, sent with every message.
  void SetOwnerCookie(std::int32_t cookie) { mCookie = cookie; }
  std::int32_t GetOwnerCookie() const { return mCookie; }

  // 0 left, 1 centre, 2 right (other values count as centre). The default is centre.
  void SetHorizontalTextAlignment(int alignment);
  int GetHorizontalTextAlignment() const;
  void SetFont(Font font);
  const Font& GetFont() const { return mFont; }

  // The text shown while not typing.
  virtual std::string GetDisplayText() const = 0;

  bool IsScrubbing() const { return mScrubbing; }
  bool IsEditing() const { return mEditing; }
  const TextEditBuffer& GetEditBuffer() const { return mEdit; }
  // Starts typing as a click does; false when the control is disabled or hidden.
  bool BeginEditing();
  // Applies the typed text; unreadable text ends typing with the value unchanged (false).
  bool CommitEditing();
  void CancelEditing();
  void CommitPendingInput() override;

  void LeftButtonDownSelf(Point point, KeyModifiers modifiers) override;
  void LeftButtonMultiClickSelf(Point point, KeyModifiers modifiers, int clickCount) override;
  void MouseMoveSelf(Point point, KeyModifiers modifiers) override;
  void LeftButtonUpSelf(Point point, KeyModifiers modifiers) override;
  bool SetCursorSelf(Point point, KeyModifiers modifiers) override;
  bool KeyDownSelf(const KeyEvent& event) override;
  bool TextInputSelf(std::string_view utf8) override;
  void NowOffDuty() override;
  void HideSelf() override;
  void DestroySelf() override;
  void PaintSelf(DC& dc) override;

 protected:
  HotTextControl(std::string_view stationBase, Commander* commander);

  void Broadcast(const Message& message) const { mStation.Broadcast(message); }

  // The text typing starts with; the default is the display text.
  virtual std::string InitialEditTextSelf() const { return GetDisplayText(); }
  // Reads and applies typed text (reporting the change); false when it cannot be read.
  virtual bool CommitTextSelf(std::string_view text) = 0;
  // A scrub begins (the threshold was crossed); remember the value to scrub from.
  virtual void BeginScrubSelf() = 0;
  // `units` from the press, scaled by the modifiers; report changing values.
  virtual void ScrubSelf(double units) = 0;
  // The button was released after a scrub; report the final value if anything changed.
  virtual void EndScrubSelf() = 0;
  // Up or Down while focused: +-1 unit (+-10 with Shift) as one finished change.
  virtual void StepSelf(double units) = 0;

 private:
  static double FactorFor(KeyModifiers modifiers);
  TextAlign Alignment() const;
  Rect TextRect() const;

  ControlStation mStation;
  std::int32_t mCookie = 0;
  int mAlignment = 1;
  Font mFont{kFont_Normal};
  TextEditBuffer mEdit;
  bool mEditing = false;
  bool mPressed = false;
  bool mScrubbing = false;
  Point mPressPoint;
  int mLastX = 0;
  double mUnits = 0.0;
};
