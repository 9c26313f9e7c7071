#include "zoUtils/archive.h"

#include <gtest/gtest.h>

#include <random>

#include "zoUtils/input_archive.h"
#include "zoUtils/schema.h"
#include "zoUtils/variable_length.h"
#include "zoUtils/vector_output_stream.h"

namespace norv {
namespace {

// Records every WriteStream call so tests can see when the archive flushed.
class CountingStream : public IOutputStream {
 public:
  void WriteStream(const void* data, ssize_t size) override {
    const auto* p = static_cast<const std::uint8_t*>(data);
    bytes.insert(bytes.end(), p, p + size);
    ++writes;
  }
  void FlushStream() override { ++flushes; }
  VectorOfByte bytes;
  int writes = 0;
  int flushes = 0;
};

void PutVarint(Archive& ar, std::uint32_t v) {
  std::uint8_t* p = ar.Reserve(kMaxVariableLengthUint32Bytes);
  ar.Advance(static_cast<std::size_t>(SerialiseVariableLengthUint32(p, v) - p));
}

TEST(Archive, ReserveFlushesOnlyWhenFewerBytesRemainThanAsked) {
  CountingStream s;
  {
    Archive ar(&s);
    const std::vector<std::uint8_t> fill(4091, 0x11);
    ar.WriteBytes(fill.data(), fill.size());
    PutVarint(ar, 3);  // 4091 used: five bytes still fit
    EXPECT_EQ(s.writes, 0);
    EXPECT_EQ(ar.BytesUsed(), 4092u);
    PutVarint(ar, 4);  // 4092 used: flushes first
    EXPECT_EQ(s.writes, 1);
    EXPECT_EQ(ar.BytesUsed(), 1u);
    EXPECT_EQ(ar.TotalBytes(), 4093u);
  }
  EXPECT_EQ(s.writes, 2);  // the destructor flushed the rest
  ASSERT_EQ(s.bytes.size(), 4093u);
  EXPECT_EQ(s.bytes[4091], 3);
  EXPECT_EQ(s.bytes[4092], 4);
}

TEST(Archive, ManyFlushesKeepEveryByteInOrder) {
  std::mt19937 rng(7);
  VectorOfByte expected;
  CountingStream s;
  {
    Archive ar(&s);
    for (int i = 0; i < 20000; ++i) {
      switch (rng() % 4) {
        case 0: {
          const std::uint32_t v = rng();
          ar.WriteFixed32(v);
          for (int b = 0; b < 4; ++b) expected.push_back(static_cast<std::uint8_t>(v >> (8 * b)));
          break;
        }
        case 1: {
          const std::uint64_t v = (std::uint64_t{rng()} << 32) | rng();
          ar.WriteFixed64(v);
          for (int b = 0; b < 8; ++b) expected.push_back(static_cast<std::uint8_t>(v >> (8 * b)));
          break;
        }
        case 2: {
          const std::uint32_t v = rng() >> (rng() % 32);
          PutVarint(ar, v);
          std::uint8_t buf[5];
          expected.insert(expected.end(), buf, SerialiseVariableLengthUint32(buf, v));
          break;
        }
        default: {
          // Runs shorter than, equal to and longer than the buffer.
          VectorOfByte run(rng() % 9000);
          for (auto& b : run) b = static_cast<std::uint8_t>(rng());
          ar.WriteBytes(run.data(), run.size());
          expected.insert(expected.end(), run.begin(), run.end());
        }
      }
      ASSERT_EQ(ar.TotalBytes(), expected.size());
    }
  }
  EXPECT_GT(s.writes, 100);
  EXPECT_EQ(s.bytes, expected);
}

TEST(Archive, FlushPushesTheStreamAndAbandonedWriteIsNotFlushed) {
  CountingStream s;
  {
    Archive ar(&s);
    ar.WriteByte(1);
    ar.Flush();
    EXPECT_EQ(s.flushes, 1);
    EXPECT_EQ(s.bytes.size(), 1u);
  }
  try {
    Archive ar(&s);
    ar.WriteByte(2);
    throw std::runtime_error("writer fails");
  } catch (const std::runtime_error&) {
  }
  EXPECT_EQ(s.bytes.size(), 1u);
}

TEST(InputArchive, FixedValuesRoundTripAndOverrunThrows) {
  VectorOfByte bytes;
  VectorOutputStream out(bytes);
  {
    Archive ar(&out);
    SerialiseSchema(ar, 2);
    ar.WriteFixed32(0xDEADBEEF);
    ar.WriteFixed64(0x0123456789ABCDEFull);
  }
  InputArchive in(bytes.data(), bytes.size());
  int schema = -1;
  DeserialiseSchema(in, 2, schema);
  EXPECT_EQ(schema, 2);
  EXPECT_EQ(in.ReadFixed32(), 0xDEADBEEFu);
  EXPECT_EQ(in.ReadFixed64(), 0x0123456789ABCDEFull);
  EXPECT_TRUE(in.AtEnd());
  try {
    in.ReadByte();
    FAIL();
  } catch (const InputArchiveOverrunException& e) {
    EXPECT_STREQ(e.what(), "Read past the end of the data: 1 bytes needed at offset 13 of 13");
  }
  // A truncated fixed value fails before touching any byte past the end.
  InputArchive shortIn(bytes.data() + 1, 3);
  EXPECT_THROW(shortIn.ReadFixed32(), InputArchiveOverrunException);
  EXPECT_EQ(shortIn.Offset(), 0u);
  EXPECT_THROW(shortIn.Skip(4), InputArchiveOverrunException);
  EXPECT_THROW(shortIn.SetPosition(bytes.data() + 5), InputArchiveOverrunException);
}

TEST(Schema, NewerSchemaIsRefused) {
  VectorOfByte bytes;
  VectorOutputStream out(bytes);
  {
    Archive ar(&out);
    SerialiseSchema(ar, 3);
  }
  InputArchive in(bytes.data(), bytes.size());
  int schema = 0;
  try {
    DeserialiseSchema(in, 2, schema);
    FAIL();
  } catch (const NorvSystemException& e) {
    EXPECT_STREQ(e.what(), "Record schema 3 is newer than schema 2, the latest this program reads");
  }
  EXPECT_EQ(schema, 0);
}

}  // namespace
}  // namespace norv
