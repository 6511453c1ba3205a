#pragma once

#include <vector>

#include "Host/Toolkit/CommandStatus.h"

// Something that answers commands by numeric id. Commanders (views, the view host) form chains
// of handlers; objects outside every chain (the application's panel handlers) register as
// fallbacks and are asked after a whole chain declined. UI thread only.
class CommandHandler {
 public:
  CommandHandler() = default;
  CommandHandler(const CommandHandler&) = delete;
  CommandHandler& operator=(const CommandHandler&) = delete;
  // Unregisters itself as a fallback, also while a dispatch is asking the fallbacks.
  virtual ~CommandHandler();

  // True when this handler knows `command`; it then fills `status` and the question stops
  // here. False passes the question on. The base knows no command.
  virtual bool FindCommandStatus(CommandID command, CommandStatus& status);
  // True when handled; false passes the command on. The base handles nothing.
  virtual bool ObeyCommand(CommandID command);

  // Fallbacks are asked in registration order. Registering twice is a no-op.
  static void RegisterFallbackHandler(CommandHandler& handler);
  static void UnregisterFallbackHandler(CommandHandler& handler);
  static bool IsFallbackHandler(const CommandHandler& handler);

  // Asks the registered fallbacks (each one alive at its turn). True when one answered.
  static bool FindFallbackCommandStatus(CommandID command, CommandStatus& status);
  static bool ObeyFallbackCommand(CommandID command);
};
