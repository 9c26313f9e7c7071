#include "zoUtils/guid.h"

#include <gtest/gtest.h>

#include <set>
#include <unordered_set>

#include "zoUtils/norv_system_exception.h"

namespace norv {
namespace {

TEST(Guid, CreatedGuidsAreUniqueVersion4AndOrdered) {
  std::set<Guid> ordered;
  std::unordered_set<Guid> hashed;
  for (int i = 0; i < 10000; ++i) {
    const Guid g = CreateGuid();
    EXPECT_FALSE(g.IsNull());
    EXPECT_EQ(g.bytes[6] >> 4, 4);
    EXPECT_EQ(g.bytes[8] & 0xC0, 0x80);
    ordered.insert(g);
    hashed.insert(g);
  }
  EXPECT_EQ(ordered.size(), 10000u);
  EXPECT_EQ(hashed.size(), 10000u);
  Guid a, b;
  b.bytes[0] = 1;
  EXPECT_TRUE(a < b);
  EXPECT_FALSE(b < a);
  EXPECT_TRUE(a.IsNull());
}

TEST(Guid, PrintParseRoundTripAndBadTextRefused) {
  Guid g;
  for (int i = 0; i < 16; ++i) g.bytes[i] = static_cast<std::uint8_t>(i * 17);
  EXPECT_EQ(g.ToString(), "00112233-4455-6677-8899-aabbccddeeff");
  EXPECT_EQ(Guid::Parse("00112233-4455-6677-8899-AABBCCDDEEFF"), g);
  const Guid r = CreateGuid();
  EXPECT_EQ(Guid::Parse(r.ToString()), r);

  Guid untouched = g;
  for (const char* bad :
       {"", "00112233-4455-6677-8899-aabbccddeef", "00112233x4455-6677-8899-aabbccddeeff",
        "0011223g-4455-6677-8899-aabbccddeeff", "00112233-4455-6677-8899-aabbccddeeff0"}) {
    EXPECT_FALSE(Guid::TryParse(bad, untouched)) << bad;
    EXPECT_THROW(Guid::Parse(bad), NorvSystemException) << bad;
  }
  EXPECT_EQ(untouched, g);
}

}  // namespace
}  // namespace norv
