#pragma once
#include "zoUtils/xostream.h"

namespace norv {

// An xostream that collects its text in a string.
class NORV_API StringStream : public xostream {
 public:
  const xstring& str() const { return text_; }
  void clear() { text_.clear(); }

 protected:
  void WriteRaw(const char* text, std::size_t length) override { text_.append(text, length); }

 private:
  xstring text_;
};

}  // namespace norv
