#pragma once

#include <functional>
#include <string>
#include <utility>
#include <vector>

#include "Host/Messaging/Listener.h"
#include "Host/Messaging/Message.h"

struct PingMessage : MessageOf<PingMessage> {
  static constexpr std::string_view kTypeName = "PingMessage";
  explicit PingMessage(int v) : value(v) {}
  int value;
};

struct PongMessage : MessageOf<PongMessage> {
  static constexpr std::string_view kTypeName = "PongMessage";
  explicit PongMessage(std::string t) : text(std::move(t)) {}
  std::string text;
};

// Appends "name:value" to a shared log for each PingMessage, then runs an optional action.
class LoggingListener : public Listener {
 public:
  LoggingListener(std::string name, std::vector<std::string>& log,
                  std::function<void(const Message&)> action = {})
      : mName(std::move(name)), mLog(log), mAction(std::move(action)) {}

  void ListenToMessage(const Message& message) override {
    if (const auto* ping = message.As<PingMessage>()) {
      mLog.push_back(mName + ":" + std::to_string(ping->value));
    } else if (const auto* pong = message.As<PongMessage>()) {
      mLog.push_back(mName + ":" + pong->text);
    }
    if (mAction) {
      mAction(message);
    }
  }

  void SetAction(std::function<void(const Message&)> action) { mAction = std::move(action); }

 private:
  std::string mName;
  std::vector<std::string>& mLog;  // owned by the test
  std::function<void(const Message&)> mAction;
};
