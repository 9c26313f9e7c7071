// The log-structured store: one append-only log of checksummed records after a file header.
//
// Life cycle of a store:
//
//   OpenLssOnFile --> [recovering] --ok--> [open, writable] --Close--> (freed)
//                          |                    |   `-- write/sync failure --> [failed]
//                          |  read-only mode    v                               (refuses
//                          `------------> [open, read-only] --Close--> (freed)   writes;
//                                                                                Close frees)
//  - recovering: the log is replayed from the header; the first invalid record ends it.
//  - open, writable: end_ is the end of the last whole record; all commits append there.
//  - failed: a write or sync whose effect on disk is unknown happened; every later commit and
//    allocation throws FileException until the file is reopened (recovery then decides).
//
// Invariants crash safety rests on (cited as "(n)" in the code and tests):
//  (1) A record is valid only if its magic, header checksum, sequence number (previous + 1),
//      length (inside the file) and payload checksum all match; replay stops at the first
//      invalid record, so a transaction is applied whole or not at all.
//  (2) An invalid record followed anywhere by a valid one is damage, not a torn tail: open
//      throws CorruptLSSException instead of silently dropping later commits.
//  (3) A writable open truncates the torn tail (and syncs) before anything is appended, so a
//      new record never follows garbage.
//  (4) A transaction's record is handed to the OS with one positioned write before Close
//      returns and before readers can see it; readers see only whole records.
//  (5) Ids are reserved by a durable record before they are handed out; replay treats every
//      reserved id as used, so no id is ever handed out twice, across crashes too.
//  (6) After any failed write or sync the store latches and writes nothing more.
#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <atomic>
#include <cerrno>
#include <condition_variable>
#include <cstring>
#include <exception>
#include <map>
#include <mutex>
#include <shared_mutex>
#include <thread>
#include <unordered_map>
#include <vector>

#include "crc32c.h"
#include "log_format.h"
#include "log_store.h"
#include "zoUtils/norv_system_exception.h"
#include "zoUtils/string_stream.h"
#include "zoUtils/thread_annotations.h"
#include "zoUtils/thread_name.h"

namespace norv {

CorruptLSSException::~CorruptLSSException() = default;
FileException::~FileException() = default;
IContiguousSerialElement::~IContiguousSerialElement() = default;
ILssTransaction::~ILssTransaction() = default;
ILogStructuredStore::~ILogStructuredStore() = default;

xostream& operator<<(xostream& os, Seid seid) {
  os << '(' << seid.GetHigh() << ',' << seid.GetLow() << ')';
  return os;
}

namespace {

using namespace lss_format;

void Put32(std::string& b, std::uint32_t v) {
  for (int i = 0; i < 4; ++i) b.push_back(static_cast<char>(v >> (8 * i)));
}
void Put64(std::string& b, std::uint64_t v) {
  for (int i = 0; i < 8; ++i) b.push_back(static_cast<char>(v >> (8 * i)));
}
std::uint32_t Get32(const unsigned char* p) {
  return p[0] | p[1] << 8 | p[2] << 16 | static_cast<std::uint32_t>(p[3]) << 24;
}
std::uint64_t Get64(const unsigned char* p) {
  return Get32(p) | static_cast<std::uint64_t>(Get32(p + 4)) << 32;
}

[[noreturn]] void ThrowCorrupt(const xstring& path, std::uint64_t offset, const xstring& what) {
  StringStream s;
  s << "zoLss: store file '" << path << "' is damaged at offset " << offset << ": " << what;
  throw CorruptLSSException(s.str());
}

[[noreturn]] void ThrowMisuse(const xstring& path, const char* what) {
  StringStream s;
  s << "zoLss: '" << path << "': " << what;
  throw NorvSystemException(s.str());
}

class LogStore;

// One pending operation of a transaction: a write (bytes) or a deletion.
struct PendingOp {
  bool isDelete = false;
  std::string bytes;
};

class Element final : public IContiguousSerialElement {
 public:
  explicit Element(std::vector<char> b) : bytes_(std::move(b)) {}
  void Close() override { delete this; }
  std::pair<const void*, ssize_t> GetBuffer() const override {
    return {bytes_.data(), static_cast<ssize_t>(bytes_.size())};
  }

