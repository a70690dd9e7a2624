// Values of options, checked one by one.
#pragma once

#include <filesystem>
#include <optional>
#include <string>

namespace CLI {  // NOLINT(readability-identifier-naming): the library's own
class App;
}

namespace cli {

/// None where the option was not given. Throws `UsageError` for an empty name: it would silently mean "not
/// set", and show another machine than was meant.
std::optional<std::filesystem::path> fileOption(const CLI::App& app, const char* option,
                                                const std::string& value);

/// None where the option was not given. Throws `UsageError` for what is no number from 1 to `most`.
std::optional<unsigned> boundOption(const CLI::App& app, const char* option, const std::string& value,
                                    unsigned most);

}  // namespace cli
