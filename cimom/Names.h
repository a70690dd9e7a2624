// CIM names: class, property, key and qualifier names compare without regard to case. Their letters are
// ASCII; bytes beyond compare as they are.
#pragma once

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <string_view>

namespace cimom {

/// The lower-case form of one character of a name.
[[nodiscard]] constexpr char foldCase(char character) noexcept {
  return character >= 'A' && character <= 'Z' ? static_cast<char>(character + ('a' - 'A')) : character;
}

/// Whether two names are the same name.
[[nodiscard]] constexpr bool sameName(std::string_view left, std::string_view right) noexcept {
  return left.size() == right.size() &&
         std::equal(left.begin(), left.end(), right.begin(),
                    [](char first, char second) { return foldCase(first) == foldCase(second); });
}

/// Hash and equality for unordered containers keyed by names; look-ups take any string type.
struct NameHash {
  using is_transparent = void;
  [[nodiscard]] std::size_t operator()(std::string_view name) const noexcept {
    std::uint64_t hash = 0xcbf29ce484222325U;
    for (const char character : name)
      hash = (hash ^ static_cast<unsigned char>(foldCase(character))) * 0x100000001b3U;
    return static_cast<std::size_t>(hash);
  }
};

struct NameEqual {
  using is_transparent = void;
  [[nodiscard]] bool operator()(std::string_view left, std::string_view right) const noexcept {
    return sameName(left, right);
  }
};

}  // namespace cimom
