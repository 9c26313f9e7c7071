#pragma once
// Open modes and settings of the log-structured store. The field order of LssSettings is part
// of the store's reflected interface: never reorder.
#include <cstdint>

namespace norv {

// How CreateOrOpenLSS treats the file (values are stable).
enum EOpenMode {
  OM_CREATE_NEW = 0,                 // create; fail if the file exists
  OM_CREATE_ALWAYS = 1,              // create, replacing any existing file
  OM_OPEN_EXISTING = 2,              // open for reading and writing; fail if missing
  OM_OPEN_EXISTING_READ_ONLY = 3,    // open read-only; excludes writers (shared file lock)
  OM_OPEN_EXISTING_SHARED_READ = 4,  // open read-only without a lock (snapshot at open)
  OM_OPEN_ALWAYS = 5,                // open if it exists, otherwise create
  OM_DELETE_EXISTING = 6,            // delete any existing file, then create a new one
};

struct LssSettings {
  // Committed bytes reach the disk within this many milliseconds (background flush).
  // 0 or less: every commit is synced before its Close returns.
  std::int32_t flushTimeMilliSec = 1000;
  double cleanerUtilisationPercent = 85.0;      // not yet used: no cleaner yet
  bool enableFileBuffering = false;             // not yet mapped to an open flag
  bool enableWriteThrough = false;              // true: the file is opened with O_DSYNC
  std::int32_t maxNumSegmentsInCache = 32;      // not yet used: no segment cache yet
  std::int32_t numSegmentsPerCheckPoint = 128;  // not yet used: no checkpoints yet
  std::int32_t segmentSize = 524288;            // recorded in the file header; must be >= 4096
  bool forceIncrementMSSN = false;              // not yet used
  bool validateSUTDuringCheckPoint = false;     // not yet used
};

}  // namespace norv
