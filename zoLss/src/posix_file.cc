#include <errno.h>
#include <fcntl.h>
#include <string.h>
#include <sys/file.h>
#include <sys/stat.h>
#include <unistd.h>

#include "file.h"
#include "zoLss/lss_exceptions.h"
#include "zoUtils/string_stream.h"

namespace norv {

IFile::~IFile() = default;

namespace {

[[noreturn]] void ThrowErrno(const char* what, const xstring& path, int err) {
  StringStream s;
  s << "zoLss: " << what << " failed on '" << path << "': " << strerror(err);
  throw FileException(s.str(), err);
}

class PosixFile final : public IFile {
 public:
  PosixFile(xstring path, int fd) : path_(std::move(path)), fd_(fd) {}
  ~PosixFile() override { ::close(fd_); }  // closing releases the flock

  std::size_t ReadAt(std::uint64_t offset, void* data, std::size_t size) override {
    std::size_t done = 0;
    while (done < size) {
      ssize_t n = ::pread(fd_, static_cast<char*>(data) + done, size - done,
                          static_cast<off_t>(offset + done));
      if (n < 0) {
        if (errno == EINTR) continue;
        ThrowErrno("read", path_, errno);
      }
      if (n == 0) break;
      done += static_cast<std::size_t>(n);
    }
    return done;
  }
  void WriteAt(std::uint64_t offset, const void* data, std::size_t size) override {
    std::size_t done = 0;
    while (done < size) {
      ssize_t n = ::pwrite(fd_, static_cast<const char*>(data) + done, size - done,
                           static_cast<off_t>(offset + done));
      if (n < 0) {
        if (errno == EINTR) continue;
        ThrowErrno("write", path_, errno);
      }
      done += static_cast<std::size_t>(n);
    }
  }
  void Sync() override {
    if (::fdatasync(fd_) != 0) ThrowErrno("fdatasync", path_, errno);
  }
  void Truncate(std::uint64_t size) override {
    if (::ftruncate(fd_, static_cast<off_t>(size)) != 0) ThrowErrno("ftruncate", path_, errno);
  }
  std::uint64_t Size() override {
    struct stat st;
    if (::fstat(fd_, &st) != 0) ThrowErrno("fstat", path_, errno);
    return static_cast<std::uint64_t>(st.st_size);
  }
  const xstring& Path() const override { return path_; }

 private:
  xstring path_;
  int fd_;
};

}  // namespace

std::unique_ptr<IFile> OpenPosixFile(const xstring& path, int flags, int lockMode) {
  int fd = ::open(path.c_str(), flags | O_CLOEXEC, 0644);
  if (fd < 0) ThrowErrno("open", path, errno);
  if (lockMode != 0) {
    if (::flock(fd, (lockMode == 2 ? LOCK_EX : LOCK_SH) | LOCK_NB) != 0) {
      int err = errno;
      ::close(fd);
      if (err == EWOULDBLOCK) {
        StringStream s;
        s << "zoLss: '" << path << "' is locked by another " << (lockMode == 2 ? "user" : "writer")
          << " of the store";
        throw FileException(s.str(), err);
      }
      ThrowErrno("flock", path, err);
    }
  }
  return std::make_unique<PosixFile>(path, fd);
}

}  // namespace norv
