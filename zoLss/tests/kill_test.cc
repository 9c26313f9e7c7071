// A real child process commits transactions and is killed with SIGKILL at a random moment,
// round after round; every transaction whose Close returned (reported through a pipe) must be
// in the store, whole, and no id may be handed out twice. Rounds: ZOLSS_KILL_ROUNDS, else
// ZOLSS_KILL_DEFAULT_ROUNDS.
#include <gtest/gtest.h>
#include <signal.h>
#include <sys/wait.h>
#include <unistd.h>

#include <cstdlib>
#include <filesystem>
#include <random>
#include <string>

#include "zoLss/lss.h"

#ifndef ZOLSS_KILL_DEFAULT_ROUNDS
#define ZOLSS_KILL_DEFAULT_ROUNDS 4
#endif

namespace norv {
namespace {

constexpr int kSlots = 50;

std::string Read(ILogStructuredStore* lss, Seid id) {
  IContiguousSerialElement* e = lss->OpenSerialElement(id);
  if (e == nullptr) return "";
  auto [p, n] = e->GetBuffer();
  std::string r(static_cast<const char*>(p), static_cast<std::size_t>(n));
  e->Close();
  return r;
}

void Write(ILssTransaction* txn, Seid id, const std::string& v) {
  ICloseableOutputStream* s = txn->WriteSerialElement(id);
  s->WriteStream(v.data(), static_cast<ssize_t>(v.size()));
  s->Close();
}

// Child: transaction n writes counter (2,0) = "n maxLow" and slot (2, 1 + n % kSlots) = n.
[[noreturn]] void ChildMain(const std::string& path, int fd) {
  try {
    bool c;
    LssSettings s;
    ILogStructuredStore* lss = CreateOrOpenLSS(path.c_str(), nullptr, c, OM_OPEN_ALWAYS, s);
    std::string counter = Read(lss, Seid(2, 0));
    long n = counter.empty() ? 0 : std::stol(counter);
    for (;;) {
      ++n;
      Seid id = lss->AllocateSeid(1);
      ILssTransaction* txn = lss->OpenTransaction();
      Write(txn, Seid(2, 0), std::to_string(n) + " " + std::to_string(id.GetLow()));
      Write(txn, Seid(2, 1 + n % kSlots), std::to_string(n) + std::string(n % 700, 'x'));
      if (n % 16 == 0) txn->RequestFlushToDisk();
      txn->Close();
      if (write(fd, &n, sizeof n) != sizeof n) _exit(3);
    }
  } catch (...) {
    _exit(2);
  }
}

TEST(KillTest, SigkillNeverLosesACommittedTransaction) {
  int rounds = ZOLSS_KILL_DEFAULT_ROUNDS;
  if (const char* env = std::getenv("ZOLSS_KILL_ROUNDS")) rounds = std::atoi(env);
  char tmpl[] = "/tmp/zolss_kill_XXXXXX";
  std::string dir = mkdtemp(tmpl);
  std::string path = dir + "/store.lss";
  std::mt19937 rng(1234);
  long maxLowSeen = -1;
  long lastCommitted = 0;
  for (int round = 0; round < rounds; ++round) {
    int fds[2];
    ASSERT_EQ(0, pipe(fds));
    pid_t pid = fork();
    ASSERT_GE(pid, 0);
    if (pid == 0) {
      close(fds[0]);
      ChildMain(path, fds[1]);
    }
    close(fds[1]);
    usleep(2000 + rng() % 40000);
    kill(pid, SIGKILL);
    int status = 0;
    waitpid(pid, &status, 0);
    ASSERT_TRUE(WIFSIGNALED(status)) << "child ended by itself, status " << status;
    long reported = 0, n = 0;
    while (read(fds[0], &n, sizeof n) == sizeof n) reported = n;
    close(fds[0]);

    bool c;
    LssSettings s;
    ILogStructuredStore* lss = CreateOrOpenLSS(path.c_str(), nullptr, c, OM_OPEN_EXISTING, s);
    std::string counter = Read(lss, Seid(2, 0));
    long committed = counter.empty() ? 0 : std::stol(counter);
    long low = counter.empty() ? -1 : std::stol(counter.substr(counter.find(' ') + 1));
    EXPECT_GE(committed, reported) << "round " << round;
    EXPECT_GE(committed, lastCommitted) << "round " << round;
    if (committed > lastCommitted) {  // a new transaction holds an id never seen before (5)
      EXPECT_GT(low, maxLowSeen) << "round " << round;
    }
    lastCommitted = committed;
    maxLowSeen = std::max(maxLowSeen, low);
    for (int k = 0; k < kSlots; ++k) {  // every slot holds the newest transaction that wrote it
      long newest = committed - ((committed - k) % kSlots + kSlots) % kSlots;
      if (newest <= 0) continue;
      std::string want = std::to_string(newest) + std::string(newest % 700, 'x');
      ASSERT_EQ(want, Read(lss, Seid(2, 1 + newest % kSlots))) << "round " << round;
    }
    EXPECT_GT(static_cast<long>(lss->AllocateSeid(1).GetLow()), maxLowSeen);
    lss->Close();
  }
  std::filesystem::remove_all(dir);
}

}  // namespace
}  // namespace norv