 private:
  ~Element() override = default;
  std::vector<char> bytes_;
};

class Transaction final : public ILssTransaction {
 public:
  explicit Transaction(LogStore* store) : store_(store) {}
  void Close() override;
  void RequestFlushToDisk() override { flush_ = true; }
  ICloseableOutputStream* WriteSerialElement(Seid seid) override;
  void DeleteSerialElement(Seid seid) override;
  void Abort() override { delete this; }

  void FinishStream(Seid seid, std::string bytes) {
    PendingOp& op = ops_[seid];
    op.isDelete = false;
    op.bytes = std::move(bytes);
    --openStreams_;
  }

 private:
  ~Transaction() override = default;
  LogStore* store_;
  bool flush_ = false;
  int openStreams_ = 0;
  std::map<Seid, PendingOp> ops_;  // newest operation per element
};

class ElementStream final : public ICloseableOutputStream {
 public:
  ElementStream(Transaction* txn, Seid seid) : txn_(txn), seid_(seid) {}
  void WriteStream(const void* data, ssize_t size) override {
    if (size < 0) throw NorvSystemException("zoLss: WriteStream with a negative size");
    bytes_.append(static_cast<const char*>(data), static_cast<std::size_t>(size));
  }
  void FlushStream() override {}
  void Close() override {
    txn_->FinishStream(seid_, std::move(bytes_));
    delete this;
  }

 private:
  ~ElementStream() override = default;
  Transaction* txn_;
  Seid seid_;
  std::string bytes_;
};

// Where the newest version of an element lies in the file.
struct IndexEntry {
  std::uint64_t offset;
  std::uint32_t size;
  std::uint32_t crc;  // of the element's bytes, checked on every read
};

struct LowRange {
  std::uint64_t next = 0;   // next low to hand out
  std::uint64_t limit = 0;  // lows below this are reserved on disk (5)
};

class LogStore final : public ILogStructuredStore {
 public:
  LogStore(std::unique_ptr<IFile> file, bool readOnly, const LssSettings& settings)
      : file_(std::move(file)), readOnly_(readOnly), settings_(settings) {}

  // Recovers the file (see the life cycle above). Runs before any other thread exists.
  void Open(bool truncateFirst, bool& createdNew) {
    createdNew = false;
    if (truncateFirst) {
      file_->Truncate(0);
    }
    std::uint64_t size = file_->Size();
    if (size == 0 && !readOnly_) {
      WriteFileHeader();
      createdNew = true;
      end_ = kFileHeaderSize;
    } else {
      ReadFileHeader(size);
      Replay(size);
    }
    if (!readOnly_ && settings_.flushTimeMilliSec > 0) {
      flusher_ = std::thread([this] { FlusherMain(); });
    }
  }

  void Close() override {
    StopFlusher();
    std::exception_ptr err;
    {
      std::lock_guard<std::mutex> g(commitMu_);
      err = bgError_;
      if (!readOnly_ && !failed_) {
        try {
          file_->Sync();
        } catch (...) {
          err = std::current_exception();
        }
      }
    }
    delete this;
    if (err) std::rethrow_exception(err);
  }

  // Frees a store whose Open failed, writing nothing.
  void Discard() {
    StopFlusher();
    delete this;
  }

  SeidHigh AllocateSeidHigh() override {
    std::lock_guard<std::mutex> g(commitMu_);
    CheckWritable();
    if (nextHigh_ > 0xFFFFFFFFull) ThrowMisuse(file_->Path(), "all Seid high parts are used");
    SeidHigh h = static_cast<SeidHigh>(nextHigh_);
    std::string payload;
    payload.push_back(static_cast<char>(kOpHighReserve));
    Put32(payload, static_cast<std::uint32_t>(h + 1ull));  // wraps to 0 only at the last one
    AppendRecord(payload);
    nextHigh_ = h + 1ull;
    return h;
  }

