#pragma once
#include <memory>
#include <vector>

namespace norv {

template <class T, class Alloc = std::allocator<T>>
using xvector = std::vector<T, Alloc>;

}  // namespace norv
