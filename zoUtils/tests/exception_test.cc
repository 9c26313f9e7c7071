#include <gtest/gtest.h>

#include "zoUtils/indenter.h"
#include "zoUtils/norv_system_exception.h"
#include "zoUtils/string_stream.h"
#include "zoUtils/tracer.h"

namespace norv {
namespace {

class CountedException : public IException {
 public:
  explicit CountedException(int n) : n_(n) {}
  void Write(xostream& os) const override { os << "Counted " << n_; }

 private:
  int n_;
};

TEST(Exception, WhatGivesTheWrittenText) {
  try {
    throw NorvSystemException("Something failed");
  } catch (const std::exception& e) {
    EXPECT_STREQ(e.what(), "Something failed");
  }
  const CountedException e(42);
  EXPECT_STREQ(e.what(), "Counted 42");
  const CountedException copy(e);
  EXPECT_STREQ(copy.what(), "Counted 42");
  StringStream s;
  s << e;
  EXPECT_EQ(s.str(), "Counted 42");
}

TEST(Xostream, PutsValuesHexAndIndentation) {
  StringStream s;
  s << "a" << ' ' << -5 << ' ' << 7u << ' ' << std::int64_t{-1} << ' '
    << std::uint64_t{18446744073709551615ull} << ' ' << true << ' ';
  WriteHex(s, 0x1a, 4);
  s << ' ';
  const std::uint8_t bytes[] = {0x0f, 0xa0};
  WriteHexBytes(s, bytes, 2);
  EXPECT_EQ(s.str(), "a -5 7 -1 18446744073709551615 true 0000001A 0f a0");

  StringStream t;
  t << "Map\n";
  {
    Indenter in(t, 4);
    t << "{x}\n\n{y}\n";
  }
  t << "end";
  EXPECT_EQ(t.str(), "Map\n    {x}\n\n    {y}\nend");
}

TEST(Tracer, MessagesGoWholeToTheSinkAndAssertionsAreReported) {
  std::vector<xstring> lines;
  TracerX::Sink previous = TracerX::SetSink([&](const xstring& m) { lines.push_back(m); });
  {
    TracerX t;
    t << "PS: value " << 3 << "\n";
  }
  NORV_TRACE_ASSERT(1 + 1 == 3);
  NORV_TRACE_ASSERT(1 + 1 == 2);
  TracerX::SetSink(previous);
  ASSERT_EQ(lines.size(), 2u);
  EXPECT_EQ(lines[0], "PS: value 3\n");
  EXPECT_NE(lines[1].find("ASSERTION FAILED: 1 + 1 == 3 at "), std::string::npos) << lines[1];
}

}  // namespace
}  // namespace norv
