#include "LiveBytes.h"

#include <malloc.h>

#include <atomic>
#include <cstdlib>
#include <new>

namespace {
std::atomic<std::size_t> live{0};
}

std::size_t memory_test::liveBytes() {
  return live.load();
}

// In the place of the library's own, for the whole program.

void* operator new(std::size_t size) {
  void* const memory = std::malloc(size);
  if (memory == nullptr)
    throw std::bad_alloc();
  live += malloc_usable_size(memory);
  return memory;
}

// Sanitizers have one of their own for this, whose memory no other `delete` may take.
void* operator new(std::size_t size, const std::nothrow_t& /*tag*/) noexcept {
  try {
    return operator new(size);
  } catch (const std::bad_alloc&) {
    return nullptr;
  }
}

void operator delete(void* memory) noexcept {
  if (memory != nullptr)
    live -= malloc_usable_size(memory);
  std::free(memory);
}

void operator delete(void* memory, std::size_t /*size*/) noexcept {
  operator delete(memory);
}
