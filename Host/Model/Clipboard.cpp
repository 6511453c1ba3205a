#include "Host/Model/Clipboard.h"

#include <utility>

#include "Host/Model/ModelMessages.h"

Clipboard::Clipboard(StationName station) : mStation(std::move(station)) {}

void Clipboard::AddItem(std::shared_ptr<const ClipboardItem> item) {
  mItem = std::move(item);
  if (!mStation.empty()) {
    BroadcastMessage(mStation, ClipboardChangedMessage());
  }
}
