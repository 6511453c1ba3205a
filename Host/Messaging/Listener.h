#pragma once

#include <memory>
#include <vector>

class Message;
class StationCore;

// Receives the messages broadcast on the stations it was added to (see Station.h).
// Listening is tied to the object's lifetime: the destructor stops listening on every station,
// and that is safe even while one of those stations is delivering to this very listener.
// A derived class whose destructor could cause a broadcast to itself (it disposes an object it
// listens to, say) calls RemoveListenerFromAllStations first: by the time ~Listener runs, the
// derived ListenToMessage is gone. UI thread only.
class Listener {
 public:
  Listener();
  Listener(const Listener&) = delete;
  Listener& operator=(const Listener&) = delete;
  virtual ~Listener();

  // Called on the UI thread for each message of a station this listener is on. The listener may
  // add or remove listeners (itself included), broadcast, dispose stations or destroy listeners
  // (itself included, as long as it touches no member afterwards) from here.
  virtual void ListenToMessage(const Message& message) = 0;

 private:
  friend class StationCore;
  friend void RemoveListenerFromAllStations(Listener& listener);

  // The stations this listener is on; the registry owns them.
  std::vector<std::weak_ptr<StationCore>> mStations;
};
