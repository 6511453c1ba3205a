#include "Host/Messaging/Listener.h"

#include "Host/Messaging/Station.h"

Listener::Listener() = default;

Listener::~Listener() {
  RemoveListenerFromAllStations(*this);
}
