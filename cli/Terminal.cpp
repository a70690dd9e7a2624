#include <cimom/Names.h>
#include <cli/Terminal.h>

#include <algorithm>
#include <array>
#include <charconv>
#include <cstdlib>
#include <string_view>

#include <sys/ioctl.h>
#include <unistd.h>

namespace cli {
namespace {

std::string_view environment(const char* name) {
  const char* value = std::getenv(name);
  return value == nullptr ? std::string_view() : std::string_view(value);
}

/// The first of the three that is set decides, as in the C library. The name is enough: the locale itself may
/// not be installed on a small system.
bool isUtf8Locale() {
  for (const char* name : {"LC_ALL", "LC_CTYPE", "LANG"}) {
    const std::string_view locale = environment(name);
    if (locale.empty()) {
      continue;
    }
    const std::array<std::string_view, 2> spellings{"UTF-8", "UTF8"};
    return std::any_of(spellings.begin(), spellings.end(), [locale](std::string_view spelling) {
      return std::search(locale.begin(), locale.end(), spelling.begin(), spelling.end(), [](char a, char b) {
               return cimom::foldCase(a) == cimom::foldCase(b);
             }) != locale.end();
    });
  }
  return false;
}

std::size_t columnsOfEnvironment() {
  constexpr std::size_t widest = 10000;
  const std::string_view text = environment("COLUMNS");
  std::size_t columns = 0;
  const auto result = std::from_chars(text.data(), text.data() + text.size(), columns);
  const bool whole = result.ec == std::errc() && result.ptr == text.data() + text.size();
  return whole && columns <= widest ? columns : 0;
}

}  // namespace

Terminal terminalAt(int descriptor) {
  Terminal terminal;
  terminal.isTerminal = isatty(descriptor) == 1;
  winsize size{};
  if (terminal.isTerminal && ioctl(descriptor, TIOCGWINSZ, &size) == 0) {
    terminal.width = size.ws_col;
  }
  if (terminal.width == 0) {
    terminal.width = columnsOfEnvironment();
  }
  terminal.drawing = isUtf8Locale() ? Charset::Utf8 : Charset::Ascii;
  terminal.values = terminal.isTerminal ? terminal.drawing : Charset::Utf8;
  return terminal;
}

}  // namespace cli
