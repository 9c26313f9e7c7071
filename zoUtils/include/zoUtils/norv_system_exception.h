#pragma once
#include "zoUtils/exception_base.h"

namespace norv {

// A failure described by a plain text: misuse, bad input, unexpected state.
class NORV_API NorvSystemException : public ExceptionBase {
 public:
  explicit NorvSystemException(xstring text) : ExceptionBase(std::move(text)) {}
  ~NorvSystemException() override;
};

}  // namespace norv
