#pragma once
#include <cstddef>
#include <cstdint>

#include "zoUtils/export.h"
#include "zoUtils/norv_system_exception.h"

namespace norv {

// Thrown when a reader asks for bytes beyond the end of an InputArchive's data.
class NORV_API InputArchiveOverrunException : public NorvSystemException {
 public:
  using NorvSystemException::NorvSystemException;
  ~InputArchiveOverrunException() override;
};

// A read cursor over bytes that knows where they end. Every read checks the end first and
// throws InputArchiveOverrunException instead of reading past it, so a reader fed damaged or
// hostile bytes fails cleanly. Readers that must consume a record exactly check AtEnd().
//
// Ownership: borrows the bytes; they must outlive the archive. Thread-safety: one thread at a time.
class NORV_API InputArchive {
 public:
  InputArchive(const void* data, std::size_t size)
      : begin_(static_cast<const std::uint8_t*>(data)), pos_(begin_), end_(begin_ + size) {}

  const std::uint8_t* Position() const { return pos_; }
  const std::uint8_t* Begin() const { return begin_; }
  const std::uint8_t* End() const { return end_; }
  std::size_t Offset() const { return static_cast<std::size_t>(pos_ - begin_); }
  std::size_t Size() const { return static_cast<std::size_t>(end_ - begin_); }
  std::size_t Remaining() const { return static_cast<std::size_t>(end_ - pos_); }
  bool AtEnd() const { return pos_ == end_; }

  // Returns the current position after checking that n bytes remain; does not advance.
  const std::uint8_t* Require(std::size_t n) const {
    if (n > Remaining()) ThrowOverrun(n);
    return pos_;
  }
  // Moves the cursor to p. Requires: Position() <= p <= End() (checked; throws otherwise).
  void SetPosition(const std::uint8_t* p);
  void Skip(std::size_t n) {
    Require(n);
    pos_ += n;
  }

  std::uint8_t ReadByte() {
    Require(1);
    return *pos_++;
  }
  std::uint8_t PeekByte() const { return *Require(1); }
  void ReadBytes(void* out, std::size_t n);
  // Fixed-width values, little-endian.
  std::uint32_t ReadFixed32();
  std::uint64_t ReadFixed64();

  // One variable-length 32-bit value (see variable_length.h); throws on malformed input.
  std::uint32_t ReadVarUint32();
  // The flagged form: a lone 0xFF marker sets `flag` and returns 0; otherwise as ReadVarUint32.
  std::uint32_t ReadVarUint32(bool& flag);

  [[noreturn]] void ThrowOverrun(std::size_t needed) const;

 private:
  const std::uint8_t* begin_;
  const std::uint8_t* pos_;
  const std::uint8_t* end_;
};

}  // namespace norv
