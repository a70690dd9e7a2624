// The texts behind --help.
#pragma once

#include <cli/Options.h>

#include <optional>
#include <string_view>

namespace cli {

/// The help of one command, or of the whole program.
std::string_view helpText(std::optional<Command> command);

/// The name of a command as it is typed.
std::string_view commandName(Command command);

}  // namespace cli
