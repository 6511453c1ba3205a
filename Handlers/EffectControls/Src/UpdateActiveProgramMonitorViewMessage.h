#pragma once

#include <string_view>

#include "Host/Messaging/Message.h"

// An edit changed what the program monitor shows (an effect switched, reset or given a preset);
// sent on the sequence's station so the monitor redraws its frame.
struct UpdateActiveProgramMonitorViewMessage : MessageOf<UpdateActiveProgramMonitorViewMessage> {
  static constexpr std::string_view kTypeName = "UpdateActiveProgramMonitorViewMessage";
};
