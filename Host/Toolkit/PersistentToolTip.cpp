#include "Host/Toolkit/PersistentToolTip.h"

#include <algorithm>

#include "Host/Messaging/Localization.h"
#include "Host/Toolkit/ColorManager.h"
#include "Host/Toolkit/DC.h"
#include "Host/Toolkit/Font.h"
#include "Host/Toolkit/SubView.h"

namespace {
constexpr int kPaddingX = 6;
constexpr int kPaddingY = 3;
}  // namespace

class PersistentToolTip::TipView : public SubView {
 public:
  explicit TipView(std::string text) : mText(std::move(text)) {}

  const std::string& GetText() const { return mText; }
  void SetText(std::string text) {
    mText = std::move(text);
    Invalidate();
  }
  Size PreferredSize() const {
    const Font font(kFont_Small);
    return {font.StringWidth(mText) + 2 * kPaddingX, font.GetHeight() + 2 * kPaddingY};
  }

  bool HitTestSelf(Point) const override { return false; }

  void PaintSelf(DC& dc) override {
    const Rect bounds = GetLocalBounds();
    dc.FillRect(bounds, ColorManager::GetColor(kColor_ToolTipBackground));
    dc.FrameRect(bounds, ColorManager::GetColor(kColor_ControlBorder));
    dc.DrawText(mText, bounds.Inset(kPaddingX, kPaddingY), Font(kFont_Small),
                ColorManager::GetColor(kColor_ToolTipText), TextAlign::kLeft, TextVAlign::kCenter);
  }

 private:
  std::string mText;
};

PersistentToolTip::PersistentToolTip(ViewBase& anchor, std::string text, Point windowPoint)
    : mView(std::make_shared<TipView>(LocalizeString(text))), mWindowPoint(windowPoint) {
  if (anchor.GetHost() == nullptr) {
    return;
  }
  anchor.GetRootView().AddChild(mView);
  Place();
}

PersistentToolTip::~PersistentToolTip() {
  mView->RemoveFromParent();
}

void PersistentToolTip::SetText(std::string text) {
  mView->SetText(LocalizeString(text));
  Place();
}

const std::string& PersistentToolTip::GetText() const {
  return mView->GetText();
}

void PersistentToolTip::MoveTo(Point windowPoint) {
  mWindowPoint = windowPoint;
  Place();
}

bool PersistentToolTip::IsShown() const {
  return mView->IsShown();
}

Rect PersistentToolTip::GetWindowBounds() const {
  return IsShown() ? mView->LocalToWindow(mView->GetLocalBounds()) : Rect{};
}

void PersistentToolTip::Place() {
  ViewBase* root = mView->GetParent();
  if (root == nullptr) {
    return;
  }
  const Size size = mView->PreferredSize();
  const Rect window = root->GetLocalBounds();
  const Point origin = root->WindowToLocal(mWindowPoint);
  int x = origin.x + kPointerOffset.x;
  int y = origin.y + kPointerOffset.y;
  // Beyond the right or bottom edge the tip goes to the other side of the pointer.
  if (x + size.width > window.right) {
    x = origin.x - kPointerOffset.x - size.width;
  }
  if (y + size.height > window.bottom) {
    y = origin.y - size.height - 4;
  }
  x = std::clamp(x, window.left, std::max(window.left, window.right - size.width));
  y = std::clamp(y, window.top, std::max(window.top, window.bottom - size.height));
  mView->SetBounds(Rect::FromSize(x, y, size.width, size.height));
}
