#pragma once
// The store implementation over an IFile. Exposed to the tests so that they can run it over a
// fault-injecting file.
#include <memory>

#include "file.h"
#include "zoLss/lss.h"

namespace norv {

// Opens the store held in `file`. An empty file in a writable store becomes a new store
// (`createdNew` set); `truncateFirst` empties it first. Throws CorruptLSSException or
// FileException; `file` is released on failure.
NORV_API ILogStructuredStore* OpenLssOnFile(std::unique_ptr<IFile> file, bool readOnly,
                                            bool truncateFirst, const LssSettings& settings,
                                            bool& createdNew);

}  // namespace norv
