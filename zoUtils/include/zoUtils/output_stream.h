#pragma once
#include <sys/types.h>

#include "zoUtils/export.h"

namespace norv {

// A sink of bytes. Implementations decide where the bytes go; an Archive writes into one.
// Thread-safety: one thread at a time.
class NORV_API IOutputStream {
 public:
  virtual ~IOutputStream();
  // Appends `size` bytes. Throws on failure (the implementation's exception).
  virtual void WriteStream(const void* data, ssize_t size) = 0;
  // Pushes buffered bytes on towards their destination.
  virtual void FlushStream() = 0;
};

}  // namespace norv
