// The store's behaviour over real files: ids, open modes, file locks, read-only refusal,
// the random model test with reopen, and reads concurrent with commits.
#include <sys/wait.h>
#include <unistd.h>

#include <atomic>
#include <cstdio>
#include <filesystem>
#include <random>
#include <thread>

#include "lss_fixture.h"
#include "zoUtils/norv_system_exception.h"
#include "zoUtils/string_stream.h"

namespace norv {
namespace {

class LssTest : public ::testing::Test {
 protected:
  void SetUp() override {
    char tmpl[] = "/tmp/zolss_test_XXXXXX";
    dir_ = mkdtemp(tmpl);
    path_ = dir_ + "/store.lss";
  }
  void TearDown() override { std::filesystem::remove_all(dir_); }

  ILogStructuredStore* Open(EOpenMode mode, bool* createdNew = nullptr) {
    bool c = false;
    ILogStructuredStore* lss = CreateOrOpenLSS(path_.c_str(), nullptr, c, mode, settings_);
    if (createdNew) *createdNew = c;
    return lss;
  }
  void Commit(ILogStructuredStore* lss, Seid id, const std::string& v) {
    ILssTransaction* txn = lss->OpenTransaction();
    WriteElement(txn, id, v);
    txn->Close();
  }

  std::string dir_, path_;
  LssSettings settings_;
};

TEST_F(LssTest, FreshStoreHandsOutHighOneThenLowsFromZero) {
  bool created = false;
  ILogStructuredStore* lss = Open(OM_CREATE_NEW, &created);
  EXPECT_TRUE(created);
  SeidHigh h = lss->AllocateSeidHigh();
  EXPECT_EQ(1u, h);
  EXPECT_EQ(Seid(1, 0), lss->AllocateSeid(h));
  EXPECT_EQ(Seid(1, 1), lss->AllocateSeid(h));
  Seid a(1, 1);
  lss->AllocateAffiliateSeid(a);
  EXPECT_EQ(Seid(1, 2), a);
  EXPECT_EQ(2u, lss->AllocateSeidHigh());
  EXPECT_THROW(lss->AllocateSeid(0), NorvSystemException);
  lss->Close();
  lss = Open(OM_OPEN_EXISTING, &created);
  EXPECT_FALSE(created);
  EXPECT_EQ(3u, lss->AllocateSeidHigh());
  EXPECT_LT(Seid(1, 2), lss->AllocateSeid(1));
  lss->Close();
  StringStream s;
  s << Seid(1, 0) << ' ' << Seid(0xFFFFFFFFu, 7);
  EXPECT_EQ("(1,0) (4294967295,7)", s.str());
}

TEST_F(LssTest, OpenModesTreatTheFileAsNamed) {
  EXPECT_THROW(Open(OM_OPEN_EXISTING), FileException);
  EXPECT_THROW(Open(OM_OPEN_EXISTING_READ_ONLY), FileException);
  bool created = false;
  ILogStructuredStore* lss = Open(OM_OPEN_ALWAYS, &created);
  EXPECT_TRUE(created);
  Commit(lss, Seid(1, 5), "five");
  lss->Close();
  EXPECT_THROW(Open(OM_CREATE_NEW), FileException);
  lss = Open(OM_OPEN_ALWAYS, &created);
  EXPECT_FALSE(created);
  EXPECT_EQ("five", ReadElement(lss, Seid(1, 5)));
  lss->Close();
  for (EOpenMode m : {OM_CREATE_ALWAYS, OM_DELETE_EXISTING}) {
    lss = Open(OM_OPEN_EXISTING);
    Commit(lss, Seid(1, 5), "five");
    lss->Close();
    lss = Open(m, &created);
    EXPECT_TRUE(created);
    EXPECT_EQ(nullptr, lss->OpenSerialElement(Seid(1, 5)));
    EXPECT_EQ(0, lss->GetStats().numSerialElements);
    EXPECT_EQ(1u, lss->AllocateSeidHigh());
    lss->Close();
  }
  EXPECT_THROW(Open(static_cast<EOpenMode>(7)), NorvSystemException);
}

TEST_F(LssTest, SecondWriterIsRefusedInThisAndAnotherProcess) {
  ILogStructuredStore* lss = Open(OM_CREATE_NEW);
  Commit(lss, Seid(1, 1), "one");
  EXPECT_THROW(Open(OM_OPEN_EXISTING), FileException);
  EXPECT_THROW(Open(OM_CREATE_ALWAYS), FileException);
  EXPECT_THROW(Open(OM_OPEN_EXISTING_READ_ONLY), FileException);
  pid_t pid = fork();
  if (pid == 0) {
    int code = 0;
    try {
      bool c;
      CreateOrOpenLSS(path_.c_str(), nullptr, c, OM_OPEN_EXISTING, settings_);
      code = 1;
    } catch (const FileException&) {
      code = 0;
    } catch (...) {
      code = 2;
    }
    _exit(code);
  }
  int status = 0;
  ASSERT_EQ(pid, waitpid(pid, &status, 0));
  EXPECT_TRUE(WIFEXITED(status) && WEXITSTATUS(status) == 0) << status;
  // A shared reader sees committed data next to the writer; the refused opens left it alone.
  ILogStructuredStore* reader = Open(OM_OPEN_EXISTING_SHARED_READ);
  EXPECT_EQ("one", ReadElement(reader, Seid(1, 1)));
  reader->Close();
  lss->Close();
  lss = Open(OM_OPEN_EXISTING);
  EXPECT_EQ("one", ReadElement(lss, Seid(1, 1)));
  lss->Close();
}

TEST_F(LssTest, ReadOnlyModesRefuseWrites) {
  ILogStructuredStore* lss = Open(OM_CREATE_NEW);
  Commit(lss, Seid(1, 1), "one");
  lss->Close();
  for (EOpenMode m : {OM_OPEN_EXISTING_READ_ONLY, OM_OPEN_EXISTING_SHARED_READ}) {
    lss = Open(m);
    EXPECT_TRUE(lss->IsReadOnly());
    EXPECT_EQ("one", ReadElement(lss, Seid(1, 1)));
    EXPECT_THROW(lss->OpenTransaction(), NorvSystemException);
    EXPECT_THROW(lss->AllocateSeidHigh(), NorvSystemException);
    EXPECT_THROW(lss->AllocateSeid(1), NorvSystemException);
    if (m == OM_OPEN_EXISTING_READ_ONLY) {
      EXPECT_THROW(Open(OM_OPEN_EXISTING), FileException);
    }
    lss->Close();
  }
}

// Random transactions checked against a model, with reopen at random points.
TEST_F(LssTest, RandomTransactionsMatchModelAcrossReopen) {
  std::mt19937 rng(42);
  Model model;
  std::set<std::uint64_t> ids;
  std::set<std::uint64_t> handed;
  ILogStructuredStore* lss = Open(OM_CREATE_NEW);
  for (int step = 0; step < 400; ++step) {
    int what = static_cast<int>(rng() % 20);
    if (what == 0) {
      lss->Close();
      lss = Open(OM_OPEN_EXISTING);
    } else if (what == 1) {
      Seid s = lss->AllocateSeid(1 + rng() % 3);
      EXPECT_TRUE(handed.insert(s.GetValue()).second) << "id handed out twice: " << s.GetValue();
    } else {
      ILssTransaction* txn = lss->OpenTransaction();
      Model next = model;
      int n = 1 + static_cast<int>(rng() % 8);
      for (int k = 0; k < n; ++k) {
        Seid id(1 + rng() % 2, rng() % 40);
        ids.insert(id.GetValue());
        if (rng() % 5 == 0) {
          txn->DeleteSerialElement(id);
          next.erase(id.GetValue());
        } else {
          std::string v(rng() % 2000, static_cast<char>(rng()));
          WriteElement(txn, id, v);
          next[id.GetValue()] = v;
        }
      }
      if (rng() % 10 == 0) {
        txn->Abort();
      } else {
        if (rng() % 10 == 0) txn->RequestFlushToDisk();
        txn->Close();
        model = next;
      }
    }
    if (step % 50 == 0) {
      ASSERT_EQ(model, ReadAll(lss, ids)) << "step " << step;
    }
  }
  EXPECT_EQ(model, ReadAll(lss, ids));
  LssStats st = lss->GetStats();
  EXPECT_EQ(static_cast<std::int32_t>(model.size()), st.numSerialElements);
  std::int64_t live = 0;
  for (auto& [k, v] : model) live += static_cast<std::int64_t>(v.size());
  EXPECT_EQ(live, st.liveBytes);
  lss->Close();
  lss = Open(OM_OPEN_EXISTING_READ_ONLY);
  EXPECT_EQ(model, ReadAll(lss, ids));
  lss->Close();
}

// Readers on other threads see each element either before or after a commit, whole; several
// transactions are built at once and commit one at a time.
TEST_F(LssTest, ReadsAreSafeWhileOtherThreadsCommit) {
  settings_.flushTimeMilliSec = 5;  // the background flusher runs too
  ILogStructuredStore* lss = Open(OM_CREATE_NEW);
  for (int i = 0; i < 8; ++i) Commit(lss, Seid(1, i), std::string(64, 'a'));
  std::atomic<bool> stop{false};
  std::atomic<int> bad{0};
  std::vector<std::thread> threads;
  for (int r = 0; r < 2; ++r) {
    threads.emplace_back([&] {
      while (!stop) {
        for (int i = 0; i < 8; ++i) {
          std::string v = ReadElement(lss, Seid(1, i));
          if (v.size() != 64 || v.find_first_not_of(v[0]) != std::string::npos) ++bad;
        }
      }
    });
  }
  std::vector<std::thread> writers;
  for (int w = 0; w < 2; ++w) {
    writers.emplace_back([&, w] {
      for (int t = 0; t < 200; ++t) {
        ILssTransaction* txn = lss->OpenTransaction();
        for (int i = 0; i < 8; ++i) {
          WriteElement(txn, Seid(1, i), std::string(64, static_cast<char>('b' + (t + w) % 20)));
        }
        lss->AllocateSeid(2);
        txn->Close();
      }
    });
  }
  for (auto& t : writers) t.join();
  stop = true;
  for (auto& t : threads) t.join();
  EXPECT_EQ(0, bad.load());
  lss->Close();
}

}  // namespace
}  // namespace norv
