#include "zoUtils/schema.h"

#include "zoUtils/string_stream.h"
#include "zoUtils/variable_length.h"

namespace norv {

void SerialiseSchema(Archive& archive, int schema) {
  std::uint8_t* p = archive.Reserve(kMaxVariableLengthUint32Bytes);
  archive.Advance(static_cast<std::size_t>(
      SerialiseVariableLengthUint32(p, static_cast<std::uint32_t>(schema)) - p));
}

void DeserialiseSchema(InputArchive& archive, int latestSchema, int& schema) {
  const std::uint32_t stored = archive.ReadVarUint32();
  if (stored > static_cast<std::uint32_t>(latestSchema)) {
    StringStream s;
    s << "Record schema " << stored << " is newer than schema " << latestSchema
      << ", the latest this program reads";
    throw NorvSystemException(s.str());
  }
  schema = static_cast<int>(stored);
}

}  // namespace norv
