// Texts as a terminal shows them: what may be printed, how many cells it takes, where it is cut or wrapped.
//
// All functions take UTF-8 and are safe for any bytes. Threads: no shared state.
#pragma once

#include <cstddef>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace cli {

/// What the reader of a text output can show.
enum class Charset {
  Utf8,
  Ascii,  ///< everything outside ASCII is shown as "?"
};

/// Takes one code point off the front of `rest`, which must not be empty. Nothing where the bytes are no
/// UTF-8; one byte is taken then.
std::optional<char32_t> takeCodePoint(std::string_view& rest);

/// `text` with nothing in it that could command a terminal: line breaks and tabs become blanks; control
/// characters (C0, DEL, C1), marks that turn the direction of text and bytes that are no UTF-8 become U+FFFD
/// or "?".
std::string printable(std::string_view text, Charset charset);

/// `text` as valid UTF-8: each byte that is not becomes U+FFFD.
std::string validUtf8(std::string_view text);

/// The cells that a printable text takes: combining marks none, wide characters two.
std::size_t displayWidth(std::string_view text);

/// A printable text in at most `width` cells, cut with an ellipsis at the end where it is longer.
std::string cutToWidth(std::string_view text, std::size_t width, Charset charset);

/// A printable text in lines of at most `width` cells (at least one), broken at blanks where there are. An
/// empty text is one empty line.
std::vector<std::string> wrapToWidth(std::string_view text, std::size_t width);

/// The candidate that `name` was most likely meant to be; nothing where none is near.
std::optional<std::string> nearestName(std::string_view name, const std::vector<std::string>& candidates);

}  // namespace cli
