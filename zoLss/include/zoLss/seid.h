#pragma once
// Serial element ids of the log-structured store.
#include <cstdint>
#include <functional>

#include "zoUtils/export.h"
#include "zoUtils/xostream.h"

namespace norv {

using SeidHigh = std::uint32_t;
using SeidLow = std::uint32_t;

// A serial element id: high part in the upper 32 bits, low part in the lower 32 bits.
// The value 0 is the null id. Plain value type; thread-safe as any int.
class Seid {
 public:
  constexpr Seid() = default;
  constexpr Seid(SeidHigh high, SeidLow low)
      : value_((static_cast<std::uint64_t>(high) << 32) | low) {}
  static constexpr Seid FromValue(std::uint64_t v) {
    Seid s;
    s.value_ = v;
    return s;
  }
  constexpr SeidHigh GetHigh() const { return static_cast<SeidHigh>(value_ >> 32); }
  constexpr SeidLow GetLow() const { return static_cast<SeidLow>(value_); }
  constexpr std::uint64_t GetValue() const { return value_; }
  constexpr bool IsNull() const { return value_ == 0; }
  friend constexpr bool operator==(Seid a, Seid b) { return a.value_ == b.value_; }
  friend constexpr bool operator!=(Seid a, Seid b) { return a.value_ != b.value_; }
  friend constexpr bool operator<(Seid a, Seid b) { return a.value_ < b.value_; }

 private:
  std::uint64_t value_ = 0;
};

// Prints "(high,low)" in decimal, e.g. "(1,0)".
NORV_API xostream& operator<<(xostream& os, Seid seid);

}  // namespace norv

template <>
struct std::hash<norv::Seid> {
  std::size_t operator()(norv::Seid s) const noexcept {
    return std::hash<std::uint64_t>()(s.GetValue());
  }
};
