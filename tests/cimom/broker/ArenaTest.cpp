#include <cimom/broker/Arena.h>

#include <gtest/gtest.h>

#include <cstdint>
#include <cstring>
#include <limits>
#include <new>
#include <vector>

namespace cimom {
namespace {

TEST(Arena, GivesAlignedMemoryThatDoesNotOverlap) {
  Arena arena(64);
  std::vector<std::pair<unsigned char*, std::size_t>> pieces;
  for (std::size_t size = 0; size < 300; ++size) {
    auto* const piece = static_cast<unsigned char*>(arena.allocate(size));
    ASSERT_EQ(reinterpret_cast<std::uintptr_t>(piece) % alignof(std::max_align_t), 0U);
    std::memset(piece, static_cast<int>(size & 0xffU), size);
    pieces.emplace_back(piece, size);
  }
  for (const auto& [piece, size] : pieces) {
    for (std::size_t position = 0; position < size; ++position) {
      ASSERT_EQ(piece[position], size & 0xffU) << size;
    }
  }
}

TEST(Arena, HoldsPiecesLargerThanAChunk) {
  Arena arena(64);
  auto* const piece = static_cast<char*>(arena.allocate(std::size_t{3} << 20U));
  std::memset(piece, 'x', std::size_t{3} << 20U);
  EXPECT_GE(arena.footprint(), std::size_t{3} << 20U);
}

TEST(Arena, KeepsItsFootprintThroughResets) {
  Arena arena;
  for (int round = 0; round < 3; ++round) {
    for (int piece = 0; piece < 100; ++piece) {
      arena.allocate(100);
    }
    arena.reset();
  }
  const std::size_t footprint = arena.footprint();
  for (int round = 0; round < 1000; ++round) {
    for (int piece = 0; piece < 100; ++piece) {
      arena.allocate(100);
    }
    arena.reset();
  }
  EXPECT_EQ(arena.footprint(), footprint);
}

TEST(Arena, ResetsWhenEmpty) {
  Arena arena;
  arena.reset();
  EXPECT_EQ(arena.footprint(), 0U);
}

TEST(Arena, CopiesTextWithAZeroByteBehindIt) {
  Arena arena;
  const std::string_view copy = arena.copy("name");
  EXPECT_EQ(copy, "name");
  EXPECT_EQ(copy.data()[4], '\0');
  EXPECT_STREQ(arena.copy({}).data(), "");
}

TEST(Arena, RefusesSizesThatOverflow) {
  Arena arena;
  constexpr std::size_t largest = std::numeric_limits<std::size_t>::max();
  EXPECT_THROW(arena.allocate(largest), std::bad_alloc);
  EXPECT_THROW(arena.allocate(largest - 20), std::bad_alloc);
  EXPECT_THROW((void)arena.array<std::uint64_t>(largest / 4), std::bad_alloc);
  EXPECT_NE(arena.allocate(8), nullptr);
}

}  // namespace
}  // namespace cimom
