#include "zoUtils/input_archive.h"

#include <cstring>

#include "zoUtils/string_stream.h"
#include "zoUtils/variable_length.h"

namespace norv {

InputArchiveOverrunException::~InputArchiveOverrunException() = default;

void InputArchive::ThrowOverrun(std::size_t needed) const {
  StringStream s;
  s << "Read past the end of the data: " << static_cast<std::uint64_t>(needed)
    << " bytes needed at offset " << static_cast<std::uint64_t>(Offset()) << " of "
    << static_cast<std::uint64_t>(Size());
  throw InputArchiveOverrunException(s.str());
}

void InputArchive::SetPosition(const std::uint8_t* p) {
  if (p < begin_ || p > end_) {
    StringStream s;
    s << "InputArchive position moved outside its data (offset "
      << static_cast<std::int64_t>(p - begin_) << " of " << static_cast<std::uint64_t>(Size())
      << ")";
    throw InputArchiveOverrunException(s.str());
  }
  pos_ = p;
}

void InputArchive::ReadBytes(void* out, std::size_t n) {
  Require(n);
  std::memcpy(out, pos_, n);
  pos_ += n;
}

std::uint32_t InputArchive::ReadFixed32() {
  const std::uint8_t* p = Require(4);
  std::uint32_t v = 0;
  for (int i = 0; i < 4; ++i) v |= static_cast<std::uint32_t>(p[i]) << (8 * i);
  pos_ += 4;
  return v;
}

std::uint64_t InputArchive::ReadFixed64() {
  const std::uint8_t* p = Require(8);
  std::uint64_t v = 0;
  for (int i = 0; i < 8; ++i) v |= static_cast<std::uint64_t>(p[i]) << (8 * i);
  pos_ += 8;
  return v;
}

std::uint32_t InputArchive::ReadVarUint32() {
  std::uint32_t v;
  pos_ = DeserialiseVariableLengthUint32(pos_, end_, v);
  return v;
}

std::uint32_t InputArchive::ReadVarUint32(bool& flag) {
  std::uint32_t v;
  pos_ = DeserialiseVariableLengthUint32(pos_, end_, v, flag);
  return v;
}

}  // namespace norv
