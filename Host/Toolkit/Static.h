#pragma once

#include <string>
#include <string_view>

#include "Host/Toolkit/DC.h"
#include "Host/Toolkit/Font.h"
#include "Host/Toolkit/SubView.h"

// A line of text that takes no input: labels beside controls, a row title, a value shown as
// text. Text wider than the view is shortened with an ellipsis. Disabled labels draw in the
// disabled text colour.
class Static : public SubView {
 public:
  // `text` may be a "$$$/" key; it is localised here and in SetText.
  explicit Static(const Rect& bounds, std::string text = {}, TextAlign align = TextAlign::kLeft,
                  Font font = Font(kFont_Normal));

  void SetText(std::string text);
  const std::string& GetText() const { return mText; }
  void SetAlignment(TextAlign align);
  TextAlign GetAlignment() const { return mAlign; }
  void SetFont(Font font);
  const Font& GetFont() const { return mFont; }
  // A ColorManager key; the default is the control text colour.
  void SetColorKey(std::string colorKey);
  // Filled behind the text when set (a ColorManager key); none by default.
  void SetBackgroundColorKey(std::string colorKey);

  bool HitTestSelf(Point point) const override;
  void PaintSelf(DC& dc) override;

 private:
  std::string mText;
  TextAlign mAlign;
  Font mFont;
  std::string mColorKey;
  std::string mBackgroundKey;
};
