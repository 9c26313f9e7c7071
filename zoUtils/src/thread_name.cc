#include "zoUtils/thread_name.h"

#include <pthread.h>

namespace norv {

namespace {
thread_local xstring tThreadName;
constexpr std::size_t kOsNameLimit = 15;  // Linux: 16 bytes with the terminator
}  // namespace

void SetThreadName(const xstring& name) {
  tThreadName = name;
  const xstring osName = name.substr(0, kOsNameLimit);
  pthread_setname_np(pthread_self(), osName.c_str());
}

const xstring& GetThreadName() { return tThreadName; }

}  // namespace norv
