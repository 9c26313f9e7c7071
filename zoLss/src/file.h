#pragma once
// The small file interface through which every byte of the store file passes, so that tests
// can inject I/O errors, short writes and crashes (see tests/fault_file.h).
#include <cstddef>
#include <cstdint>
#include <memory>

#include "zoUtils/export.h"
#include "zoUtils/xstring.h"

namespace norv {

// Thread-safety: ReadAt may run concurrently with everything; WriteAt, Sync and Truncate are
// called by one thread at a time (the store's commit lock).
class NORV_API IFile {
 public:
  virtual ~IFile();
  // Reads exactly `size` bytes at `offset`; returns the number read (less only at end of file).
  // Throws FileException on an I/O error.
  virtual std::size_t ReadAt(std::uint64_t offset, void* data, std::size_t size) = 0;
  // Writes all bytes at `offset` or throws FileException (some prefix may have landed).
  virtual void WriteAt(std::uint64_t offset, const void* data, std::size_t size) = 0;
  virtual void Sync() = 0;
  virtual void Truncate(std::uint64_t size) = 0;
  virtual std::uint64_t Size() = 0;
  virtual const xstring& Path() const = 0;
};

// Opens a POSIX file; `flags` are open(2) flags. Takes an flock: exclusive when `lockMode` is
// 2, shared when 1, none when 0, and refuses with FileException when it is held elsewhere.
NORV_API std::unique_ptr<IFile> OpenPosixFile(const xstring& path, int flags, int lockMode);

}  // namespace norv
