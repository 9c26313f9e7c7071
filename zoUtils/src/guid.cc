#include "zoUtils/guid.h"

#include <sys/random.h>

#include <cerrno>
#include <cstring>

#include "zoUtils/norv_system_exception.h"
#include "zoUtils/string_stream.h"

namespace norv {

namespace {
// Byte offsets at which the printed form has a dash before the byte.
inline bool DashBefore(int i) { return i == 4 || i == 6 || i == 8 || i == 10; }

int HexValue(char c) {
  if (c >= '0' && c <= '9') return c - '0';
  if (c >= 'a' && c <= 'f') return c - 'a' + 10;
  if (c >= 'A' && c <= 'F') return c - 'A' + 10;
  return -1;
}
}  // namespace

bool Guid::IsNull() const {
  static const Guid kNull;
  return *this == kNull;
}

xstring Guid::ToString() const {
  static const char kDigits[] = "0123456789abcdef";
  xstring s;
  s.reserve(36);
  for (int i = 0; i < 16; ++i) {
    if (DashBefore(i)) s.push_back('-');
    s.push_back(kDigits[bytes[i] >> 4]);
    s.push_back(kDigits[bytes[i] & 0xF]);
  }
  return s;
}

bool Guid::TryParse(const xstring& text, Guid& out) {
  if (text.size() != 36) return false;
  Guid g;
  std::size_t pos = 0;
  for (int i = 0; i < 16; ++i) {
    if (DashBefore(i)) {
      if (text[pos] != '-') return false;
      ++pos;
    }
    const int hi = HexValue(text[pos]);
    const int lo = HexValue(text[pos + 1]);
    if (hi < 0 || lo < 0) return false;
    g.bytes[i] = static_cast<std::uint8_t>(hi << 4 | lo);
    pos += 2;
  }
  out = g;
  return true;
}

Guid Guid::Parse(const xstring& text) {
  Guid g;
  if (!TryParse(text, g)) {
    throw NorvSystemException("Not a GUID: \"" + text +
                              "\" (expected 8-4-4-4-12 hexadecimal digits)");
  }
  return g;
}

Guid CreateGuid() {
  Guid g;
  std::size_t got = 0;
  while (got < sizeof g.bytes) {
    const ssize_t n = getrandom(g.bytes + got, sizeof g.bytes - got, 0);
    if (n < 0) {
      if (errno == EINTR) continue;
      throw NorvSystemException(xstring("CreateGuid: the system random source failed: ") +
                                std::strerror(errno));
    }
    got += static_cast<std::size_t>(n);
  }
  g.bytes[6] = static_cast<std::uint8_t>((g.bytes[6] & 0x0F) | 0x40);  // version 4
  g.bytes[8] = static_cast<std::uint8_t>((g.bytes[8] & 0x3F) | 0x80);  // RFC 4122 variant
  return g;
}

xostream& operator<<(xostream& os, const Guid& g) { return os << g.ToString(); }

}  // namespace norv
