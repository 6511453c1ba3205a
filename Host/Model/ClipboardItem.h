#pragma once

#include <string_view>

// Something copied: effects, keyframes. Each kind of item derives from this and names its kind;
// readers ask the clipboard's item for the kind they can paste (dynamic_cast after the name).
class ClipboardItem {
 public:
  ClipboardItem() = default;
  ClipboardItem(const ClipboardItem&) = delete;
  ClipboardItem& operator=(const ClipboardItem&) = delete;
  virtual ~ClipboardItem() = default;

  virtual std::string_view GetKind() const = 0;
};
