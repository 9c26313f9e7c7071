// Crash and damage tests over the fault-injecting disk: after a power loss at any point, after
// a failed write or sync, and after damage to the bytes, reopening gives exactly a prefix of
// the committed transactions, or CorruptLSSException; never a torn transaction, never wrong
// bytes.
#include <algorithm>
#include <random>
#include <set>
#include <vector>

#include "crc32c.h"
#include "log_format.h"
#include "lss_fixture.h"

namespace norv {
namespace {

void Put(std::string& b, std::uint64_t v, int n) {
  for (int i = 0; i < n; ++i) b.push_back(static_cast<char>(v >> (8 * i)));
}

// A record with correct checksums around `payload` (doc/format.md).
std::string MakeRecordForTest(const std::string& payload, std::uint64_t seq) {
  std::string r;
  Put(r, lss_format::kRecordMagic, 4);
  Put(r, payload.size(), 4);
  Put(r, seq, 8);
  Put(r, Crc32c(payload.data(), payload.size()), 4);
  Put(r, Crc32c(r.data(), 20), 4);
  r += payload;
  r.resize(lss_format::AlignRecord(r.size()), '\0');
  return r;
}

class CrashTest : public ::testing::Test {
 protected:
  // Commits `n` transactions of a few writes and deletions each; states_[i] is the model after
  // i of them. Transactions whose index is in `flushed` request a flush to disk.
  void RunWorkload(int n, const std::set<int>& flushed = {}) {
    disk_ = std::make_shared<FaultDisk>();
    ILogStructuredStore* lss = OpenOnDisk(disk_);
    states_.assign(1, Model());
    std::mt19937 rng(7);
    for (int t = 1; t <= n; ++t) {
      Model m = states_.back();
      ILssTransaction* txn = lss->OpenTransaction();
      for (int k = 0; k < 3; ++k) {
        Seid id(1, rng() % 12);
        if (rng() % 4 == 0) {
          txn->DeleteSerialElement(id);
          m.erase(id.GetValue());
        } else {
          std::string v(rng() % 300, static_cast<char>('a' + t % 26));
          v += std::to_string(t);
          WriteElement(txn, id, v);
          m[id.GetValue()] = v;
        }
      }
      if (flushed.count(t)) txn->RequestFlushToDisk();
      txn->Close();
      states_.push_back(m);
    }
    lss_ = lss;
  }

  // Reopens `image` and returns the index of the committed state it holds, failing the test
  // unless it is one of them, at or after `minState`.
  int CheckRecovered(const std::string& image, int minState) {
    auto disk = DiskWith(image);
    ILogStructuredStore* lss = OpenOnDisk(disk);
    std::vector<std::uint64_t> ids;
    for (int i = 0; i < 12; ++i) ids.push_back(Seid(1, i).GetValue());
    Model got = ReadAll(lss, ids);
    // The store goes on working after recovery (3).
    ILssTransaction* txn = lss->OpenTransaction();
    WriteElement(txn, Seid(9, 9), "after");
    txn->Close();
    lss->Close();
    EXPECT_EQ("after", Reopened(disk, Seid(9, 9)));
    for (int i = static_cast<int>(states_.size()) - 1; i >= 0; --i) {
      if (states_[i] == got) {
        EXPECT_GE(i, minState) << "lost a flushed transaction";
        return i;
      }
    }
    ADD_FAILURE() << "recovered state is no committed prefix (image of " << image.size()
                  << " bytes)";
    return -1;
  }

  static std::string Reopened(const std::shared_ptr<FaultDisk>& disk, Seid id) {
    ILogStructuredStore* lss = OpenOnDisk(disk);
    std::string r = ReadElement(lss, id);
    lss->Close();
    return r;
  }

