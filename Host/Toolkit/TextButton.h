#pragma once

#include <string>

#include "Host/Toolkit/ButtonControl.h"
#include "Host/Toolkit/Font.h"

// A framed push button with a text label ("Custom...", "Edit...", a button parameter's name)
// that sends its command when clicked.
class TextButton : public ButtonControl {
 public:
  // `label` may be a "$$$/" key; it is localised once, here and in SetLabel.
  TextButton(const Rect& bounds, std::string label, CommandID command,
             Commander* commander = nullptr, Font font = Font(kFont_Normal));

  void SetLabel(std::string label);
  const std::string& GetLabel() const { return mLabel; }
  const Font& GetFont() const { return mFont; }
  // The label's width in the button's font, without padding.
  int GetLabelWidth() const { return mFont.StringWidth(mLabel); }

  void PaintSelf(DC& dc) override;

 private:
  std::string mLabel;
  Font mFont;
};
