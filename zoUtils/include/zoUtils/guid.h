#pragma once
#include <cstdint>
#include <cstring>
#include <functional>

#include "zoUtils/export.h"
#include "zoUtils/xostream.h"
#include "zoUtils/xstring.h"

namespace norv {

// A 128-bit globally unique identifier: 16 bytes, compared and stored exactly as held in memory.
// Printed as 8-4-4-4-12 lower-case hex digits of the bytes in memory order.
struct NORV_API Guid {
  std::uint8_t bytes[16] = {};

  bool IsNull() const;
  xstring ToString() const;
  // Parses the printed form (36 characters, hex digits of either case). Returns false on
  // anything else and leaves `out` unchanged.
  static bool TryParse(const xstring& text, Guid& out);
  // As TryParse, but throws NorvSystemException naming the text.
  static Guid Parse(const xstring& text);

  friend bool operator==(const Guid& a, const Guid& b) {
    return std::memcmp(a.bytes, b.bytes, 16) == 0;
  }
  friend bool operator!=(const Guid& a, const Guid& b) { return !(a == b); }
  friend bool operator<(const Guid& a, const Guid& b) {
    return std::memcmp(a.bytes, b.bytes, 16) < 0;
  }
};

// A new random (version 4) GUID from the operating system's random source. Throws
// NorvSystemException if the source fails. Thread-safety: any thread.
NORV_API Guid CreateGuid();

NORV_API xostream& operator<<(xostream& os, const Guid& g);

}  // namespace norv

template <>
struct std::hash<norv::Guid> {
  std::size_t operator()(const norv::Guid& g) const noexcept {
    std::uint64_t a, b;
    std::memcpy(&a, g.bytes, 8);
    std::memcpy(&b, g.bytes + 8, 8);
    return static_cast<std::size_t>(a ^ (b * 0x9E3779B97F4A7C15ull));
  }
};
