#pragma once
// The variable-length 32-bit encoding. The first byte tells the length:
//
//   0xxxxxxx                       7 bits    values < 2^7
//   10xxxxxx +1 byte              14 bits    values < 2^14
//   110xxxxx +2 bytes             21 bits    values < 2^21
//   1110xxxx +3 bytes             28 bits    values < 2^28
//   11110000 +4 bytes             32 bits    any value
//
// Payload bits follow most significant first, so encodings of equal length sort like their
// values. Every value has exactly one encoding (the shortest); decoders reject longer ones.
// No encoding begins with 0xFF: that byte is free to serve as a marker, which the flagged
// decoder consumes alone. Bytes 0xF1..0xFE never begin an encoding.
// On disk: never change this layout.
#include <cstddef>
#include <cstdint>

#include "zoUtils/export.h"
#include "zoUtils/norv_system_exception.h"

namespace norv {

constexpr std::size_t kMaxVariableLengthUint32Bytes = 5;
constexpr std::uint8_t kVariableLengthMarker = 0xFF;

// Thrown for a truncated, non-canonical or malformed encoding.
class NORV_API BadVariableLengthException : public NorvSystemException {
 public:
  using NorvSystemException::NorvSystemException;
  ~BadVariableLengthException() override;
};

// Writes `value` at `dest` and returns the end. Requires: 5 writable bytes at `dest`.
NORV_API std::uint8_t* SerialiseVariableLengthUint32(std::uint8_t* dest, std::uint32_t value);
// The number of bytes SerialiseVariableLengthUint32 writes for `value`.
NORV_API std::size_t VariableLengthUint32Size(std::uint32_t value);

// Decodes one value at `src` and returns the position after it. This form trusts its input to
// hold a complete encoding (as when the caller produced it); decoding stored bytes goes through
// the bounded forms or InputArchive. Throws BadVariableLengthException on a malformed first
// byte or a non-canonical encoding.
NORV_API const std::uint8_t* DeserialiseVariableLengthUint32(const std::uint8_t* src,
                                                             std::uint32_t& value);
// Flagged form: if the next byte is 0xFF, sets `flag`, sets `value` to 0 and consumes exactly
// that byte; otherwise decodes like the plain form and clears `flag`.
NORV_API const std::uint8_t* DeserialiseVariableLengthUint32(const std::uint8_t* src,
                                                             std::uint32_t& value, bool& flag);

// Bounded forms: never read at or past `end`; a truncated encoding throws
// BadVariableLengthException.
NORV_API const std::uint8_t* DeserialiseVariableLengthUint32(const std::uint8_t* src,
                                                             const std::uint8_t* end,
                                                             std::uint32_t& value);
NORV_API const std::uint8_t* DeserialiseVariableLengthUint32(const std::uint8_t* src,
                                                             const std::uint8_t* end,
                                                             std::uint32_t& value, bool& flag);

}  // namespace norv
