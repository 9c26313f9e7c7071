#include "zoUtils/xostream.h"

#include <cinttypes>
#include <cstdio>
#include <cstring>

namespace norv {

xostream::~xostream() = default;

void xostream::PutIndentIfNeeded() {
  if (!at_line_start_) return;
  at_line_start_ = false;
  static const char kSpaces[] = "                                ";  // 32
  int left = indent_;
  while (left > 0) {
    const int n = left < 32 ? left : 32;
    WriteRaw(kSpaces, static_cast<std::size_t>(n));
    left -= n;
  }
}

void xostream::put(const char* text, std::size_t length) {
  // Split at newlines so that every line but an empty one starts indented.
  std::size_t start = 0;
  for (std::size_t i = 0; i < length; ++i) {
    if (text[i] != '\n') continue;
    if (i > start) {
      PutIndentIfNeeded();
      WriteRaw(text + start, i - start);
    }
    WriteRaw("\n", 1);
    at_line_start_ = true;
    start = i + 1;
  }
  if (start < length) {
    PutIndentIfNeeded();
    WriteRaw(text + start, length - start);
  }
}

void xostream::put(char c) { put(&c, 1); }

void xostream::put(const char* text) {
  if (text == nullptr) text = "(null)";
  put(text, std::strlen(text));
}

namespace {
template <class... Args>
void PutFormatted(xostream& os, const char* format, Args... args) {
  char buf[64];
  const int n = std::snprintf(buf, sizeof buf, format, args...);
  if (n > 0) os.put(buf, static_cast<std::size_t>(n < 64 ? n : 63));
}
}  // namespace

void xostream::put(int value) { PutFormatted(*this, "%d", value); }
void xostream::put(unsigned value) { PutFormatted(*this, "%u", value); }
void xostream::put(std::int64_t value) { PutFormatted(*this, "%" PRId64, value); }
void xostream::put(std::uint64_t value) { PutFormatted(*this, "%" PRIu64, value); }
void xostream::put(double value) { PutFormatted(*this, "%.17g", value); }
void xostream::put(const void* pointer) {
  PutFormatted(*this, "0x%" PRIxPTR, reinterpret_cast<std::uintptr_t>(pointer));
}

void WriteHex(xostream& os, std::uint64_t value, int numBytes) {
  static const char kDigits[] = "0123456789ABCDEF";
  if (numBytes < 1) numBytes = 1;
  if (numBytes > 8) numBytes = 8;
  char buf[16];
  const int digits = numBytes * 2;
  for (int i = digits - 1; i >= 0; --i) {
    buf[i] = kDigits[value & 0xF];
    value >>= 4;
  }
  os.put(buf, static_cast<std::size_t>(digits));
}

void WriteHexBytes(xostream& os, const void* data, std::size_t size, char separator) {
  static const char kDigits[] = "0123456789abcdef";
  const auto* p = static_cast<const std::uint8_t*>(data);
  for (std::size_t i = 0; i < size; ++i) {
    if (i > 0 && separator != '\0') os.put(separator);
    const char pair[2] = {kDigits[p[i] >> 4], kDigits[p[i] & 0xF]};
    os.put(pair, 2);
  }
}

}  // namespace norv
