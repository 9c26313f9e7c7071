#pragma once
// Lock annotations: clang's thread-safety attributes under clang, nothing under g++, where they
// remain the most precise documentation of which lock guards what.

#if defined(__clang__)
#define NORV_THREAD_ANNOTATION(x) __attribute__((x))
#else
#define NORV_THREAD_ANNOTATION(x)
#endif

#define NORV_GUARDED_BY(x) NORV_THREAD_ANNOTATION(guarded_by(x))
#define NORV_PT_GUARDED_BY(x) NORV_THREAD_ANNOTATION(pt_guarded_by(x))
#define NORV_REQUIRES(...) NORV_THREAD_ANNOTATION(requires_capability(__VA_ARGS__))
#define NORV_EXCLUDES(...) NORV_THREAD_ANNOTATION(locks_excluded(__VA_ARGS__))
#define NORV_ACQUIRED_AFTER(...) NORV_THREAD_ANNOTATION(acquired_after(__VA_ARGS__))
