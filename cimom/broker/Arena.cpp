#include <cimom/broker/Arena.h>

#include <algorithm>
#include <cstddef>
#include <new>

namespace cimom {

struct alignas(std::max_align_t) Arena::Chunk {
  Chunk* older;
  std::size_t size;  // with this header

  char* begin() { return reinterpret_cast<char*>(this + 1); }
  char* end() { return reinterpret_cast<char*>(this) + size; }
};

namespace {
constexpr std::size_t largestUsualChunk = std::size_t{1} << 20U;
}

Arena::~Arena() {
  freeChunks(chunks_);
}

void* Arena::allocateFromNewChunk(std::size_t size) {
  const std::size_t rounded = (size + alignment - 1) & ~(alignment - 1);
  if (rounded < size || rounded > static_cast<std::size_t>(-1) - sizeof(Chunk)) {
    throw std::bad_alloc();
  }
  const std::size_t chunkSize = std::max(chunkSize_, rounded + sizeof(Chunk));
  auto* const chunk = ::new (::operator new(chunkSize)) Chunk{chunks_, chunkSize};
  chunks_ = chunk;
  footprint_ += chunkSize;
  chunkSize_ = std::min(chunkSize_ * 2, std::max(chunkSize_, largestUsualChunk));
  next_ = chunk->begin() + rounded;
  end_ = chunk->end();
  poison(chunk->begin(), static_cast<std::size_t>(chunk->end() - chunk->begin()));
  unpoison(chunk->begin(), size);
  return chunk->begin();
}

void Arena::reset() {
  if (chunks_ == nullptr) {
    return;
  }
  // One chunk stays, so that a request which recycles after each object asks the system for memory only once.
  freeChunks(chunks_->older);
  chunks_->older = nullptr;
  footprint_ = chunks_->size;
  next_ = chunks_->begin();
  end_ = chunks_->end();
  poison(next_, static_cast<std::size_t>(end_ - next_));
}

void Arena::freeChunks(Chunk* from) {
  while (from != nullptr) {
    Chunk* const older = from->older;
    unpoison(from, from->size);
    ::operator delete(from);
    from = older;
  }
}

}  // namespace cimom
