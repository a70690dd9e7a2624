// A password, read from a person or from a program.
#pragma once

#include <string>
#include <string_view>

namespace cli {

/// On a terminal asks twice without echo; else takes the first line of standard input. Throws `CommandError`
/// where the two differ, where there is none, or where it is longer than a password can sensibly be.
std::string readNewPassword(std::string_view user);

/// Overwrites a secret before its memory goes to somebody else.
void wipe(std::string& secret);

}  // namespace cli
