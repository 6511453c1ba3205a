#include "Host/Model/PlayerClock.h"

#include <chrono>

namespace {

class SteadyPlayerClock : public PlayerClock {
 public:
  TickTime Now() const override {
    const auto elapsed = std::chrono::steady_clock::now() - mOrigin;
    const auto microseconds =
        std::chrono::duration_cast<std::chrono::microseconds>(elapsed).count();
    // 254016 ticks per microsecond: a year of uptime still fits in 64 bits.
    return static_cast<TickTime>(microseconds) * (kTicksPerSecond / 1000000);
  }

 private:
  std::chrono::steady_clock::time_point mOrigin = std::chrono::steady_clock::now();
};

}  // namespace

std::shared_ptr<PlayerClock> PlayerClock::CreateSteadyClock() {
  return std::make_shared<SteadyPlayerClock>();
}
