#pragma once
#include <string>

namespace norv {

// The string type of the runtime and the store. Maps keyed by name use its operator<.
template <class C, class Traits = std::char_traits<C>, class Alloc = std::allocator<C>>
using basic_xstring = std::basic_string<C, Traits, Alloc>;

using xstring = basic_xstring<char>;

}  // namespace norv
