#pragma once

#include <cstddef>
#include <memory>
#include <string>

class Listener;
class Message;

// Message channels named by strings, in one process-wide registry. Everything here is for the
// UI thread, except PostMessageToUIThread.
using StationName = std::string;

// False (and no change) if the station exists.
bool RegisterStation(const StationName& name);
// Registers and returns `base` when it is free, else `base + "#N"` with an N never handed out
// before for that base, so a message posted to a disposed station never reaches a newer one.
StationName RegisterUniqueStation(const StationName& base);
// Removes the station and all its listeners. Safe during a broadcast on it: the broadcast stops
// delivering. Disposing an absent station is a no-op.
void DisposeStation(const StationName& name);
bool StationExists(const StationName& name);

// Adding twice is a no-op. Adding to a station that does not exist registers it (model objects'
// stations may be listened to before their first broadcast). Removing an absent listener: no-op.
void AddListener(const StationName& station, Listener& listener);
void RemoveListener(const StationName& station, Listener& listener);
// Stops the listener listening on every station (what its destructor does).
void RemoveListenerFromAllStations(Listener& listener);
bool IsListening(const StationName& station, const Listener& listener);
// Live listeners of the station (0 when it does not exist).
std::size_t ListenerCount(const StationName& station);

// Delivers now, in the order listeners were added. A listener removed or destroyed during the
// broadcast gets nothing more; one added during it is not called for this message. Broadcasting
// to a station that does not exist does nothing. A NullInterfaceException thrown by a listener
// is caught here, recorded as a debug assertion, and delivery goes on to the next listener.
void BroadcastMessage(const StationName& station, const Message& message);

// Thread-safe; queues for the UI thread's MessageLoop. A null message is reported and dropped.
// If the station is gone when the loop delivers, the message is dropped.
void PostMessageToUIThread(const StationName& station, std::shared_ptr<const Message> message);

// Disposes every station and forgets the unique-name counters (tests; see MessagingTestScope).
void ResetStationsForTesting();
