#pragma once
#include <cstdint>

#include "zoUtils/export.h"

namespace norv {

// The monotonic clock of the runtime.
class NORV_API HPTime {
 public:
  static constexpr std::int64_t kTicksPerSecond = 10'000'000;
  // 100 ns ticks of the steady clock since an arbitrary fixed origin. Thread-safety: any thread.
  static std::int64_t GetTickCount();
};

}  // namespace norv
