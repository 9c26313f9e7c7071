#pragma once
// Constants of the store file format, shared by reader and writer. The bytes are described in
// zoLss/doc/format.md. Every value here reaches the disk: never renumber; retire, never reuse.
#include <cstddef>
#include <cstdint>

namespace norv {
namespace lss_format {

constexpr char kFileMagic[8] = {'z', 'o', 'L', 'S', 'S', 'v', '1', '\n'};
constexpr std::uint32_t kFormatVersion = 1;
constexpr std::size_t kFileHeaderSize = 4096;  // the log starts here
constexpr std::size_t kFileHeaderCrcOffset = 20;

constexpr std::uint32_t kRecordMagic = 0x4C52535Au;  // bytes "ZSRL"
constexpr std::size_t kRecordHeaderSize = 24;
constexpr std::size_t kRecordAlign = 8;
constexpr std::uint32_t kMaxPayloadSize = 1u << 30;

// Operation codes inside a record payload.
constexpr std::uint8_t kOpWrite = 1;        // u64 seid, u32 length, bytes
constexpr std::uint8_t kOpDelete = 2;       // u64 seid
constexpr std::uint8_t kOpHighReserve = 3;  // u32 next high: every high below it is used
constexpr std::uint8_t kOpLowReserve = 4;   // u32 high, u64 limit: lows below it are used

// Lows reserved per reservation record.
constexpr std::uint64_t kLowReserveChunk = 4096;

constexpr std::size_t AlignRecord(std::size_t n) {
  return (n + kRecordAlign - 1) & ~(kRecordAlign - 1);
}

}  // namespace lss_format
}  // namespace norv
