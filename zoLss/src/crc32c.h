#pragma once
#include <cstddef>
#include <cstdint>

#include "zoUtils/export.h"

namespace norv {
// CRC-32C (Castagnoli), as used by every checksum of the store file (doc/format.md).
NORV_API std::uint32_t Crc32c(const void* data, std::size_t size, std::uint32_t crc = 0);
}  // namespace norv
