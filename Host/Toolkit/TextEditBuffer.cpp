#include "Host/Toolkit/TextEditBuffer.h"

#include <glib.h>
#include <pango/pango.h>

#include <algorithm>

#include "Host/Toolkit/ColorManager.h"
#include "Host/Toolkit/Font.h"
#include "Host/Toolkit/TextLayout.h"

namespace {

constexpr int kTextInset = 2;

bool IsContinuationByte(unsigned char c) {
  return (c & 0xC0) == 0x80;
}

// Well-formed UTF-8 only (no overlong forms, surrogates or NUL bytes), as the rest of the host
// stores and saves.
bool IsValidUTF8(std::string_view text) {
  return g_utf8_validate(text.data(), static_cast<gssize>(text.size()), nullptr);
}

// The cursor position of `text` nearest to `x` (pixels from the text's left), as Pango places
// cursors (between graphemes): one layout for the whole text, not a measurement per prefix.
std::size_t NearestCursorPosition(std::string_view text, int x, const Font& font) {
  if (text.empty()) {
    return 0;
  }
  const auto layout = font.GetLayout(text);
  PangoLayout* pango = layout->GetPangoLayout();
  constexpr int kFarthest = 1 << 20;  // Pango units are int: stay far from their limit
  int index = 0;
  int trailing = 0;
  pango_layout_xy_to_index(pango, std::clamp(x, -kFarthest, kFarthest) * PANGO_SCALE, 0, &index,
                           &trailing);
  const char* laidOut = pango_layout_get_text(pango);
  const char* position = g_utf8_offset_to_pointer(laidOut + index, trailing);
  // A long text is laid out cut short: a click past the cut lands at the cut.
  return std::min(static_cast<std::size_t>(position - laidOut), text.size());
}

}  // namespace

void TextEditBuffer::Reset(std::string text) {
  mText = IsValidUTF8(text) ? std::move(text) : std::string();
  mOriginal = mText;
  SelectAll();
}

void TextEditBuffer::SelectAll() {
  mAnchor = 0;
  mCaret = mText.size();
}

std::size_t TextEditBuffer::PreviousBoundary(std::size_t offset) const {
  if (offset == 0) {
    return 0;
  }
  --offset;
  while (offset > 0 && IsContinuationByte(static_cast<unsigned char>(mText[offset]))) {
    --offset;
  }
  return offset;
}

std::size_t TextEditBuffer::NextBoundary(std::size_t offset) const {
  if (offset >= mText.size()) {
    return mText.size();
  }
  ++offset;
  while (offset < mText.size() && IsContinuationByte(static_cast<unsigned char>(mText[offset]))) {
    ++offset;
  }
  return offset;
}

void TextEditBuffer::DeleteSelection() {
  const std::size_t start = GetSelectionStart();
  mText.erase(start, GetSelectionEnd() - start);
  mCaret = mAnchor = start;
}

bool TextEditBuffer::Insert(std::string_view utf8) {
  if (!IsValidUTF8(utf8)) {
    return false;
  }
  std::string clean;
  for (const char c : utf8) {
    if (static_cast<unsigned char>(c) >= 0x20 && c != 0x7F) {
      clean.push_back(c);
    }
  }
  DeleteSelection();
  mText.insert(mCaret, clean);
  mCaret += clean.size();
  mAnchor = mCaret;
  return true;
}

bool TextEditBuffer::HandleKey(const KeyEvent& event) {
  const bool shift = IsShiftDown(event.modifiers);
  switch (event.key) {
    case KeyCode::kLeft:
      if (HasSelection() && !shift) {
        mCaret = mAnchor = GetSelectionStart();
      } else {
        mCaret = PreviousBoundary(mCaret);
        if (!shift) {
          mAnchor = mCaret;
        }
      }
      return true;
    case KeyCode::kRight:
      if (HasSelection() && !shift) {
        mCaret = mAnchor = GetSelectionEnd();
      } else {
        mCaret = NextBoundary(mCaret);
        if (!shift) {
          mAnchor = mCaret;
        }
      }
      return true;
    case KeyCode::kHome:
      mCaret = 0;
      if (!shift) {
        mAnchor = mCaret;
      }
      return true;
    case KeyCode::kEnd:
      mCaret = mText.size();
      if (!shift) {
        mAnchor = mCaret;
      }
      return true;
    case KeyCode::kBackspace:
      if (!HasSelection()) {
        mAnchor = PreviousBoundary(mCaret);
      }
      DeleteSelection();
      return true;
    case KeyCode::kDelete:
      if (!HasSelection()) {
        mAnchor = NextBoundary(mCaret);
      }
      DeleteSelection();
      return true;
    case KeyCode::kA:
      if (IsCtrlDown(event.modifiers)) {
        SelectAll();
        return true;
      }
      return false;
    // Undo and redo belong to the field while it is edited: reaching the project's undo stack
    // they would take back an earlier edit the user is not looking at. Undo restores the text
    // the field started with; redo has nothing to redo.
    case KeyCode::kZ:
      if (IsCtrlDown(event.modifiers)) {
        if (!shift) {
          mText = mOriginal;
          SelectAll();
        }
        return true;
      }
      return false;
    case KeyCode::kY:
      return IsCtrlDown(event.modifiers);
    default:
      return false;
  }
}

int TextEditBuffer::TextLeft(const Rect& rect, const Font& font, TextAlign align) const {
  const int width = font.StringWidth(mText);
  const int room = rect.Width() - 2 * kTextInset;
  if (width > room) {
    // Too long: keep the caret in view, the text's end at the right edge otherwise.
    const int caretX = font.StringWidth(std::string_view(mText).substr(0, mCaret));
    const int left = rect.left + kTextInset - std::max(0, caretX - room);
    return std::min(left, rect.left + kTextInset);
  }
  switch (align) {
    case TextAlign::kCenter:
      return rect.left + kTextInset + (room - width) / 2;
    case TextAlign::kRight:
      return rect.right - kTextInset - width;
    case TextAlign::kLeft:
      break;
  }
  return rect.left + kTextInset;
}

void TextEditBuffer::SetCaretFromX(int x, const Font& font, bool extendSelection) {
  mCaret = NearestCursorPosition(mText, x, font);
  if (!extendSelection) {
    mAnchor = mCaret;
  }
}

void TextEditBuffer::Paint(DC& dc, const Rect& rect, const Font& font, TextAlign align) const {
  dc.FillRect(rect, ColorManager::GetColor(kColor_EditBackground));
  dc.FrameRect(rect, ColorManager::GetColor(kColor_Focus));
  const DC::ScopedClip clip(dc, rect.Inset(1, 1));
  const int left = TextLeft(rect, font, align);
  const int top = rect.top + (rect.Height() - font.GetHeight()) / 2;
  const std::string_view text(mText);
  if (HasSelection()) {
    const int x0 = left + font.StringWidth(text.substr(0, GetSelectionStart()));
    const int x1 = left + font.StringWidth(text.substr(0, GetSelectionEnd()));
    dc.FillRect(Rect{x0, top, x1, top + font.GetHeight()},
                ColorManager::GetColor(kColor_MenuHighlight));
  }
  dc.DrawTextAt(text, {left, top}, font, ColorManager::GetColor(kColor_EditText));
  const int caretX = left + font.StringWidth(text.substr(0, mCaret));
  dc.DrawLine({caretX, top}, {caretX, top + font.GetHeight()},
              ColorManager::GetColor(kColor_EditText));
}
