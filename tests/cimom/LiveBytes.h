// How much memory the program holds from `new`.
#pragma once

#include <cstddef>

namespace memory_test {

/// Bytes at this moment, in all threads.
[[nodiscard]] std::size_t liveBytes();

}  // namespace memory_test