  Seid AllocateSeid(SeidHigh high) override {
    std::lock_guard<std::mutex> g(commitMu_);
    CheckWritable();
    if (high == 0) ThrowMisuse(file_->Path(), "AllocateSeid with high part 0");
    LowRange& r = lows_[high];
    if (r.next == r.limit) {
      if (r.limit > 0xFFFFFFFFull) {
        StringStream s;
        s << "all Seid low parts of high part " << high << " are used";
        ThrowMisuse(file_->Path(), s.str().c_str());
      }
      std::uint64_t newLimit = std::min<std::uint64_t>(r.limit + kLowReserveChunk, 1ull << 32);
      std::string payload;
      payload.push_back(static_cast<char>(kOpLowReserve));
      Put32(payload, high);
      Put64(payload, newLimit);
      AppendRecord(payload);
      r.limit = newLimit;
    }
    return Seid(high, static_cast<SeidLow>(r.next++));
  }

  // The next low of the same high part: ids handed out one after the other are adjacent.
  void AllocateAffiliateSeid(Seid& seid) override { seid = AllocateSeid(seid.GetHigh()); }

  IContiguousSerialElement* OpenSerialElement(Seid seid) override {
    IndexEntry e;
    {
      std::shared_lock<std::shared_mutex> g(indexMu_);
      auto it = index_.find(seid.GetValue());
      if (it == index_.end()) return nullptr;
      e = it->second;
    }
    // Records are never moved or overwritten while the store is open, so the entry stays
    // valid after the lock is released.
    std::vector<char> bytes(e.size);
    std::size_t n = file_->ReadAt(e.offset, bytes.data(), e.size);
    if (n != e.size || Crc32c(bytes.data(), e.size) != e.crc) {
      StringStream s;
      s << "element " << seid << " of " << e.size << " bytes fails its checksum";
      ThrowCorrupt(file_->Path(), e.offset, s.str());
    }
    return new Element(std::move(bytes));
  }

  ILssTransaction* OpenTransaction() override {
    if (readOnly_) ThrowMisuse(file_->Path(), "the store is open read-only: no transactions");
    return new Transaction(this);
  }

  LssStats GetStats() override {
    LssStats st;
    {
      std::shared_lock<std::shared_mutex> g(indexMu_);
      st.numSerialElements = static_cast<std::int32_t>(index_.size());
      st.liveBytes = liveBytes_;
    }
    std::lock_guard<std::mutex> g(commitMu_);
    st.fileSize = static_cast<std::int64_t>(end_);
    st.numCommits = static_cast<std::int64_t>(nextSeq_ - 1);
    return st;
  }

  void FlushToDisk() override {
    if (readOnly_) return;
    SyncOrLatch();
  }

  bool IsReadOnly() const override { return readOnly_; }

