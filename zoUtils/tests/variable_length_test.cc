#include "zoUtils/variable_length.h"

#include <gtest/gtest.h>

#include <random>
#include <vector>

#include "zoUtils/input_archive.h"

namespace norv {
namespace {

std::vector<std::uint8_t> Encode(std::uint32_t v) {
  std::uint8_t buf[kMaxVariableLengthUint32Bytes];
  std::uint8_t* end = SerialiseVariableLengthUint32(buf, v);
  return std::vector<std::uint8_t>(buf, end);
}

void ExpectRoundTrip(std::uint32_t v) {
  const auto bytes = Encode(v);
  ASSERT_EQ(bytes.size(), VariableLengthUint32Size(v)) << v;
  ASSERT_LE(bytes.size(), kMaxVariableLengthUint32Bytes);
  ASSERT_NE(bytes[0], kVariableLengthMarker) << v;
  std::uint32_t out = ~v;
  EXPECT_EQ(DeserialiseVariableLengthUint32(bytes.data(), out), bytes.data() + bytes.size());
  EXPECT_EQ(out, v);
  bool flag = true;
  InputArchive in(bytes.data(), bytes.size());
  EXPECT_EQ(in.ReadVarUint32(flag), v);
  EXPECT_FALSE(flag);
  EXPECT_TRUE(in.AtEnd());
}

TEST(VariableLength, RoundTripsEveryLengthBoundary) {
  const std::uint32_t limits[] = {1u << 7, 1u << 14, 1u << 21, 1u << 28};
  std::size_t expectedLength = 1;
  for (std::uint32_t limit : limits) {
    EXPECT_EQ(VariableLengthUint32Size(limit - 1), expectedLength);
    EXPECT_EQ(VariableLengthUint32Size(limit), expectedLength + 1);
    ExpectRoundTrip(limit - 1);
    ExpectRoundTrip(limit);
    ++expectedLength;
  }
  ExpectRoundTrip(0);
  ExpectRoundTrip(0xFFFFFFFFu);
}

TEST(VariableLength, RoundTripsRandomValuesAndKeepsNumericOrder) {
  std::mt19937 rng(12345);
  for (int i = 0; i < 100000; ++i) {
    const std::uint32_t v = rng() >> (rng() % 32);
    ExpectRoundTrip(v);
    const std::uint32_t w = rng() >> (rng() % 32);
    // Equal-length encodings compare like their values; shorter means smaller.
    EXPECT_EQ(Encode(v) < Encode(w), v < w) << v << " " << w;
  }
}

TEST(VariableLength, FlaggedDecoderConsumesTheMarkerAlone) {
  const std::uint8_t bytes[] = {0xFF, 0x05};
  bool flag = false;
  InputArchive in(bytes, sizeof bytes);
  in.ReadVarUint32(flag);
  EXPECT_TRUE(flag);
  EXPECT_EQ(in.Offset(), 1u);
  EXPECT_EQ(in.ReadVarUint32(flag), 5u);
  EXPECT_FALSE(flag);

  std::uint32_t v;
  EXPECT_EQ(DeserialiseVariableLengthUint32(bytes, v, flag), bytes + 1);
  EXPECT_TRUE(flag);
}

TEST(VariableLength, MalformedInputThrowsClearly) {
  struct Case {
    std::vector<std::uint8_t> bytes;
    const char* messagePart;
  } cases[] = {
      {{}, "Truncated"},
      {{0x80}, "Truncated"},
      {{0xC0, 0x01}, "Truncated"},
      {{0xE1, 0x00, 0x00}, "Truncated"},
      {{0xF0, 0x10, 0x00, 0x00}, "Truncated"},
      {{0xFF}, "marker"},
      {{0xF7, 0, 0, 0, 0}, "cannot start"},
      {{0x80, 0x05}, "shortest"},                    // 5 in two bytes
      {{0xF0, 0x00, 0x00, 0x00, 0x01}, "shortest"},  // 1 in five bytes
  };
  for (const Case& c : cases) {
    InputArchive in(c.bytes.data(), c.bytes.size());
    try {
      in.ReadVarUint32();
      ADD_FAILURE() << "no exception for case " << c.messagePart;
    } catch (const BadVariableLengthException& e) {
      EXPECT_NE(std::string(e.what()).find(c.messagePart), std::string::npos) << e.what();
    }
  }
}

}  // namespace
}  // namespace norv
