#include "zoUtils/archive.h"

#include <exception>

namespace norv {

Archive::Archive(IOutputStream* stream, IItemSerialiser* itemSerialiser)
    : stream_(stream),
      itemSerialiser_(itemSerialiser),
      uncaughtAtConstruction_(std::uncaught_exceptions()) {}

Archive::~Archive() noexcept(false) {
  // While an exception unwinds through the writer, the record is abandoned: flushing could
  // throw a second exception and terminate the program.
  if (std::uncaught_exceptions() > uncaughtAtConstruction_) return;
  FlushBuffer();
}

void Archive::FlushBuffer() {
  if (used_ == 0) return;
  const std::size_t n = used_;
  used_ = 0;  // the bytes belong to the stream from here on, even if it throws
  stream_->WriteStream(buffer_, static_cast<ssize_t>(n));
  flushed_ += n;
}

void Archive::Flush() {
  FlushBuffer();
  stream_->FlushStream();
}

void Archive::WriteBytes(const void* data, std::size_t size) {
  if (size == 0) return;  // `data` may then be null
  const auto* p = static_cast<const std::uint8_t*>(data);
  if (size <= kBufferSize - used_) {
    std::memcpy(buffer_ + used_, p, size);
    used_ += size;
    return;
  }
  if (size >= kBufferSize) {
    FlushBuffer();
    stream_->WriteStream(p, static_cast<ssize_t>(size));
    flushed_ += size;
    return;
  }
  // Fill the buffer, flush it, put the rest at the front.
  const std::size_t first = kBufferSize - used_;
  std::memcpy(buffer_ + used_, p, first);
  used_ = kBufferSize;
  FlushBuffer();
  std::memcpy(buffer_, p + first, size - first);
  used_ = size - first;
}

void Archive::WriteFixed32(std::uint32_t v) {
  std::uint8_t* p = Reserve(4);
  for (int i = 0; i < 4; ++i) p[i] = static_cast<std::uint8_t>(v >> (8 * i));
  Advance(4);
}

void Archive::WriteFixed64(std::uint64_t v) {
  std::uint8_t* p = Reserve(8);
  for (int i = 0; i < 8; ++i) p[i] = static_cast<std::uint8_t>(v >> (8 * i));
  Advance(8);
}

}  // namespace norv
