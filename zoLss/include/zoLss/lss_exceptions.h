#pragma once
#include "zoUtils/exception_base.h"

namespace norv {

// The store file is damaged: the message names the file, the offset and what was expected
// against what was found.
class NORV_API CorruptLSSException : public ExceptionBase {
 public:
  explicit CorruptLSSException(xstring text) : ExceptionBase(std::move(text)) {}
  ~CorruptLSSException() override;
};

// An operating-system file operation failed (open, read, write, sync, lock), or the store
// refuses writes after such a failure. The message names the file and the errno text.
class NORV_API FileException : public ExceptionBase {
 public:
  FileException(xstring text, int err) : ExceptionBase(std::move(text)), errno_(err) {}
  ~FileException() override;
  int GetErrno() const { return errno_; }

 private:
  int errno_;
};

}  // namespace norv