  // Commits the operations of one transaction (4).
  void Commit(const std::map<Seid, PendingOp>& ops, bool flush) {
    {
      std::lock_guard<std::mutex> g(commitMu_);
      CheckWritable();
    }
    if (ops.empty() && !flush) return;
    std::string payload;
    std::vector<std::pair<std::uint64_t, std::size_t>> dataPos;  // seid, offset in payload
    for (const auto& [seid, op] : ops) {
      if (op.isDelete) {
        payload.push_back(static_cast<char>(kOpDelete));
        Put64(payload, seid.GetValue());
      } else {
        if (op.bytes.size() > kMaxPayloadSize) ThrowMisuse(file_->Path(), "element too large");
        payload.push_back(static_cast<char>(kOpWrite));
        Put64(payload, seid.GetValue());
        Put32(payload, static_cast<std::uint32_t>(op.bytes.size()));
        dataPos.emplace_back(seid.GetValue(), payload.size());
        payload.append(op.bytes);
      }
    }
    if (payload.size() > kMaxPayloadSize) ThrowMisuse(file_->Path(), "transaction too large");
    {
      std::lock_guard<std::mutex> g(commitMu_);
      CheckWritable();
      if (!ops.empty()) {
        std::uint64_t base = AppendRecord(payload) + kRecordHeaderSize;
        std::unique_lock<std::shared_mutex> ig(indexMu_);
        std::size_t w = 0;
        for (const auto& [seid, op] : ops) {
          auto it = index_.find(seid.GetValue());
          if (it != index_.end()) {
            liveBytes_ -= it->second.size;
            index_.erase(it);
          }
          if (!op.isDelete) {
            IndexEntry e{base + dataPos[w++].second, static_cast<std::uint32_t>(op.bytes.size()),
                         Crc32c(op.bytes.data(), op.bytes.size())};
            index_.emplace(seid.GetValue(), e);
            liveBytes_ += e.size;
          }
        }
      }
    }
    if (flush || settings_.flushTimeMilliSec <= 0) {
      SyncOrLatch();
    } else {
      dirty_.store(true, std::memory_order_release);
    }
  }

 private:
  ~LogStore() override = default;

  void CheckWritable() NORV_REQUIRES(commitMu_) {
    if (readOnly_) ThrowMisuse(file_->Path(), "the store is open read-only: writes are refused");
    if (failed_) {
      StringStream s;
      s << "zoLss: '" << file_->Path()
        << "' refuses writes after a failed write or sync; reopen the store";
      throw FileException(s.str(), EIO);
    }
  }

  // Appends one record holding `payload` at end_ and returns its offset (1, 4, 6).
  std::uint64_t AppendRecord(const std::string& payload) NORV_REQUIRES(commitMu_) {
    std::string rec;
    rec.reserve(AlignRecord(kRecordHeaderSize + payload.size()));
    Put32(rec, kRecordMagic);
    Put32(rec, static_cast<std::uint32_t>(payload.size()));
    Put64(rec, nextSeq_);
    Put32(rec, Crc32c(payload.data(), payload.size()));
    Put32(rec, Crc32c(rec.data(), 20));
    rec.append(payload);
    rec.resize(AlignRecord(rec.size()), '\0');
    std::uint64_t at = end_;
    try {
      file_->WriteAt(at, rec.data(), rec.size());
    } catch (...) {
      failed_ = true;  // (6): some prefix may have landed
      throw;
    }
    end_ += rec.size();
    ++nextSeq_;
    return at;
  }

  void SyncOrLatch() {
    try {
      file_->Sync();
    } catch (...) {
      std::lock_guard<std::mutex> g(commitMu_);
      failed_ = true;  // (6)
      throw;
    }
  }

  void WriteFileHeader() {
    std::string h(kFileHeaderSize, '\0');
    std::memcpy(&h[0], kFileMagic, 8);
    std::string f;
    Put32(f, kFormatVersion);
    Put32(f, static_cast<std::uint32_t>(kFileHeaderSize));
    Put32(f, static_cast<std::uint32_t>(settings_.segmentSize));
    std::memcpy(&h[8], f.data(), 12);
    std::uint32_t crc = Crc32c(h.data(), kFileHeaderCrcOffset);
    f.clear();
    Put32(f, crc);
    std::memcpy(&h[kFileHeaderCrcOffset], f.data(), 4);
    file_->WriteAt(0, h.data(), h.size());
    file_->Sync();
  }

