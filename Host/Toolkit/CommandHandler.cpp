#include "Host/Toolkit/CommandHandler.h"

#include <algorithm>

namespace {

// Registration order; entries become null when a handler leaves during a dispatch, so that a
// dispatch in progress never touches a destroyed handler.
std::vector<CommandHandler*>& Fallbacks() {
  static std::vector<CommandHandler*> fallbacks;
  return fallbacks;
}

int gDispatchDepth = 0;

void CompactFallbacks() {
  if (gDispatchDepth == 0) {
    std::erase(Fallbacks(), nullptr);
  }
}

// Walks the fallbacks registered when it started; ones added meanwhile wait for the next.
template <class Ask>
bool AskFallbacks(Ask ask) {
  std::vector<CommandHandler*>& fallbacks = Fallbacks();
  const std::size_t count = fallbacks.size();
  ++gDispatchDepth;
  bool answered = false;
  for (std::size_t i = 0; i < count && !answered; ++i) {
    if (CommandHandler* handler = fallbacks[i]) {
      answered = ask(*handler);
    }
  }
  --gDispatchDepth;
  CompactFallbacks();
  return answered;
}

}  // namespace

CommandHandler::~CommandHandler() {
  UnregisterFallbackHandler(*this);
}

bool CommandHandler::FindCommandStatus(CommandID, CommandStatus&) {
  return false;
}

bool CommandHandler::ObeyCommand(CommandID) {
  return false;
}

void CommandHandler::RegisterFallbackHandler(CommandHandler& handler) {
  if (!IsFallbackHandler(handler)) {
    Fallbacks().push_back(&handler);
  }
}

void CommandHandler::UnregisterFallbackHandler(CommandHandler& handler) {
  std::vector<CommandHandler*>& fallbacks = Fallbacks();
  std::replace(fallbacks.begin(), fallbacks.end(), &handler, static_cast<CommandHandler*>(nullptr));
  CompactFallbacks();
}

bool CommandHandler::IsFallbackHandler(const CommandHandler& handler) {
  const std::vector<CommandHandler*>& fallbacks = Fallbacks();
  return std::find(fallbacks.begin(), fallbacks.end(), &handler) != fallbacks.end();
}

bool CommandHandler::FindFallbackCommandStatus(CommandID command, CommandStatus& status) {
  return AskFallbacks(
      [&](CommandHandler& handler) { return handler.FindCommandStatus(command, status); });
}

bool CommandHandler::ObeyFallbackCommand(CommandID command) {
  return AskFallbacks([&](CommandHandler& handler) { return handler.ObeyCommand(command); });
}
