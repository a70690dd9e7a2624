// What goes to standard error, and the errors that end a command.
#pragma once

#include <stdexcept>
#include <string_view>

namespace cli {

/// A request that failed: exit status 1. The text says what was wrong, where, and what to do.
class CommandError : public std::runtime_error {
 public:
  using std::runtime_error::runtime_error;
};

/// Prints "swinv: TEXT" on standard error, behind `mark` where one is given. Control characters in it are
/// replaced, line breaks kept. From any thread.
void complain(std::string_view text, std::string_view mark = {});

}  // namespace cli
