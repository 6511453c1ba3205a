#pragma once

#include <memory>

#include "Host/Messaging/Station.h"
#include "Host/Model/ClipboardItem.h"

// The project's clipboard: holds the item copied last. Items are immutable once added, so they
// are shared. Copying to the clipboard is not an edit and has no undo. ClipboardChangedMessage
// on the station given at construction (none when empty).
class Clipboard {
 public:
  explicit Clipboard(StationName station = {});

  // A null item clears the clipboard.
  void AddItem(std::shared_ptr<const ClipboardItem> item);
  const std::shared_ptr<const ClipboardItem>& GetItem() const { return mItem; }
  bool IsEmpty() const { return mItem == nullptr; }
  void Clear() { AddItem(nullptr); }

 private:
  StationName mStation;
  std::shared_ptr<const ClipboardItem> mItem;
};
