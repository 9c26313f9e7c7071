#include "zoUtils/output_stream.h"

#include "zoUtils/vector_output_stream.h"

namespace norv {

IOutputStream::~IOutputStream() = default;

void VectorOutputStream::WriteStream(const void* data, ssize_t size) {
  if (size <= 0) return;
  const auto* p = static_cast<const std::uint8_t*>(data);
  out_.insert(out_.end(), p, p + size);
}

}  // namespace norv
