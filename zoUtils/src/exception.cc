#include "zoUtils/exception.h"

#include "zoUtils/exception_base.h"
#include "zoUtils/norv_system_exception.h"
#include "zoUtils/string_stream.h"

namespace norv {

IException::~IException() = default;

const char* IException::what() const noexcept {
  if (what_.empty()) {
    try {
      StringStream s;
      Write(s);
      what_ = s.str();
    } catch (...) {
      return "exception (its message could not be written)";
    }
  }
  return what_.c_str();
}

ExceptionBase::~ExceptionBase() = default;

void ExceptionBase::Write(xostream& os) const { os << text_; }

NorvSystemException::~NorvSystemException() = default;

}  // namespace norv
