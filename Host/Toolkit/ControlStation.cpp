#include "Host/Toolkit/ControlStation.h"

#include <string>

ControlStation::ControlStation(std::string_view base)
    : mName(RegisterUniqueStation(std::string(base))) {}

ControlStation::~ControlStation() {
  DisposeStation(mName);
}

void ControlStation::Broadcast(const Message& message) const {
  BroadcastMessage(mName, message);
}
