#pragma once

#include <cstddef>
#include <string>
#include <string_view>

#include "Host/Toolkit/DC.h"
#include "Host/Toolkit/Events.h"

class Font;

// The text of a one-line field while the user types in it: UTF-8 text, a caret and a selection
// (byte offsets that always fall on character boundaries). Hot-text controls hold one while
// editing. Keys: Left/Right (Shift extends), Home/End, Backspace, Delete, Ctrl+A; Ctrl+Z
// brings back the text given to Reset, and Ctrl+Z, Ctrl+Shift+Z and Ctrl+Y never leave the field.
class TextEditBuffer {
 public:
  // Replaces the text and selects all of it (typing then replaces it).
  void Reset(std::string text);
  const std::string& GetText() const { return mText; }
  std::size_t GetCaret() const { return mCaret; }
  std::size_t GetSelectionStart() const { return std::min(mAnchor, mCaret); }
  std::size_t GetSelectionEnd() const { return std::max(mAnchor, mCaret); }
  bool HasSelection() const { return mAnchor != mCaret; }

  // Typed text replaces the selection. Control characters are dropped; invalid UTF-8 is
  // refused (false, nothing changes).
  bool Insert(std::string_view utf8);
  // True when the key was an editing key (it may have changed nothing, e.g. Backspace at 0).
  bool HandleKey(const KeyEvent& event);
  void SelectAll();
  // Caret to the character boundary nearest to `x` (pixels from the text's left edge).
  void SetCaretFromX(int x, const Font& font, bool extendSelection);

  // Draws the field: edit background and focus frame over `rect`, the text aligned as given
  // (scrolled so the caret stays visible), the selection and the caret.
  void Paint(DC& dc, const Rect& rect, const Font& font, TextAlign align) const;
  // The x of the text's left edge inside `rect` for `align` (as Paint draws it).
  int TextLeft(const Rect& rect, const Font& font, TextAlign align) const;

 private:
  std::size_t PreviousBoundary(std::size_t offset) const;
  std::size_t NextBoundary(std::size_t offset) const;
  void DeleteSelection();

  std::string mText;
  std::string mOriginal;  // as given to Reset
  std::size_t mCaret = 0;
  std::size_t mAnchor = 0;  // the other end of the selection
};
