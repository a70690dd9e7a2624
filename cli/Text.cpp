#include <cimom/Names.h>
#include <cli/Text.h>

#include <clocale>
#include <cwchar>

#include <algorithm>
#include <numeric>

namespace cli {
namespace {

constexpr std::string_view replacement = "\xEF\xBF\xBD";  // U+FFFD

struct Decoded {
  char32_t lead = 0;      ///< the bits of the first byte
  std::size_t tail = 0;   ///< how many bytes follow
  char32_t smallest = 0;  ///< below it the form is overlong
};

std::optional<Decoded> decodeLead(unsigned char byte) {
  if (byte < 0x80) {
    return Decoded{byte, 0, 0};
  }
  if (byte >= 0xC2 && byte <= 0xDF) {
    return Decoded{byte & 0x1FU, 1, 0x80};
  }
  if (byte >= 0xE0 && byte <= 0xEF) {
    return Decoded{byte & 0x0FU, 2, 0x800};
  }
  if (byte >= 0xF0 && byte <= 0xF4) {
    return Decoded{byte & 0x07U, 3, 0x10000};
  }
  return std::nullopt;
}

bool isControl(char32_t code) {
  return code < 0x20 || (code >= 0x7F && code <= 0x9F);
}

bool turnsDirection(char32_t code) {
  return code == 0x200E || code == 0x200F || (code >= 0x2028 && code <= 0x202E) ||
         (code >= 0x2066 && code <= 0x2069);
}

/// wcwidth() knows characters outside ASCII only under a UTF-8 locale; the thread's own locale is put back.
int wideWidth(char32_t code) {
  static const locale_t utf8 = newlocale(LC_CTYPE_MASK, "C.UTF-8", nullptr);
  if (utf8 == nullptr) {
    return 1;
  }
  const locale_t before = uselocale(utf8);
  const int width = wcwidth(static_cast<wchar_t>(code));
  uselocale(before);
  return width;
}

/// The cells of a character, -1 for one that cannot be shown.
int cellsOf(char32_t code) {
  if (isControl(code) || turnsDirection(code)) {
    return -1;
  }
  return code < 0x300 ? 1 : wideWidth(code);
}

bool isPlainAscii(std::string_view text) {
  return std::all_of(text.begin(), text.end(), [](char c) { return c >= 0x20 && c < 0x7F; });
}

std::size_t editDistance(std::string_view left, std::string_view right) {
  std::vector<std::size_t> row(right.size() + 1);
  std::iota(row.begin(), row.end(), std::size_t{0});
  for (std::size_t i = 1; i <= left.size(); ++i) {
    std::size_t diagonal = row[0];
    row[0] = i;
    for (std::size_t j = 1; j <= right.size(); ++j) {
      const std::size_t changed =
          diagonal + (cimom::foldCase(left[i - 1]) == cimom::foldCase(right[j - 1]) ? 0U : 1U);
      diagonal = row[j];
      row[j] = std::min({row[j] + 1, row[j - 1] + 1, changed});
    }
  }
  return row.back();
}

/// The bytes at the front of `text` that fit into `width` cells, with the marks that combine with the last.
std::size_t fittingBytes(std::string_view text, std::size_t width) {
  std::string_view rest = text;
  std::size_t used = 0;
  std::size_t bytes = 0;
  while (!rest.empty()) {
    const auto code = takeCodePoint(rest);
    const auto cells = static_cast<std::size_t>(std::max(code ? cellsOf(*code) : 1, 0));
    if (used + cells > width) {
      break;
    }
    used += cells;
    bytes = text.size() - rest.size();
  }
  return bytes;
}

}  // namespace

std::optional<char32_t> takeCodePoint(std::string_view& rest) {
  const auto lead = decodeLead(static_cast<unsigned char>(rest.front()));
  if (!lead || rest.size() <= lead->tail) {
    rest.remove_prefix(1);
    return std::nullopt;
  }
  char32_t code = lead->lead;
  for (std::size_t i = 1; i <= lead->tail; ++i) {
    const auto byte = static_cast<unsigned char>(rest[i]);
    if ((byte & 0xC0U) != 0x80U) {
      rest.remove_prefix(1);
      return std::nullopt;
    }
    code = (code << 6U) | (byte & 0x3FU);
  }
  if (code < lead->smallest || code > 0x10FFFF || (code >= 0xD800 && code <= 0xDFFF)) {
    rest.remove_prefix(1);
    return std::nullopt;
  }
  rest.remove_prefix(lead->tail + 1);
  return code;
}

std::string printable(std::string_view text, Charset charset) {
  if (isPlainAscii(text)) {
    return std::string(text);
  }
  std::string out;
  out.reserve(text.size());
  while (!text.empty()) {
    const std::string_view before = text;
    const auto code = takeCodePoint(text);
    if (code && (*code == '\n' || *code == '\r' || *code == '\t')) {
      out += ' ';
    } else if (code && cellsOf(*code) >= 0 && (charset == Charset::Utf8 || *code < 0x7F)) {
      out += before.substr(0, before.size() - text.size());
    } else {
      out += charset == Charset::Utf8 ? replacement : std::string_view("?");
    }
  }
  return out;
}

std::string validUtf8(std::string_view text) {
  std::string out;
  out.reserve(text.size());
  while (!text.empty()) {
    const std::string_view before = text;
    const auto code = takeCodePoint(text);
    out += code ? before.substr(0, before.size() - text.size()) : replacement;
  }
  return out;
}

std::size_t displayWidth(std::string_view text) {
  if (isPlainAscii(text)) {
    return text.size();
  }
  std::size_t width = 0;
  while (!text.empty()) {
    const auto code = takeCodePoint(text);
    width += static_cast<std::size_t>(std::max(code ? cellsOf(*code) : 1, 0));
  }
  return width;
}

std::string cutToWidth(std::string_view text, std::size_t width, Charset charset) {
  if (displayWidth(text) <= width) {
    return std::string(text);
  }
  const std::string_view ellipsis = charset == Charset::Utf8 ? "\xE2\x80\xA6" : "...";
  const std::size_t ellipsisWidth = displayWidth(ellipsis);
  if (width <= ellipsisWidth) {
    return std::string(text.substr(0, fittingBytes(text, width)));
  }
  std::string cut(text.substr(0, fittingBytes(text, width - ellipsisWidth)));
  cut.erase(cut.find_last_not_of(' ') + 1);
  return cut.append(ellipsis);
}

std::vector<std::string> wrapToWidth(std::string_view text, std::size_t width) {
  std::vector<std::string> lines;
  while (displayWidth(text) > width) {
    // A character wider than a line is put on one all the same: each turn takes at least one.
    std::string_view rest = text;
    takeCodePoint(rest);
    const std::size_t fitting = std::max(fittingBytes(text, width), text.size() - rest.size());
    const std::size_t blank = text.substr(0, fitting + 1).rfind(' ');
    const std::size_t end = blank == std::string_view::npos || blank == 0 ? fitting : blank;
    lines.emplace_back(text.substr(0, end));
    text.remove_prefix(std::min(text.find_first_not_of(' ', end), text.size()));
  }
  if (!text.empty() || lines.empty()) {
    lines.emplace_back(text);
  }
  return lines;
}

std::optional<std::string> nearestName(std::string_view name, const std::vector<std::string>& candidates) {
  constexpr std::size_t longest = 256;  // what a name can be; keeps the search short
  if (name.size() > longest) {
    return std::nullopt;
  }
  std::optional<std::string> best;
  std::size_t bestDistance = std::max<std::size_t>(name.size() / 3, 2) + 1;
  for (const std::string& candidate : candidates) {
    const std::size_t distance = editDistance(name, candidate);
    if (distance < bestDistance) {
      best = candidate;
      bestDistance = distance;
    }
  }
  return best;
}

}  // namespace cli
