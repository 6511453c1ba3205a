#pragma once

#include <functional>
#include <utility>

#include "Host/Messaging/Listener.h"
#include "Host/Messaging/Message.h"

// A listener that hands each message to a function; for objects that listen through a member
// rather than by deriving from Listener. Stops listening when destroyed, like any Listener.
class FunctionListener : public Listener {
 public:
  explicit FunctionListener(std::function<void(const Message&)> onMessage)
      : mOnMessage(std::move(onMessage)) {}

  void ListenToMessage(const Message& message) override {
    if (mOnMessage) {
      mOnMessage(message);
    }
  }

 private:
  std::function<void(const Message&)> mOnMessage;
};
