#pragma once
#include "zoUtils/export.h"

namespace norv {

class Archive;

// A hook that an Archive may carry to write certain items itself (for instance the high word of
// an object identifier). Has no virtual destructor: the Archive never owns it.
class NORV_API IItemSerialiser {
 public:
  virtual void SerialiseItem(Archive& archive, const void* item) = 0;

 protected:
  ~IItemSerialiser() = default;
};

}  // namespace norv
