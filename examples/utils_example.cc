// Writes a small record with the runtime's Archive, reads it back bounds-checked, and shows
// what a damaged copy of it does. Run: cmake --preset default && cmake --build --preset run-example
#include <cstdio>

#include "zoUtils/archive.h"
#include "zoUtils/guid.h"
#include "zoUtils/input_archive.h"
#include "zoUtils/schema.h"
#include "zoUtils/string_stream.h"
#include "zoUtils/variable_length.h"
#include "zoUtils/vector_output_stream.h"

using namespace norv;

int main() {
  const Guid space = CreateGuid();
  const xstring name = "norv::Person";

  VectorOfByte record;
  VectorOutputStream out(record);
  {
    Archive ar(&out);
    SerialiseSchema(ar, 1);
    std::uint8_t* p = ar.Reserve(kMaxVariableLengthUint32Bytes);
    ar.Advance(static_cast<std::size_t>(
        SerialiseVariableLengthUint32(p, static_cast<std::uint32_t>(name.size())) - p));
    ar.WriteBytes(name.data(), name.size());
    ar.WriteBytes(space.bytes, sizeof space.bytes);
  }  // the Archive flushes into `record` here

  StringStream s;
  s << "Wrote a record of " << static_cast<std::uint64_t>(record.size()) << " bytes: ";
  WriteHexBytes(s, record.data(), record.size());
  std::printf("%s\n", s.str().c_str());

  InputArchive in(record.data(), record.size());
  int schema = 0;
  DeserialiseSchema(in, 1, schema);
  xstring readName(in.ReadVarUint32(), '\0');
  in.ReadBytes(readName.data(), readName.size());
  Guid readSpace;
  in.ReadBytes(readSpace.bytes, sizeof readSpace.bytes);
  std::printf("Read it back: schema %d, class \"%s\", space %s, %s\n", schema, readName.c_str(),
              readSpace.ToString().c_str(), in.AtEnd() ? "all bytes consumed" : "bytes left over");

  // A copy cut short by 4 bytes: the reader stops with a clear message instead of reading on.
  InputArchive damaged(record.data(), record.size() - 4);
  try {
    DeserialiseSchema(damaged, 1, schema);
    damaged.Skip(damaged.ReadVarUint32());
    damaged.ReadBytes(readSpace.bytes, sizeof readSpace.bytes);
  } catch (const IException& e) {
    std::printf("Reading a truncated copy fails cleanly: %s\n", e.what());
  }
  return 0;
}
