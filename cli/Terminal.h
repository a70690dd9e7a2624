// What stands behind standard output.
#pragma once

#include <cli/Text.h>

#include <cstddef>

namespace cli {

struct Terminal {
  bool isTerminal = false;
  std::size_t width = 0;            ///< cells of a line; 0: no limit
  Charset values = Charset::Utf8;   ///< what values may hold: a file takes UTF-8 whatever the locale
  Charset drawing = Charset::Utf8;  ///< what the program draws with: branches
};

/// Looks at a file descriptor, and at LC_ALL, LC_CTYPE, LANG and COLUMNS. The width is that of the terminal;
/// of COLUMNS where it has none or the descriptor is none.
Terminal terminalAt(int descriptor);

}  // namespace cli
