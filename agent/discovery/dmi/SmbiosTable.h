// The structure table of SMBIOS (DSP0134), as bytes: its structures one by one, each with its strings.
//
// Nothing here reads a file, and every read is within the bytes that were given. Views last as long as those.
#pragma once

#include <cstddef>
#include <cstdint>
#include <limits>
#include <optional>
#include <span>
#include <string_view>

namespace agent::discovery::smbios {

using Bytes = std::span<const std::byte>;

/// The little-endian number at `offset`; nothing where the bytes end before it does.
template <typename Number>
std::optional<Number> numberAt(Bytes bytes, std::size_t offset) {
  if (offset > bytes.size() || bytes.size() - offset < sizeof(Number)) {
    return std::nullopt;
  }
  std::uint64_t number = 0;
  for (std::size_t i = 0; i < sizeof(Number); ++i) {
    number |= std::to_integer<std::uint64_t>(bytes[offset + i]) << (8 * i);
  }
  return static_cast<Number>(number);
}

/// One structure: a formatted area that begins with type, length and handle, and the strings behind it.
class Structure {
 public:
  static constexpr std::size_t headerLength = 4;

  /// `formatted` has `headerLength` bytes at least; each string in `strings` ends with a NUL.
  Structure(Bytes formatted, std::string_view strings) : formatted_(formatted), strings_(strings) {}

  [[nodiscard]] std::uint8_t type() const { return std::to_integer<std::uint8_t>(formatted_[0]); }
  [[nodiscard]] std::uint16_t handle() const { return numberAt<std::uint16_t>(formatted_, 2).value_or(0); }
  /// Of the formatted area. A field beyond it is absent, whatever version the table claims to be.
  [[nodiscard]] std::size_t length() const { return formatted_.size(); }

  template <typename Number>
  [[nodiscard]] std::optional<Number> at(std::size_t offset) const {
    return numberAt<Number>(formatted_, offset);
  }

  /// The string whose number stands at `offset`, as it stands in the table. Nothing where the field is
  /// absent, refers to no string (0), or to one that is not there.
  [[nodiscard]] std::optional<std::string_view> stringAt(std::size_t offset) const;

 private:
  Bytes formatted_;
  std::string_view strings_;
};

/// Walks over a table. A structure is given only where it is whole, with the two NULs behind its strings.
class TableReader {
 public:
  static constexpr std::uint8_t endMarker = 127;

  enum class End {
    None,           ///< the walk goes on
    Marker,         ///< at the end marker, which is the last structure given
    Counted,        ///< at as many structures as there were to be
    NoMarker,       ///< the bytes end behind a whole structure, and there was no end marker
    CutShort,       ///< the bytes end within a structure
    NotAStructure,  ///< what follows has a length in which no structure has room for its own header
  };

  /// `limit`: how many structures there are at most, where the entry point says.
  explicit TableReader(Bytes table, std::size_t limit = std::numeric_limits<std::size_t>::max())
      : table_(table), limit_(limit) {}

  std::optional<Structure> next();

  /// Why there is no next structure.
  [[nodiscard]] End end() const { return end_; }
  /// How many structures were given.
  [[nodiscard]] std::size_t count() const { return count_; }
  /// Where the next structure begins, or what is none.
  [[nodiscard]] std::size_t offset() const { return offset_; }

 private:
  std::optional<Structure> stop(End end);

  Bytes table_;
  std::size_t limit_;
  std::size_t offset_ = 0;
  std::size_t count_ = 0;
  End end_ = End::None;
};

}  // namespace agent::discovery::smbios
