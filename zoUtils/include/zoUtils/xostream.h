#pragma once
#include <cstddef>
#include <cstdint>

#include "zoUtils/export.h"
#include "zoUtils/xstring.h"

namespace norv {

// A text output stream for diagnostics and messages. Subclasses supply WriteRaw; xostream adds
// indentation: after every newline, the next character written is preceded by `indent()`
// spaces (see Indenter). Thread-safety: one thread at a time.
class NORV_API xostream {
 public:
  virtual ~xostream();

  void put(char c);
  void put(const char* text, std::size_t length);
  void put(const char* text);  // NUL-terminated; null prints "(null)"
  void put(int value);
  void put(unsigned value);
  void put(std::int64_t value);
  void put(std::uint64_t value);
  void put(double value);
  void put(const void* pointer);  // as 0x followed by hex digits

  int indent() const { return indent_; }
  void set_indent(int indent) { indent_ = indent < 0 ? 0 : indent; }

 protected:
  // Receives the text after indentation has been applied.
  virtual void WriteRaw(const char* text, std::size_t length) = 0;

 private:
  void PutIndentIfNeeded();

  int indent_ = 0;
  bool at_line_start_ = true;
};

inline xostream& operator<<(xostream& os, char c) {
  os.put(c);
  return os;
}
inline xostream& operator<<(xostream& os, const char* s) {
  os.put(s);
  return os;
}
inline xostream& operator<<(xostream& os, const xstring& s) {
  os.put(s.data(), s.size());
  return os;
}
inline xostream& operator<<(xostream& os, bool b) {
  os.put(b ? "true" : "false");
  return os;
}
inline xostream& operator<<(xostream& os, int v) {
  os.put(v);
  return os;
}
inline xostream& operator<<(xostream& os, unsigned v) {
  os.put(v);
  return os;
}
inline xostream& operator<<(xostream& os, long v) {
  os.put(static_cast<std::int64_t>(v));
  return os;
}
inline xostream& operator<<(xostream& os, unsigned long v) {
  os.put(static_cast<std::uint64_t>(v));
  return os;
}
inline xostream& operator<<(xostream& os, long long v) {
  os.put(static_cast<std::int64_t>(v));
  return os;
}
inline xostream& operator<<(xostream& os, unsigned long long v) {
  os.put(static_cast<std::uint64_t>(v));
  return os;
}
inline xostream& operator<<(xostream& os, double v) {
  os.put(v);
  return os;
}
inline xostream& operator<<(xostream& os, const void* p) {
  os.put(p);
  return os;
}

// Writes `value` as exactly 2 * numBytes upper-case hex digits, most significant first
// (WriteHex(os, 0x1a, 4) writes "0000001A"). Requires: 1 <= numBytes <= 8.
NORV_API void WriteHex(xostream& os, std::uint64_t value, int numBytes);
// Writes `size` bytes in memory order as pairs of hex digits, separated by `separator`
// unless it is '\0'.
NORV_API void WriteHexBytes(xostream& os, const void* data, std::size_t size, char separator = ' ');

}  // namespace norv
