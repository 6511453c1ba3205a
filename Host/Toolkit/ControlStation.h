#pragma once

#include <string_view>

#include "Host/Messaging/Station.h"

class Message;

// The message station of one control: registered under a unique name at construction and
// disposed with the control, so listeners never outlive what they listen to. Broadcasting is
// synchronous; a listener may destroy the control from its handler (the station's disposal is
// safe during its own broadcast). UI thread only.
class ControlStation {
 public:
  // `base`: the control's kind, e.g. "HotFloatControl"; the name is base or base + "#N".
  explicit ControlStation(std::string_view base);
  ~ControlStation();
  ControlStation(const ControlStation&) = delete;
  ControlStation& operator=(const ControlStation&) = delete;

  const StationName& GetName() const { return mName; }
  void Broadcast(const Message& message) const;

 private:
  StationName mName;
};
