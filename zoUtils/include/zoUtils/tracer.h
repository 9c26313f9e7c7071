#pragma once
#include <functional>

#include "zoUtils/export.h"
#include "zoUtils/string_stream.h"

namespace norv {

// The trace stream: diagnostics that are not errors of the caller. Each TracerX collects one
// message and hands it, whole, to the current sink when destroyed, so messages written from
// several threads never interleave. The default sink writes to stderr.
//
//   { TracerX t; t << "OidHighConversionMap: unknown remote OidHigh = "; WriteHex(t, h, 4); }
class NORV_API TracerX : public StringStream {
 public:
  using Sink = std::function<void(const xstring& message)>;

  TracerX() = default;
  ~TracerX() override;

  // Replaces the sink (an empty Sink restores stderr) and returns the previous one.
  // Thread-safety: any thread; messages in flight go to the old or the new sink, whole.
  static Sink SetSink(Sink sink);
  // Writes one message as TracerX would. Thread-safety: any thread.
  static void Emit(const xstring& message);
};

// Reports a failed assertion on the trace stream:
// "ASSERTION FAILED: <expression> at <file>:<line>\n". Does not throw or abort.
NORV_API void TraceAssertionError(const char* file, const char* expression, int line);

}  // namespace norv

// Checks `cond` in every build; on failure reports it with TraceAssertionError.
#define NORV_TRACE_ASSERT(cond) \
  ((cond) ? (void)0 : ::norv::TraceAssertionError(__FILE__, #cond, __LINE__))
