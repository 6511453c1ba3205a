#include "Host/Messaging/Message.h"

#include <mutex>
#include <string>
#include <unordered_map>

#include "Host/Messaging/Diagnostics.h"

void NoteMessageTypeName(MessageID id, std::string_view typeName) {
  static std::mutex mutex;
  static std::unordered_map<MessageID, std::string> names;
  std::string clash;
  {
    const std::lock_guard lock(mutex);
    const auto [it, inserted] = names.try_emplace(id, typeName);
    if (!inserted && it->second != typeName) {
      clash = it->second;
    }
  }
  // Reported outside the lock; As<T>() still tells the two apart by name.
  HOST_ASSERT(clash.empty(),
              "Message type names share an id: " + clash + " and " + std::string(typeName));
}
