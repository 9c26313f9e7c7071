#pragma once
#include <cstdint>

#include "zoUtils/xvector.h"

namespace norv {

// A growable byte buffer.
using VectorOfByte = xvector<std::uint8_t>;

}  // namespace norv
