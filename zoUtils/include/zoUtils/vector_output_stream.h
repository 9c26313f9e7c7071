#pragma once
#include "zoUtils/output_stream.h"
#include "zoUtils/vector_of_byte.h"

namespace norv {

// An IOutputStream that appends to a VectorOfByte it does not own.
// Requires: the vector outlives the stream. Thread-safety: one thread at a time.
class NORV_API VectorOutputStream : public IOutputStream {
 public:
  explicit VectorOutputStream(VectorOfByte& out) : out_(out) {}
  void WriteStream(const void* data, ssize_t size) override;
  void FlushStream() override {}

 private:
  VectorOfByte& out_;
};

}  // namespace norv