  void ReadFileHeader(std::uint64_t size) {
    const xstring& path = file_->Path();
    if (size < kFileHeaderSize) {
      StringStream s;
      s << "file of " << size << " bytes is shorter than its " << kFileHeaderSize << "-byte header";
      ThrowCorrupt(path, 0, s.str());
    }
    unsigned char h[kFileHeaderCrcOffset + 4];
    if (file_->ReadAt(0, h, sizeof h) != sizeof h) ThrowCorrupt(path, 0, "short header read");
    if (std::memcmp(h, kFileMagic, 8) != 0) ThrowCorrupt(path, 0, "not a zoLss file (bad magic)");
    std::uint32_t crc = Get32(h + kFileHeaderCrcOffset);
    if (Crc32c(h, kFileHeaderCrcOffset) != crc) ThrowCorrupt(path, 0, "file header checksum");
    if (Get32(h + 8) != kFormatVersion) {
      StringStream s;
      s << "format version " << Get32(h + 8) << ", expected " << kFormatVersion;
      ThrowCorrupt(path, 8, s.str());
    }
    if (Get32(h + 12) != kFileHeaderSize) ThrowCorrupt(path, 12, "unexpected header size");
  }

  // Reads and checks the record at `pos` (1). Returns false when it is not valid; `why` says
  // what failed. On success `payload` holds its payload.
  bool ReadRecord(std::uint64_t pos, std::uint64_t size, std::uint64_t expectSeq,
                  std::vector<unsigned char>& payload, const char*& why) {
    if (size - pos < kRecordHeaderSize) {
      why = "partial record header at end of file";
      return false;
    }
    unsigned char h[kRecordHeaderSize];
    if (file_->ReadAt(pos, h, sizeof h) != sizeof h) {
      why = "short read";
      return false;
    }
    if (Get32(h) != kRecordMagic) {
      why = "bad record magic";
      return false;
    }
    if (Crc32c(h, 20) != Get32(h + 20)) {
      why = "record header checksum mismatch";
      return false;
    }
    std::uint32_t len = Get32(h + 4);
    if (expectSeq != 0 && Get64(h + 8) != expectSeq) {
      why = "unexpected sequence number";
      return false;
    }
    if (len > kMaxPayloadSize || AlignRecord(kRecordHeaderSize + len) > size - pos) {
      why = "record extends past end of file";
      return false;
    }
    payload.resize(len);
    if (file_->ReadAt(pos + kRecordHeaderSize, payload.data(), len) != len) {
      why = "short read";
      return false;
    }
    if (Crc32c(payload.data(), len) != Get32(h + 16)) {
      why = "record payload checksum mismatch";
      return false;
    }
    return true;
  }

  // Applies one valid record; its content is checked as strictly as the bytes of a hostile
  // file deserve.
  void ApplyRecord(std::uint64_t pos, const std::vector<unsigned char>& p) {
    const xstring& path = file_->Path();
    std::size_t i = 0;
    auto need = [&](std::size_t n) {
      if (p.size() - i < n) ThrowCorrupt(path, pos + kRecordHeaderSize + i, "truncated op");
    };
    while (i < p.size()) {
      std::uint8_t op = p[i++];
      switch (op) {
        case kOpWrite: {
          need(12);
          std::uint64_t seid = Get64(&p[i]);
          std::uint32_t len = Get32(&p[i + 8]);
          i += 12;
          need(len);
          auto it = index_.find(seid);
          if (it != index_.end()) liveBytes_ -= it->second.size;
          index_[seid] = IndexEntry{pos + kRecordHeaderSize + i, len, Crc32c(&p[i], len)};
          liveBytes_ += len;
          i += len;
          break;
        }
        case kOpDelete: {
          need(8);
          auto it = index_.find(Get64(&p[i]));
          if (it != index_.end()) {
            liveBytes_ -= it->second.size;
            index_.erase(it);
          }
          i += 8;
          break;
        }
        case kOpHighReserve: {
          need(4);
          std::uint64_t next = Get32(&p[i]);
          if (next == 0) next = 1ull << 32;  // the last high part was handed out
          nextHigh_ = std::max(nextHigh_, next);
          i += 4;
          break;
        }
        case kOpLowReserve: {
          need(12);
          SeidHigh high = Get32(&p[i]);
          std::uint64_t limit = Get64(&p[i + 4]);
          if (high == 0 || limit > (1ull << 32)) {
            ThrowCorrupt(path, pos + kRecordHeaderSize + i, "bad low reservation");
          }
          LowRange& r = lows_[high];
          r.limit = std::max(r.limit, limit);
          r.next = r.limit;  // (5): whatever was reserved may have been handed out
          i += 12;
          break;
        }
        default: {
          StringStream s;
          s << "unknown operation code " << static_cast<int>(op);
          ThrowCorrupt(path, pos + kRecordHeaderSize + i - 1, s.str());
        }
      }
    }
  }

