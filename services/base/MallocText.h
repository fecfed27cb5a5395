#pragma once

#include <cstdlib>
#include <memory>

namespace quorl::base {

struct FreeWithMalloc {
    void operator()(char* text) const { std::free(text); }
};

/// A C string that the C library allocated, such as the result of `realpath`.
using MallocText = std::unique_ptr<char, FreeWithMalloc>;

} // namespace quorl::base
