#include <gtest/gtest.h>

#include <pthread.h>

#include <thread>

#include "zoUtils/hp_time.h"
#include "zoUtils/hp_timer.h"
#include "zoUtils/thread_name.h"

namespace norv {
namespace {

TEST(ThreadName, OsSeesTruncatedNameProgramSeesFullName) {
  std::thread t([] {
    EXPECT_EQ(GetThreadName(), "");
    SetThreadName("Dirty Object Set Writer");
    EXPECT_EQ(GetThreadName(), "Dirty Object Set Writer");
    char os[32] = {};
    pthread_getname_np(pthread_self(), os, sizeof os);
    EXPECT_STREQ(os, "Dirty Object Se");
  });
  t.join();
}

TEST(HPTime, TicksAreMonotonicHundredNanoseconds) {
  const std::int64_t a = HPTime::GetTickCount();
  HPTimer timer;
  std::this_thread::sleep_for(std::chrono::milliseconds(20));
  const std::int64_t b = HPTime::GetTickCount();
  EXPECT_GE(b - a, 200000);  // at least 20 ms in 100 ns ticks
  EXPECT_GE(timer.ElapsedMilliSeconds(), 20.0);
  timer.Stop();
  const double frozen = timer.ElapsedSeconds();
  std::this_thread::sleep_for(std::chrono::milliseconds(2));
  EXPECT_EQ(timer.ElapsedSeconds(), frozen);
}

}  // namespace
}  // namespace norv