  // Replays the log (1) and deals with its end (2, 3).
  void Replay(std::uint64_t size) {
    std::uint64_t pos = kFileHeaderSize;
    std::vector<unsigned char> payload;
    const char* why = nullptr;
    while (pos < size && ReadRecord(pos, size, nextSeq_, payload, why)) {
      ApplyRecord(pos, payload);
      pos += AlignRecord(kRecordHeaderSize + payload.size());
      ++nextSeq_;
    }
    if (pos < size) {
      std::uint64_t later = FindValidRecordAfter(pos, size);
      if (later != 0) {
        StringStream s;
        s << why << " (record sequence " << nextSeq_ << "), but a valid record follows at offset "
          << later;
        ThrowCorrupt(file_->Path(), pos, s.str());
      }
      if (!readOnly_) {  // (3)
        file_->Truncate(pos);
        file_->Sync();
      }
    }
    end_ = pos;
  }

  // The offset of a valid record of a later sequence after `pos`, or 0 (2).
  std::uint64_t FindValidRecordAfter(std::uint64_t pos, std::uint64_t size) {
    std::vector<unsigned char> buf(1 << 20);
    std::vector<unsigned char> payload;
    for (std::uint64_t chunk = pos + kRecordAlign; chunk + kRecordHeaderSize <= size;) {
      std::size_t n = file_->ReadAt(chunk, buf.data(), buf.size());
      for (std::size_t off = 0; off + 4 <= n; off += kRecordAlign) {
        if (Get32(&buf[off]) != kRecordMagic) continue;
        const char* why = nullptr;
        if (ReadRecord(chunk + off, size, 0, payload, why)) {
          unsigned char h[kRecordHeaderSize];
          file_->ReadAt(chunk + off, h, sizeof h);
          if (Get64(h + 8) >= nextSeq_) return chunk + off;
        }
      }
      if (n < buf.size()) break;
      chunk += buf.size();
    }
    return 0;
  }

  void FlusherMain() {
    SetThreadName("zoLss flusher");
    std::unique_lock<std::mutex> lk(flushMu_);
    while (!stop_) {
      flushCv_.wait_for(lk, std::chrono::milliseconds(settings_.flushTimeMilliSec));
      if (stop_) break;
      if (!dirty_.exchange(false, std::memory_order_acq_rel)) continue;
      lk.unlock();
      try {
        file_->Sync();
      } catch (...) {  // never escapes the thread: latched, rethrown by Close (6)
        std::lock_guard<std::mutex> g(commitMu_);
        failed_ = true;
        bgError_ = std::current_exception();
        return;
      }
      lk.lock();
    }
  }

  void StopFlusher() {
    if (!flusher_.joinable()) return;
    {
      std::lock_guard<std::mutex> g(flushMu_);
      stop_ = true;
    }
    flushCv_.notify_all();
    flusher_.join();
  }

  const std::unique_ptr<IFile> file_;
  const bool readOnly_;
  const LssSettings settings_;

