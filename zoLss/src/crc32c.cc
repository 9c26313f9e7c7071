#include "crc32c.h"

namespace norv {
namespace {
struct Table {
  std::uint32_t t[8][256];
  Table() {
    for (std::uint32_t i = 0; i < 256; ++i) {
      std::uint32_t c = i;
      for (int k = 0; k < 8; ++k) c = (c & 1) ? (c >> 1) ^ 0x82F63B78u : c >> 1;
      t[0][i] = c;
    }
    for (int j = 1; j < 8; ++j)
      for (int i = 0; i < 256; ++i) t[j][i] = (t[j - 1][i] >> 8) ^ t[0][t[j - 1][i] & 0xFF];
  }
};
const Table kTable;
}  // namespace

std::uint32_t Crc32c(const void* data, std::size_t size, std::uint32_t crc) {
  const unsigned char* p = static_cast<const unsigned char*>(data);
  std::uint32_t c = ~crc;
  while (size >= 8) {
    std::uint32_t lo = c ^ (p[0] | p[1] << 8 | p[2] << 16 | static_cast<std::uint32_t>(p[3]) << 24);
    c = kTable.t[7][lo & 0xFF] ^ kTable.t[6][(lo >> 8) & 0xFF] ^ kTable.t[5][(lo >> 16) & 0xFF] ^
        kTable.t[4][lo >> 24] ^ kTable.t[3][p[4]] ^ kTable.t[2][p[5]] ^ kTable.t[1][p[6]] ^
        kTable.t[0][p[7]];
    p += 8;
    size -= 8;
  }
  while (size--) c = (c >> 8) ^ kTable.t[0][(c ^ *p++) & 0xFF];
  return ~c;
}
}  // namespace norv
