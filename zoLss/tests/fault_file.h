#pragma once
// An in-memory IFile whose disk can fail writes and syncs, land only a prefix of a write, and
// act out a power loss: every byte since the last sync may be kept, dropped or garbled.
#include <cerrno>
#include <cstring>
#include <memory>
#include <mutex>
#include <random>
#include <string>

#include "file.h"
#include "zoLss/lss_exceptions.h"

namespace norv {

// The disk behind one or more FaultFiles (one at a time). Thread-safe.
struct FaultDisk {
  std::mutex mu;
  std::string current;  // what reads see
  std::string durable;  // what survives a power loss for certain
  // Fault plan: the Nth write from now (1-based) fails with writeErrno after landing
  // `landBytes` of its bytes; the Nth sync fails with syncErrno. 0: never.
  int failWriteIn = 0;
  int writeErrno = EIO;
  std::size_t landBytes = 0;
  int failSyncIn = 0;
  int syncErrno = EIO;
  int numWrites = 0;
  int numSyncs = 0;

  // The file after a power loss that kept `keep` of the unsynced bytes beyond the durable
  // image and garbled the last `garble` of them.
  std::string CrashImage(std::size_t keep, std::size_t garble, unsigned seed = 1) {
    std::lock_guard<std::mutex> g(mu);
    if (current.compare(0, durable.size(), durable) != 0 || current.size() < durable.size()) {
      return durable;
    }
    keep = std::min(keep, current.size() - durable.size());
    std::string img = current.substr(0, durable.size() + keep);
    std::mt19937 rng(seed);
    for (std::size_t i = img.size() - std::min(garble, keep); i < img.size(); ++i) {
      img[i] = static_cast<char>(rng());
    }
    return img;
  }
  std::size_t UnsyncedBytes() {
    std::lock_guard<std::mutex> g(mu);
    return current.size() > durable.size() ? current.size() - durable.size() : 0;
  }
};

class FaultFile final : public IFile {
 public:
  explicit FaultFile(std::shared_ptr<FaultDisk> disk) : disk_(std::move(disk)) {}

  std::size_t ReadAt(std::uint64_t offset, void* data, std::size_t size) override {
    std::lock_guard<std::mutex> g(disk_->mu);
    const std::string& c = disk_->current;
    if (offset >= c.size()) return 0;
    std::size_t n = std::min<std::size_t>(size, c.size() - offset);
    std::memcpy(data, c.data() + offset, n);
    return n;
  }
  void WriteAt(std::uint64_t offset, const void* data, std::size_t size) override {
    std::lock_guard<std::mutex> g(disk_->mu);
    ++disk_->numWrites;
    std::size_t land = size;
    bool fail = disk_->failWriteIn > 0 && --disk_->failWriteIn == 0;
    if (fail) land = std::min(size, disk_->landBytes);
    std::string& c = disk_->current;
    if (c.size() < offset + land) c.resize(offset + land, '\0');
    std::memcpy(&c[offset], data, land);
    if (fail) throw FileException("injected write failure", disk_->writeErrno);
  }
  void Sync() override {
    std::lock_guard<std::mutex> g(disk_->mu);
    ++disk_->numSyncs;
    if (disk_->failSyncIn > 0 && --disk_->failSyncIn == 0) {
      throw FileException("injected sync failure", disk_->syncErrno);
    }
    disk_->durable = disk_->current;
  }
  void Truncate(std::uint64_t size) override {
    std::lock_guard<std::mutex> g(disk_->mu);
    disk_->current.resize(size);
  }
  std::uint64_t Size() override {
    std::lock_guard<std::mutex> g(disk_->mu);
    return disk_->current.size();
  }
  const xstring& Path() const override { return path_; }

 private:
  std::shared_ptr<FaultDisk> disk_;
  xstring path_ = "fault-disk";
};

}  // namespace norv