  // Serialises appends, id allocation and the latch.
  std::mutex commitMu_;
  std::uint64_t end_ NORV_GUARDED_BY(commitMu_) = 0;  // end of the last whole record (3)
  std::uint64_t nextSeq_ NORV_GUARDED_BY(commitMu_) = 1;
  bool failed_ NORV_GUARDED_BY(commitMu_) = false;  // (6)
  std::exception_ptr bgError_ NORV_GUARDED_BY(commitMu_);
  std::uint64_t nextHigh_ NORV_GUARDED_BY(commitMu_) = 1;  // (5)
  std::unordered_map<SeidHigh, LowRange> lows_ NORV_GUARDED_BY(commitMu_);

  // Taken after commitMu_ when both are held.
  std::shared_mutex indexMu_;
  std::unordered_map<std::uint64_t, IndexEntry> index_ NORV_GUARDED_BY(indexMu_);
  std::int64_t liveBytes_ NORV_GUARDED_BY(indexMu_) = 0;

  std::atomic<bool> dirty_{false};  // committed bytes not yet synced by the flusher
  std::mutex flushMu_;
  std::condition_variable flushCv_;
  bool stop_ NORV_GUARDED_BY(flushMu_) = false;
  std::thread flusher_;
};

void Transaction::Close() {
  if (openStreams_ != 0) {
    throw NorvSystemException("zoLss: transaction closed while an element stream is open");
  }
  try {
    store_->Commit(ops_, flush_);
  } catch (...) {
    delete this;
    throw;
  }
  delete this;
}

ICloseableOutputStream* Transaction::WriteSerialElement(Seid seid) {
  if (seid.IsNull()) throw NorvSystemException("zoLss: WriteSerialElement of the null Seid");
  ++openStreams_;
  return new ElementStream(this, seid);
}

void Transaction::DeleteSerialElement(Seid seid) {
  PendingOp& op = ops_[seid];
  op.isDelete = true;
  op.bytes.clear();
}

}  // namespace

ILogStructuredStore* OpenLssOnFile(std::unique_ptr<IFile> file, bool readOnly, bool truncateFirst,
                                   const LssSettings& settings, bool& createdNew) {
  if (settings.segmentSize < 4096) {
    throw NorvSystemException("zoLss: LssSettings.segmentSize must be at least 4096");
  }
  LogStore* store = new LogStore(std::move(file), readOnly, settings);
  try {
    store->Open(truncateFirst, createdNew);
  } catch (...) {
    store->Discard();
    throw;
  }
  return store;
}

ILogStructuredStore* CreateOrOpenLSS(const char* path, const char* /*deltasDirPath*/,
                                     bool& createdNew, EOpenMode mode,
                                     const LssSettings& settings) {
  if (path == nullptr) throw NorvSystemException("zoLss: CreateOrOpenLSS with a null path");
  int extra = settings.enableWriteThrough ? O_DSYNC : 0;
  int flags = 0;
  int lock = 2;
  bool readOnly = false;
  bool truncate = false;
  switch (mode) {
    case OM_CREATE_NEW:
      flags = O_RDWR | O_CREAT | O_EXCL | extra;
      break;
    case OM_CREATE_ALWAYS:
    case OM_DELETE_EXISTING:
      flags = O_RDWR | O_CREAT | extra;
      truncate = true;  // only once the lock is held, never under another writer
      break;
    case OM_OPEN_EXISTING:
      flags = O_RDWR | extra;
      break;
    case OM_OPEN_EXISTING_READ_ONLY:
      flags = O_RDONLY;
      readOnly = true;
      lock = 1;
      break;
    case OM_OPEN_EXISTING_SHARED_READ:
      flags = O_RDONLY;
      readOnly = true;
      lock = 0;
      break;
    case OM_OPEN_ALWAYS:
      flags = O_RDWR | O_CREAT | extra;
      break;
    default: {
      StringStream s;
      s << "zoLss: unknown open mode " << static_cast<int>(mode);
      throw NorvSystemException(s.str());
    }
  }
  return OpenLssOnFile(OpenPosixFile(path, flags, lock), readOnly, truncate, settings, createdNew);
}

}  // namespace norv
