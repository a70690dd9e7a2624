// Memory that is given out piece by piece and taken back as a whole.
//
// An arena belongs to one thread at a time. Objects in it are trivially destructible: nothing runs when they
// go.
#pragma once

#include <cstddef>
#include <cstring>
#include <new>
#include <string_view>
#include <type_traits>
#include <utility>

#if defined(__SANITIZE_ADDRESS__)
#define CIMOM_ARENA_POISON 1
#elif defined(__has_feature)
#if __has_feature(address_sanitizer)
#define CIMOM_ARENA_POISON 1
#endif
#endif
#ifdef CIMOM_ARENA_POISON
#include <sanitizer/asan_interface.h>
#endif

namespace cimom {

class Arena {
 public:
  /// For the many objects of a request; `small` for a single one.
  static constexpr std::size_t usual = 16384;
  static constexpr std::size_t small = 256;

  explicit Arena(std::size_t firstChunk = usual) : chunkSize_(firstChunk) {}
  ~Arena();
  Arena(const Arena&) = delete;
  Arena& operator=(const Arena&) = delete;

  /// Uninitialised memory, aligned for any type. Throws `std::bad_alloc`.
  void* allocate(std::size_t size) {
    const std::size_t rounded = (size + alignment - 1) & ~(alignment - 1);
    if (rounded < size || next_ == nullptr || static_cast<std::size_t>(end_ - next_) < rounded) {
      return allocateFromNewChunk(size);
    }
    char* const piece = next_;
    next_ += rounded;
    unpoison(piece, size);
    return piece;
  }

  template <class T, class... Arguments>
  T* make(Arguments&&... arguments) {
    static_assert(std::is_trivially_destructible_v<T> && alignof(T) <= alignment);
    return ::new (allocate(sizeof(T))) T(std::forward<Arguments>(arguments)...);
  }

  /// Uninitialised elements. Throws `std::bad_alloc` also where the product overflows.
  template <class T>
  T* array(std::size_t count) {
    static_assert(std::is_trivially_destructible_v<T> && alignof(T) <= alignment);
    if (count > static_cast<std::size_t>(-1) / sizeof(T)) {
      throw std::bad_alloc();
    }
    return static_cast<T*>(allocate(count * sizeof(T)));
  }

  /// A copy with a zero byte after it.
  std::string_view copy(std::string_view text) {
    char* const chars = array<char>(text.size() + 1);
    if (!text.empty()) {
      std::memcpy(chars, text.data(), text.size());
    }
    chars[text.size()] = '\0';
    return {chars, text.size()};
  }

  /// Takes back everything at once and keeps a part of the memory for what comes next.
  void reset();

  /// Bytes that the arena holds from the system, used or not.
  [[nodiscard]] std::size_t footprint() const { return footprint_; }

 private:
  static constexpr std::size_t alignment = alignof(std::max_align_t);
  struct Chunk;

  void* allocateFromNewChunk(std::size_t size);
  void freeChunks(Chunk* from);
  static void unpoison([[maybe_unused]] const void* start, [[maybe_unused]] std::size_t size) {
#ifdef CIMOM_ARENA_POISON
    ASAN_UNPOISON_MEMORY_REGION(start, size);
#endif
  }
  static void poison([[maybe_unused]] const void* start, [[maybe_unused]] std::size_t size) {
#ifdef CIMOM_ARENA_POISON
    ASAN_POISON_MEMORY_REGION(start, size);
#endif
  }

  char* next_ = nullptr;
  char* end_ = nullptr;
  Chunk* chunks_ = nullptr;  // the newest first
  std::size_t footprint_ = 0;
  std::size_t chunkSize_;
};

}  // namespace cimom
