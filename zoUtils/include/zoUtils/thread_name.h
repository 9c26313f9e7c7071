#pragma once
#include "zoUtils/export.h"
#include "zoUtils/xstring.h"

namespace norv {

// Names the calling thread. The operating system sees the name truncated to its limit (15
// characters on Linux); GetThreadName returns the full name.
NORV_API void SetThreadName(const xstring& name);
// The name the calling thread last set, or "" when it never set one.
NORV_API const xstring& GetThreadName();

}  // namespace norv
