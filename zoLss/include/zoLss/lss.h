#pragma once
// The log-structured store: a file of serial elements, each a byte string named by a Seid,
// changed by transactions that commit atomically.
//
// Thread-safety summary (details at each call):
//  - ILogStructuredStore: every operation except Close may be called from any thread at any
//    time. Close must be the last call, after every transaction is closed.
//  - ILssTransaction: one thread at a time per transaction; several transactions may be built
//    on different threads at once; their Close calls commit one at a time.
//  - IContiguousSerialElement: its bytes are private to the caller; safe to read from any
//    thread until Close.
#include <sys/types.h>

#include <cstddef>
#include <cstdint>
#include <utility>

#include "zoLss/lss_exceptions.h"
#include "zoLss/lss_settings.h"
#include "zoLss/seid.h"
#include "zoUtils/export.h"
#include "zoUtils/output_stream.h"

namespace norv {

// An output stream that is closed once its writer (an Archive) is done.
class NORV_API ICloseableOutputStream : public IOutputStream {
 public:
  // Hands the bytes to the transaction and frees the stream. The pointer dangles afterwards.
  virtual void Close() = 0;
};

// A copy of one element's bytes, taken when it was opened.
class NORV_API IContiguousSerialElement {
 public:
  // Frees the element. The pointer and the buffer dangle afterwards.
  virtual void Close() = 0;
  // (first byte, size in bytes); valid until Close.
  virtual std::pair<const void*, ssize_t> GetBuffer() const = 0;

 protected:
  virtual ~IContiguousSerialElement();
};

// A set of writes and deletions that commit as one unit. Later operations on the same Seid
// replace earlier ones of the same transaction.
class NORV_API ILssTransaction {
 public:
  // Commits and frees the transaction: after it returns every write and deletion is visible
  // to readers and has been handed to the operating system (survives a process crash); with
  // RequestFlushToDisk it is also on the disk. Throws FileException when the commit failed (the
  // transaction is then freed all the same and nothing of it is visible). Open streams of the
  // transaction must be closed first.
  virtual void Close() = 0;
  virtual void RequestFlushToDisk() = 0;
  // A stream whose bytes replace or create the element at commit. Throws for the null Seid.
  virtual ICloseableOutputStream* WriteSerialElement(Seid seid) = 0;
  virtual void DeleteSerialElement(Seid seid) = 0;
  // Frees the transaction without committing anything.
  virtual void Abort() = 0;

 protected:
  virtual ~ILssTransaction();
};

struct LssStats {
  std::int32_t numSerialElements = 0;  // live elements
  std::int64_t fileSize = 0;           // bytes of the store file
  std::int64_t liveBytes = 0;          // bytes of the newest version of every element
  std::int64_t numCommits = 0;         // records in the log (transactions and reservations)
};

class NORV_API ILogStructuredStore {
 public:
  // Flushes to disk, releases the file lock and frees the store. Throws a latched background
  // flush error (FileException); the store is freed all the same.
  virtual void Close() = 0;
  // A high part never handed out before (durable before it returns).
  virtual SeidHigh AllocateSeidHigh() = 0;
  // A Seid with that high part never handed out before. Throws for high part 0.
  virtual Seid AllocateSeid(SeidHigh high) = 0;
  // Replaces `seid` with a new Seid of the same high part, near it.
  virtual void AllocateAffiliateSeid(Seid& seid) = 0;
  // A copy of the newest committed version, or null when there is no such element. Throws
  // CorruptLSSException when the stored bytes fail their checksum.
  virtual IContiguousSerialElement* OpenSerialElement(Seid seid) = 0;
  virtual ILssTransaction* OpenTransaction() = 0;
  virtual LssStats GetStats() = 0;
  // Makes every committed transaction durable now.
  virtual void FlushToDisk() = 0;
  virtual bool IsReadOnly() const = 0;

 protected:
  virtual ~ILogStructuredStore();
};

// Opens or creates the store file at `path`. `deltasDirPath` is unused and may be null.
// Sets `createdNew` when a new empty store was made. Throws FileException (missing file,
// existing file for OM_CREATE_NEW, lock held by another writer, I/O error) or
// CorruptLSSException; never returns null.
NORV_API ILogStructuredStore* CreateOrOpenLSS(const char* path, const char* deltasDirPath,
                                              bool& createdNew, EOpenMode mode,
                                              const LssSettings& settings);

}  // namespace norv
