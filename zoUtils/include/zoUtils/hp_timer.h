#pragma once
#include <cstdint>

#include "zoUtils/export.h"
#include "zoUtils/hp_time.h"

namespace norv {

// A stopwatch over HPTime: starts running when constructed. Thread-safety: one thread at a time.
class NORV_API HPTimer {
 public:
  HPTimer() { Start(); }
  // Restarts from zero.
  void Start() {
    start_ = HPTime::GetTickCount();
    stopped_ = -1;
  }
  // Freezes the elapsed time until the next Start.
  void Stop() { stopped_ = HPTime::GetTickCount(); }
  std::int64_t ElapsedTicks() const {
    return (stopped_ >= 0 ? stopped_ : HPTime::GetTickCount()) - start_;
  }
  double ElapsedSeconds() const {
    return static_cast<double>(ElapsedTicks()) / HPTime::kTicksPerSecond;
  }
  double ElapsedMilliSeconds() const { return ElapsedSeconds() * 1000.0; }

 private:
  std::int64_t start_ = 0;
  std::int64_t stopped_ = -1;
};

}  // namespace norv
