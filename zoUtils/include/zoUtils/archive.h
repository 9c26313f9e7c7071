#pragma once
#include <cstddef>
#include <cstdint>
#include <cstring>

#include "zoUtils/export.h"
#include "zoUtils/item_serialiser.h"
#include "zoUtils/output_stream.h"

namespace norv {

// A writer with a 4096-byte inline buffer in front of an IOutputStream.
//
// Writers may put bytes into the buffer themselves: Reserve(n) guarantees n free bytes
// (flushing first when more than kBufferSize - n are in use) and returns where to write;
// Advance(n) then accounts for what was written. A variable-length 32-bit value reserves 5.
// The destructor flushes what remains, except while an exception unwinds the stack (the
// write is then abandoned; its owner is failing anyway).
//
// Ownership: the stream and the item serialiser are borrowed and must outlive the Archive.
// Thread-safety: one thread at a time.
class NORV_API Archive {
 public:
  static constexpr std::size_t kBufferSize = 4096;

  explicit Archive(IOutputStream* stream, IItemSerialiser* itemSerialiser = nullptr);
  Archive(const Archive&) = delete;
  Archive& operator=(const Archive&) = delete;
  // Flushes the buffer; may throw what the stream throws (not while unwinding).
  virtual ~Archive() noexcept(false);

  // Requires: n <= kBufferSize. Returns a pointer to at least n free bytes.
  std::uint8_t* Reserve(std::size_t n) {
    if (used_ > kBufferSize - n) FlushBuffer();
    return buffer_ + used_;
  }
  // Requires: n bytes were written at the pointer Reserve returned, within what it reserved.
  void Advance(std::size_t n) { used_ += n; }

  std::uint8_t* WritePosition() { return buffer_ + used_; }
  std::size_t BytesUsed() const { return used_; }
  std::size_t BytesFree() const { return kBufferSize - used_; }
  // Every byte written so far: flushed plus still buffered.
  std::uint64_t TotalBytes() const { return flushed_ + used_; }

  // Appends raw bytes of any length (large runs go to the stream without copying).
  void WriteBytes(const void* data, std::size_t size);
  void WriteByte(std::uint8_t b) {
    *Reserve(1) = b;
    Advance(1);
  }
  // Fixed-width values, little-endian.
  void WriteFixed32(std::uint32_t v);
  void WriteFixed64(std::uint64_t v);

  // Hands the buffered bytes to the stream and calls its FlushStream.
  void Flush();

  IOutputStream* GetStream() const { return stream_; }
  IItemSerialiser* GetItemSerialiser() const { return itemSerialiser_; }
  void SetItemSerialiser(IItemSerialiser* s) { itemSerialiser_ = s; }

 protected:
  // Hands the buffered bytes to the stream and empties the buffer.
  void FlushBuffer();

 private:
  IOutputStream* stream_;
  IItemSerialiser* itemSerialiser_;
  std::size_t used_ = 0;
  std::uint64_t flushed_ = 0;
  int uncaughtAtConstruction_;
  std::uint8_t buffer_[kBufferSize];
};

}  // namespace norv
