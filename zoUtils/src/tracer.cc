#include "zoUtils/tracer.h"

#include <cstdio>
#include <mutex>

namespace norv {

namespace {
std::mutex& SinkMutex() {
  static std::mutex m;
  return m;
}
TracerX::Sink& CurrentSink() {
  static TracerX::Sink sink;
  return sink;
}
}  // namespace

TracerX::~TracerX() {
  if (str().empty()) return;
  try {
    Emit(str());
  } catch (...) {
    // A trace line that cannot be delivered is dropped; tracing never fails its caller.
  }
}

TracerX::Sink TracerX::SetSink(Sink sink) {
  std::lock_guard<std::mutex> lock(SinkMutex());
  Sink previous = std::move(CurrentSink());
  CurrentSink() = std::move(sink);
  return previous;
}

void TracerX::Emit(const xstring& message) {
  std::lock_guard<std::mutex> lock(SinkMutex());
  if (CurrentSink()) {
    CurrentSink()(message);
  } else {
    std::fwrite(message.data(), 1, message.size(), stderr);
    std::fflush(stderr);
  }
}

void TraceAssertionError(const char* file, const char* expression, int line) {
  TracerX t;
  t << "ASSERTION FAILED: " << expression << " at " << file << ":" << line << "\n";
}

}  // namespace norv
