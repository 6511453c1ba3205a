#pragma once

#include <algorithm>
#include <string>
#include <string_view>
#include <vector>

#include "Host/Messaging/Listener.h"
#include "Host/Messaging/Message.h"
#include "Host/Messaging/Station.h"

// Records the type names of the messages of the stations it listens on, in order.
class MessageRecorder : public Listener {
 public:
  void Listen(const StationName& station) { AddListener(station, *this); }
  void ListenToMessage(const Message& message) override {
    names.emplace_back(message.GetTypeName());
  }
  int Count(std::string_view typeName) const {
    int count = 0;
    for (const std::string& name : names) {
      count += name == typeName ? 1 : 0;
    }
    return count;
  }
  // The names as a sorted multiset, for comparing an edit's messages with its undo's.
  std::vector<std::string> Sorted() const {
    std::vector<std::string> sorted = names;
    std::sort(sorted.begin(), sorted.end());
    return sorted;
  }
  void Clear() { names.clear(); }

  std::vector<std::string> names;
};