  std::shared_ptr<FaultDisk> disk_;
  std::vector<Model> states_;
  ILogStructuredStore* lss_ = nullptr;
};

// Every cut of the unsynced tail, torn or garbled, recovers a prefix no shorter than the
// last flushed transaction (1, 3).
TEST_F(CrashTest, PowerLossAtEveryPointKeepsAPrefix) {
  RunWorkload(30, {10, 20});
  std::size_t unsynced = disk_->UnsyncedBytes();
  ASSERT_GT(unsynced, 0u);
  int last = -1;
  for (std::size_t keep = 0; keep <= unsynced; keep += 7) {
    int got = CheckRecovered(disk_->CrashImage(keep, 0), 20);
    EXPECT_GE(got, last) << "keeping more bytes must not recover less";
    last = std::max(last, got);
    CheckRecovered(disk_->CrashImage(keep, 16, static_cast<unsigned>(keep)), 20);
  }
  EXPECT_EQ(30, CheckRecovered(disk_->CrashImage(unsynced, 0), 20));
  lss_->Close();
}

// A SIGKILL loses nothing: everything Close returned for is in the file.
TEST_F(CrashTest, ProcessCrashLosesNoCommittedTransaction) {
  RunWorkload(25);
  std::string image;
  {
    std::lock_guard<std::mutex> g(disk_->mu);
    image = disk_->current;
  }
  EXPECT_EQ(25, CheckRecovered(image, 25));
  lss_->Close();
}

// A write that fails after landing part of its 48-byte record: the commit throws, the store
// latches (6), and reopening gives the state before that transaction. (A write that fails
// after landing whole may be recovered: its outcome is unknown, and the caller was told so.)
TEST_F(CrashTest, FailedWriteLatchesAndRecoversPrefix) {
  for (int err : {EIO, ENOSPC}) {
    for (std::size_t land : {0, 5, 30, 47}) {
      RunWorkload(5);
      disk_->failWriteIn = 1;
      disk_->writeErrno = err;
      disk_->landBytes = land;
      ILssTransaction* txn = lss_->OpenTransaction();
      WriteElement(txn, Seid(1, 1), "lost");
      try {
        txn->Close();
        ADD_FAILURE() << "commit reported success";
      } catch (const FileException& e) {
        EXPECT_EQ(err, e.GetErrno());
      }
      ILssTransaction* again = lss_->OpenTransaction();
      WriteElement(again, Seid(1, 2), "refused");
      EXPECT_THROW(again->Close(), FileException);
      EXPECT_THROW(lss_->AllocateSeid(1), FileException);
      EXPECT_NE("lost", ReadElement(lss_, Seid(1, 1)));
      lss_->Close();
      std::string image;
      {
        std::lock_guard<std::mutex> g(disk_->mu);
        image = disk_->current;
      }
      EXPECT_EQ(5, CheckRecovered(image, 5));
    }
  }
}

TEST_F(CrashTest, FailedSyncIsReportedAndLatched) {
  RunWorkload(3);
  disk_->failSyncIn = 1;
  ILssTransaction* txn = lss_->OpenTransaction();
  WriteElement(txn, Seid(1, 1), "x");
  txn->RequestFlushToDisk();
  EXPECT_THROW(txn->Close(), FileException);
  ILssTransaction* again = lss_->OpenTransaction();
  EXPECT_THROW(again->Close(), FileException);
  lss_->Close();
}

// Ids reserved before a power loss are never handed out again (5).
TEST_F(CrashTest, AllocatedIdsSurvivePowerLoss) {
  disk_ = std::make_shared<FaultDisk>();
  ILogStructuredStore* lss = OpenOnDisk(disk_);
  EXPECT_EQ(1u, lss->AllocateSeidHigh());
  std::set<std::uint64_t> handed;
  for (int i = 0; i < 5000; ++i) handed.insert(lss->AllocateSeid(1).GetValue());
  lss->FlushToDisk();
  SeidHigh h = lss->AllocateSeidHigh();
  lss->Close();
  ILogStructuredStore* again = OpenOnDisk(DiskWith(disk_->CrashImage(1u << 30, 0)));
  for (int i = 0; i < 5000; ++i) {
    EXPECT_EQ(0u, handed.count(again->AllocateSeid(1).GetValue()));
  }
  EXPECT_GT(again->AllocateSeidHigh(), h);
  again->Close();
}

class DamageTest : public CrashTest {};

// A bit flipped anywhere: open reports corruption, or recovers a committed prefix (a flip in
// the last record reads as a torn tail); no read ever returns wrong bytes (2).
TEST_F(DamageTest, FlippedBitsNeverGiveWrongData) {
  RunWorkload(12);
  lss_->Close();
  std::string good = disk_->CrashImage(1u << 30, 0);
  int corrupt = 0;
  for (std::size_t off = 0; off < good.size(); off += (off < 4096 ? 509 : 13)) {
    std::string bad = good;
    bad[off] = static_cast<char>(bad[off] ^ (1 << (off % 8)));
    try {
      CheckRecovered(bad, 0);
    } catch (const CorruptLSSException& e) {
      ++corrupt;
      EXPECT_NE(std::string::npos, std::string(e.what()).find("damaged at offset")) << e.what();
    }
  }
  EXPECT_GT(corrupt, 0);
}

TEST_F(DamageTest, TruncatedFileRecoversPrefixOrReportsCorruption) {
  RunWorkload(12);
  lss_->Close();
  std::string good = disk_->CrashImage(1u << 30, 0);
  for (std::size_t len = 1; len < good.size(); len += (len < 4096 ? 1021 : 11)) {
    if (len < 4096) {
      EXPECT_THROW(OpenOnDisk(DiskWith(good.substr(0, len))), CorruptLSSException);
    } else {
      CheckRecovered(good.substr(0, len), 0);
    }
  }
}

TEST_F(DamageTest, GarbageHeaderIsCorruption) {
  RunWorkload(2);
  lss_->Close();
  std::string img = disk_->CrashImage(1u << 30, 0);
  for (std::size_t off : {0, 9, 13, 17, 21}) {
    std::string bad = img;
    bad[off] = static_cast<char>(~bad[off]);
    try {
      OpenOnDisk(DiskWith(bad))->Close();
      ADD_FAILURE() << "garbage header accepted, byte " << off;
    } catch (const CorruptLSSException& e) {
      EXPECT_NE(std::string::npos, std::string(e.what()).find("fault-disk")) << e.what();
    }
  }
  std::string noise(8192, '\x5a');
  EXPECT_THROW(OpenOnDisk(DiskWith(noise)), CorruptLSSException);
}

// A record with valid checksums but hostile content (lengths past its end, unknown codes) is
// reported, not trusted.
TEST_F(DamageTest, HostileRecordContentIsCorruption) {
  RunWorkload(1);
  lss_->Close();
  std::string img = disk_->CrashImage(1u << 30, 0);
  ASSERT_GT(img.size(), 4096u + 24);
  std::vector<std::string> payloads = {std::string("\x07", 1), std::string("\x01\x01\x00", 3),
                                       std::string("\x01\x01\x00\x00\x00\x00\x00\x00\x00"
                                                   "\xff\xff\x00\x00",
                                                   13),
                                       std::string("\x04\x00\x00\x00\x00\x01\x00\x00\x00"
                                                   "\x00\x00\x00\x00",
                                                   13)};
  for (const std::string& p : payloads) {
    std::string bad = img.substr(0, 4096) + MakeRecordForTest(p, 1);
    EXPECT_THROW(OpenOnDisk(DiskWith(bad)), CorruptLSSException);
  }
}

// Bytes damaged after open are caught by the per-element checksum.
TEST_F(DamageTest, ReadOfDamagedElementThrows) {
  RunWorkload(3);
  std::uint64_t id = states_.back().begin()->first;
  {
    std::lock_guard<std::mutex> g(disk_->mu);
    std::size_t at = disk_->current.rfind(states_.back().begin()->second);
    ASSERT_NE(std::string::npos, at);
    disk_->current[at] ^= 1;
  }
  EXPECT_THROW(ReadElement(lss_, Seid::FromValue(id)), CorruptLSSException);
  lss_->Close();
}

}  // namespace
}  // namespace norv
