#pragma once
// Symbol export for the repository's shared libraries. Everything is built with hidden
// visibility; public classes (and every polymorphic class or exception that crosses a library
// boundary, so that its type information is shared) and free functions carry NORV_API.

#define NORV_API __attribute__((visibility("default")))
