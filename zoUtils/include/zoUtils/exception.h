#pragma once
#include <exception>

#include "zoUtils/export.h"
#include "zoUtils/xostream.h"

namespace norv {

// The root of every exception of the runtime, the store file and the store. Its one operation
// writes the message; what() answers the same text, so plain C++ callers can catch
// std::exception and print it. Exceptions are thrown by value.
class NORV_API IException : public std::exception {
 public:
  IException() = default;
  IException(const IException& other) : std::exception(other) {}
  IException& operator=(const IException&) {
    what_.clear();
    return *this;
  }
  ~IException() override;

  virtual void Write(xostream& os) const = 0;

  // The text Write produces, built on first use. Thread-safety: call from one thread at a time.
  const char* what() const noexcept override;

 private:
  mutable xstring what_;
};

inline xostream& operator<<(xostream& os, const IException& e) {
  e.Write(os);
  return os;
}

}  // namespace norv
