#include "Host/Shell/Sdl/SdlInputBox.h"

#include "Host/Shell/Sdl/SdlModal.h"
#include "Host/Shell/Sdl/SdlWindow.h"
#include "Host/Toolkit/DC.h"
#include "Host/Toolkit/Font.h"

namespace {

constexpr Color kBackground(50, 50, 50);
constexpr Color kBorder(100, 100, 100);
constexpr Color kFieldBackground(30, 30, 30);
constexpr Color kFieldBorder(60, 110, 200);
constexpr Color kText(225, 225, 225);
constexpr Color kButton(70, 70, 70);

class InputBoxModal : public SdlModal {
 public:
  explicit InputBoxModal(const InputBoxRequest& request)
      : mRequest(request), mText(request.initialText) {}

  std::optional<std::string> GetResult() const { return mResult; }

  Rect GetBounds(Size windowSize) const override {
    const Size box = SdlInputBox::kBoxSize;
    return Rect::FromSize(std::max(0, (windowSize.width - box.width) / 2),
                          std::max(0, (windowSize.height - box.height) / 3), box.width, box.height);
  }

  void Paint(DC& dc) override {
    const Size box = SdlInputBox::kBoxSize;
    const Rect all = Rect::FromSize(0, 0, box.width, box.height);
    dc.FillRect(all, kBackground);
    dc.FrameRect(all, kBorder);
    dc.DrawText(mRequest.title, {12, 8, box.width - 12, 26}, Font(kFont_Bold), kText);
    dc.DrawText(mRequest.prompt, {12, 32, box.width - 12, 48}, Font(kFont_Normal), kText);
    const Rect field = FieldRect();
    dc.FillRect(field, kFieldBackground);
    dc.FrameRect(field, kFieldBorder);
    const Font font(kFont_Normal);
    // The end of a long text stays in view, with the caret after it.
    const int room = field.Width() - 10;
    const int width = font.StringWidth(mText);
    const int left = field.left + 5 - std::max(0, width - room);
    {
      DC::ScopedClip clip(dc, field.Inset(2, 2));
      dc.DrawTextAt(mText, {left, field.top + 4}, font, kText);
      dc.FillRect({left + width + 1, field.top + 4, left + width + 2, field.bottom - 4}, kText);
    }
    for (const auto& [rect, label] :
         {std::pair{OkRect(), "OK"}, std::pair{CancelRect(), "Cancel"}}) {
      dc.FillRect(rect, kButton);
      dc.FrameRect(rect, kBorder);
      dc.DrawText(label, rect, font, kText, TextAlign::kCenter, TextVAlign::kCenter);
    }
  }

  void MouseUp(MouseButton button, Point point) override {
    if (button != MouseButton::kLeft)
      return;
    const Point local = point - mOrigin;
    if (OkRect().Contains(local)) {
      mResult = mText;
      mDone = true;
    } else if (CancelRect().Contains(local)) {
      mDone = true;
    }
  }

  void KeyDown(const KeyEvent& event) override {
    switch (event.key) {
      case KeyCode::kReturn:
        mResult = mText;
        mDone = true;
        break;
      case KeyCode::kEscape:
        mDone = true;
        break;
      case KeyCode::kBackspace:
        // Remove one whole UTF-8 character.
        while (!mText.empty()) {
          const auto byte = static_cast<unsigned char>(mText.back());
          mText.pop_back();
          if ((byte & 0xC0) != 0x80)
            break;
        }
        break;
      default:
        break;
    }
  }

  void TextInput(std::string_view utf8) override { mText.append(utf8); }

  bool IsDone() const override { return mDone; }

  void SetOrigin(Point origin) { mOrigin = origin; }

 private:
  static Rect FieldRect() { return {12, 54, SdlInputBox::kBoxSize.width - 12, 78}; }
  static Rect OkRect() {
    const Size box = SdlInputBox::kBoxSize;
    return Rect::FromSize(box.width - 180, box.height - 36, 80, 24);
  }
  static Rect CancelRect() {
    const Size box = SdlInputBox::kBoxSize;
    return Rect::FromSize(box.width - 92, box.height - 36, 80, 24);
  }

  InputBoxRequest mRequest;
  std::string mText;
  Point mOrigin;
  std::optional<std::string> mResult;
  bool mDone = false;
};

}  // namespace

std::optional<std::string> SdlInputBox::Answer(const InputBoxRequest& request) {
  InputBoxModal modal(request);
  modal.SetOrigin(modal.GetBounds(mWindow.GetSize()).TopLeft());
  if (!mWindow.RunModal(modal))
    return std::nullopt;
  return modal.GetResult();
}
