// A bounded wait for a descriptor of the kernel.
#pragma once

#include <chrono>

namespace agent::discovery {

/// Waits until there is something to read. 0, or an errno: ETIMEDOUT when nothing came within `limit`, EIO
/// where nothing will come any more.
int awaitReadable(int descriptor, std::chrono::milliseconds limit);

}  // namespace agent::discovery
