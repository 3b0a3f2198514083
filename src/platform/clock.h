#pragma once

#include <chrono>

namespace kestrune::platform {

// Time for waits that must end: real on the system, virtual in tests.
class Clock {
 public:
  virtual ~Clock() = default;
  virtual std::chrono::steady_clock::time_point Now() const = 0;
  virtual void Pause(std::chrono::milliseconds duration) = 0;
};

Clock& SystemClock();

}  // namespace kestrune::platform
