#include "Host/Messaging/Station.h"

#include <algorithm>
#include <string>
#include <unordered_map>
#include <vector>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Messaging/Listener.h"
#include "Host/Messaging/Message.h"
#include "Host/Messaging/MessageLoop.h"

// One station's listeners. Delivery walks the vector by index; removal leaves a null in place and
// the vector is compacted only when no delivery is running, so indices stay valid while listeners
// come and go, and a broadcast keeps the station alive by holding a shared_ptr to it.
class StationCore : public std::enable_shared_from_this<StationCore> {
 public:
  bool Contains(const Listener& listener) const {
    return std::find(mListeners.begin(), mListeners.end(), &listener) != mListeners.end();
  }

  std::size_t LiveCount() const {
    return static_cast<std::size_t>(
        std::count_if(mListeners.begin(), mListeners.end(), [](Listener* l) { return l; }));
  }

  void Add(Listener& listener) {
    if (mDisposed || Contains(listener)) {
      return;
    }
    mListeners.push_back(&listener);
    auto& stations = listener.mStations;
    std::erase_if(stations, [](const std::weak_ptr<StationCore>& s) { return s.expired(); });
    stations.push_back(weak_from_this());
  }

  void Remove(Listener& listener) {
    const auto it = std::find(mListeners.begin(), mListeners.end(), &listener);
    if (it == mListeners.end()) {
      return;
    }
    *it = nullptr;
    mHasHoles = true;
    ForgetStationOf(listener);
    CompactIfIdle();
  }

  void Dispose() {
    mDisposed = true;
    for (Listener*& listener : mListeners) {
      if (listener != nullptr) {
        ForgetStationOf(*listener);
        listener = nullptr;
        mHasHoles = true;
      }
    }
    CompactIfIdle();
  }

  void Deliver(const Message& message) {
    // Keeps this station alive if it is disposed by a listener.
    const std::shared_ptr<StationCore> keepAlive = shared_from_this();
    const std::size_t count = mListeners.size();  // listeners added from here on wait for the next
    ++mDeliveryDepth;
    struct DepthGuard {
      StationCore& core;
      ~DepthGuard() {
        --core.mDeliveryDepth;
        core.CompactIfIdle();
      }
    } guard{*this};
    for (std::size_t i = 0; i < count && i < mListeners.size(); ++i) {
      Listener* const listener = mListeners[i];
      if (listener == nullptr) {
        continue;
      }
      try {
        listener->ListenToMessage(message);
      } catch (const NullInterfaceException& exception) {
        ReportNullInterface(exception, message.GetTypeName());
      }
    }
  }

 private:
  void ForgetStationOf(Listener& listener) {
    std::erase_if(listener.mStations, [this](const std::weak_ptr<StationCore>& s) {
      const auto station = s.lock();
      return station == nullptr || station.get() == this;
    });
  }

  void CompactIfIdle() {
    if (mDeliveryDepth == 0 && mHasHoles) {
      std::erase(mListeners, nullptr);
      mHasHoles = false;
    }
  }

  std::vector<Listener*> mListeners;  // in the order added; null where removed mid-delivery
  int mDeliveryDepth = 0;             // nested broadcasts on this station
  bool mHasHoles = false;
  bool mDisposed = false;
};

namespace {

struct Registry {
  std::unordered_map<StationName, std::shared_ptr<StationCore>> stations;
  std::unordered_map<StationName, unsigned> nextUniqueSuffix;
};

Registry& GetRegistry() {
  static Registry registry;
  return registry;
}

std::shared_ptr<StationCore> FindStation(const StationName& name) {
  auto& stations = GetRegistry().stations;
  const auto it = stations.find(name);
  return it == stations.end() ? nullptr : it->second;
}

std::shared_ptr<StationCore> FindOrRegisterStation(const StationName& name) {
  auto& slot = GetRegistry().stations[name];
  if (slot == nullptr) {
    slot = std::make_shared<StationCore>();
  }
  return slot;
}

}  // namespace

bool RegisterStation(const StationName& name) {
  auto& stations = GetRegistry().stations;
  if (stations.contains(name)) {
    return false;
  }
  stations.emplace(name, std::make_shared<StationCore>());
  return true;
}

StationName RegisterUniqueStation(const StationName& base) {
  if (RegisterStation(base)) {
    return base;
  }
  unsigned& suffix = GetRegistry().nextUniqueSuffix[base];
  for (;;) {
    StationName candidate = base + "#" + std::to_string(++suffix);
    if (RegisterStation(candidate)) {
      return candidate;
    }
  }
}

void DisposeStation(const StationName& name) {
  auto& stations = GetRegistry().stations;
  const auto it = stations.find(name);
  if (it == stations.end()) {
    return;
  }
  // Out of the registry first: a listener reacting to disposal may register the name again.
  const std::shared_ptr<StationCore> core = std::move(it->second);
  stations.erase(it);
  core->Dispose();
}

bool StationExists(const StationName& name) {
  return GetRegistry().stations.contains(name);
}

void AddListener(const StationName& station, Listener& listener) {
  FindOrRegisterStation(station)->Add(listener);
}

void RemoveListener(const StationName& station, Listener& listener) {
  if (const auto core = FindStation(station)) {
    core->Remove(listener);
  }
}

void RemoveListenerFromAllStations(Listener& listener) {
  // Remove() edits listener.mStations, so work on a copy.
  const auto stations = listener.mStations;
  for (const auto& weak : stations) {
    if (const auto core = weak.lock()) {
      core->Remove(listener);
    }
  }
  listener.mStations.clear();
}

bool IsListening(const StationName& station, const Listener& listener) {
  const auto core = FindStation(station);
  return core != nullptr && core->Contains(listener);
}

std::size_t ListenerCount(const StationName& station) {
  const auto core = FindStation(station);
  return core == nullptr ? 0 : core->LiveCount();
}

void BroadcastMessage(const StationName& station, const Message& message) {
  if (const auto core = FindStation(station)) {
    core->Deliver(message);
  }
}

void PostMessageToUIThread(const StationName& station, std::shared_ptr<const Message> message) {
  MessageLoop::Instance().Post(station, std::move(message));
}

void ResetStationsForTesting() {
  auto& registry = GetRegistry();
  auto stations = std::move(registry.stations);
  registry.stations.clear();
  registry.nextUniqueSuffix.clear();
  for (auto& [name, core] : stations) {
    core->Dispose();
  }
}
