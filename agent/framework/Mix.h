// A bijection of 64-bit numbers that spreads every bit over all others: the finaliser of the SplitMix64
// generator. Node numbers depend on it, so it never changes.
#pragma once

#include <cstdint>

namespace agent {

constexpr std::uint64_t mix64(std::uint64_t number) {
  number ^= number >> 30U;
  number *= 0xbf58476d1ce4e5b9U;
  number ^= number >> 27U;
  number *= 0x94d049bb133111ebU;
  return number ^ (number >> 31U);
}

}  // namespace agent
