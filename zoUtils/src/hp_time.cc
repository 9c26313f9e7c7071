#include "zoUtils/hp_time.h"

#include <chrono>

namespace norv {

std::int64_t HPTime::GetTickCount() {
  using Ticks = std::chrono::duration<std::int64_t, std::ratio<1, kTicksPerSecond>>;
  return std::chrono::duration_cast<Ticks>(std::chrono::steady_clock::now().time_since_epoch())
      .count();
}

}  // namespace norv
