#pragma once
#include "zoUtils/xostream.h"

namespace norv {

// Increases the indentation of an xostream by `by` for the Indenter's lifetime.
// Requires: the stream outlives the Indenter.
class NORV_API Indenter {
 public:
  Indenter(xostream& os, int by) : os_(os), previous_(os.indent()) {
    os.set_indent(previous_ + by);
  }
  ~Indenter() { os_.set_indent(previous_); }
  Indenter(const Indenter&) = delete;
  Indenter& operator=(const Indenter&) = delete;

 private:
  xostream& os_;
  const int previous_;
};

}  // namespace norv
