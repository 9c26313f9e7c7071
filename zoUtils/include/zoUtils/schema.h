#pragma once
#include "zoUtils/archive.h"
#include "zoUtils/export.h"
#include "zoUtils/input_archive.h"

namespace norv {

// Every stored record begins with its schema number as a variable-length 32-bit value.

// Writes `schema` (reserving 5 bytes first). Requires: schema >= 0.
NORV_API void SerialiseSchema(Archive& archive, int schema);

// Reads a schema number into `schema`. Throws NorvSystemException when it is newer than
// `latestSchema` (a record written by a newer program, which this one must not misread), and
// what the archive throws on truncated or malformed input.
NORV_API void DeserialiseSchema(InputArchive& archive, int latestSchema, int& schema);

}  // namespace norv
