#include "zoUtils/variable_length.h"

#include "zoUtils/string_stream.h"

namespace norv {

BadVariableLengthException::~BadVariableLengthException() = default;

namespace {

constexpr std::uint32_t kLimit1 = 1u << 7;
constexpr std::uint32_t kLimit2 = 1u << 14;
constexpr std::uint32_t kLimit3 = 1u << 21;
constexpr std::uint32_t kLimit4 = 1u << 28;

// The total length of an encoding from its first byte, or 0 when no encoding starts with it.
inline std::size_t LengthFromFirstByte(std::uint8_t b) {
  if (b < 0x80) return 1;
  if (b < 0xC0) return 2;
  if (b < 0xE0) return 3;
  if (b < 0xF0) return 4;
  if (b == 0xF0) return 5;
  return 0;
}

[[noreturn]] void ThrowBadFirstByte(std::uint8_t b) {
  StringStream s;
  s << "Malformed variable-length integer: byte 0x";
  WriteHex(s, b, 1);
  s << (b == kVariableLengthMarker ? " is a marker, not the start of a value"
                                   : " cannot start a value");
  throw BadVariableLengthException(s.str());
}

[[noreturn]] void ThrowNonCanonical(std::uint32_t value, std::size_t length) {
  StringStream s;
  s << "Malformed variable-length integer: value " << value << " encoded in "
    << static_cast<std::uint64_t>(length) << " bytes, longer than its shortest form";
  throw BadVariableLengthException(s.str());
}

[[noreturn]] void ThrowTruncated(std::size_t needed, std::size_t available) {
  StringStream s;
  s << "Truncated variable-length integer: " << static_cast<std::uint64_t>(needed)
    << " bytes needed, " << static_cast<std::uint64_t>(available) << " left";
  throw BadVariableLengthException(s.str());
}

// Decodes an encoding of `length` bytes at `src`, all of which are readable.
inline const std::uint8_t* DecodeBody(const std::uint8_t* src, std::size_t length,
                                      std::uint32_t& value) {
  std::uint32_t v;
  switch (length) {
    case 1:
      value = src[0];
      return src + 1;
    case 2:
      v = (static_cast<std::uint32_t>(src[0] & 0x3F) << 8) | src[1];
      if (v < kLimit1) ThrowNonCanonical(v, 2);
      break;
    case 3:
      v = (static_cast<std::uint32_t>(src[0] & 0x1F) << 16) |
          (static_cast<std::uint32_t>(src[1]) << 8) | src[2];
      if (v < kLimit2) ThrowNonCanonical(v, 3);
      break;
    case 4:
      v = (static_cast<std::uint32_t>(src[0] & 0x0F) << 24) |
          (static_cast<std::uint32_t>(src[1]) << 16) | (static_cast<std::uint32_t>(src[2]) << 8) |
          src[3];
      if (v < kLimit3) ThrowNonCanonical(v, 4);
      break;
    default:
      v = (static_cast<std::uint32_t>(src[1]) << 24) | (static_cast<std::uint32_t>(src[2]) << 16) |
          (static_cast<std::uint32_t>(src[3]) << 8) | src[4];
      if (v < kLimit4) ThrowNonCanonical(v, 5);
      break;
  }
  value = v;
  return src + length;
}

}  // namespace

std::size_t VariableLengthUint32Size(std::uint32_t value) {
  if (value < kLimit1) return 1;
  if (value < kLimit2) return 2;
  if (value < kLimit3) return 3;
  if (value < kLimit4) return 4;
  return 5;
}

std::uint8_t* SerialiseVariableLengthUint32(std::uint8_t* dest, std::uint32_t value) {
  if (value < kLimit1) {
    dest[0] = static_cast<std::uint8_t>(value);
    return dest + 1;
  }
  if (value < kLimit2) {
    dest[0] = static_cast<std::uint8_t>(0x80 | (value >> 8));
    dest[1] = static_cast<std::uint8_t>(value);
    return dest + 2;
  }
  if (value < kLimit3) {
    dest[0] = static_cast<std::uint8_t>(0xC0 | (value >> 16));
    dest[1] = static_cast<std::uint8_t>(value >> 8);
    dest[2] = static_cast<std::uint8_t>(value);
    return dest + 3;
  }
  if (value < kLimit4) {
    dest[0] = static_cast<std::uint8_t>(0xE0 | (value >> 24));
    dest[1] = static_cast<std::uint8_t>(value >> 16);
    dest[2] = static_cast<std::uint8_t>(value >> 8);
    dest[3] = static_cast<std::uint8_t>(value);
    return dest + 4;
  }
  dest[0] = 0xF0;
  dest[1] = static_cast<std::uint8_t>(value >> 24);
  dest[2] = static_cast<std::uint8_t>(value >> 16);
  dest[3] = static_cast<std::uint8_t>(value >> 8);
  dest[4] = static_cast<std::uint8_t>(value);
  return dest + 5;
}

const std::uint8_t* DeserialiseVariableLengthUint32(const std::uint8_t* src, std::uint32_t& value) {
  const std::size_t length = LengthFromFirstByte(src[0]);
  if (length == 0) ThrowBadFirstByte(src[0]);
  return DecodeBody(src, length, value);
}

const std::uint8_t* DeserialiseVariableLengthUint32(const std::uint8_t* src, std::uint32_t& value,
                                                    bool& flag) {
  if (src[0] == kVariableLengthMarker) {
    flag = true;
    value = 0;
    return src + 1;
  }
  flag = false;
  return DeserialiseVariableLengthUint32(src, value);
}

const std::uint8_t* DeserialiseVariableLengthUint32(const std::uint8_t* src,
                                                    const std::uint8_t* end, std::uint32_t& value) {
  if (src >= end) ThrowTruncated(1, 0);
  const std::size_t length = LengthFromFirstByte(src[0]);
  if (length == 0) ThrowBadFirstByte(src[0]);
  const auto available = static_cast<std::size_t>(end - src);
  if (length > available) ThrowTruncated(length, available);
  return DecodeBody(src, length, value);
}

const std::uint8_t* DeserialiseVariableLengthUint32(const std::uint8_t* src,
                                                    const std::uint8_t* end, std::uint32_t& value,
                                                    bool& flag) {
  if (src >= end) ThrowTruncated(1, 0);
  if (src[0] == kVariableLengthMarker) {
    flag = true;
    value = 0;
    return src + 1;
  }
  flag = false;
  return DeserialiseVariableLengthUint32(src, end, value);
}

}  // namespace norv
