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

namespace cimom {

class Arena {
 public:
  Arena() = default;
  ~Arena();
  Arena(const Arena&) = delete;
  Arena& operator=(const Arena&) = delete;

  /// Uninitialised memory, aligned for any type. Throws `std::bad_alloc`.
  void* allocate(std::size_t size) {
    const std::size_t rounded = (size + alignment - 1) & ~(alignment - 1);
    if (rounded < size || static_cast<std::size_t>(end_ - next_) < rounded) {
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
  void dropChunks(Chunk* kept);
  static void unpoison(const void* start, std::size_t size);

  char* next_ = nullptr;
  char* end_ = nullptr;
  Chunk* chunks_ = nullptr;  // the newest first
  std::size_t footprint_ = 0;
};

}  // namespace cimom
