#pragma once
#include "zoUtils/exception.h"

namespace norv {

// An exception that carries its message as text.
class NORV_API ExceptionBase : public IException {
 public:
  explicit ExceptionBase(xstring text) : text_(std::move(text)) {}
  ~ExceptionBase() override;

  void Write(xostream& os) const override;
  const xstring& GetText() const { return text_; }

 private:
  xstring text_;
};

}  // namespace norv
