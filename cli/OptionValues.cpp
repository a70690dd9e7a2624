#include <cli/OptionValues.h>
#include <cli/UsageError.h>

#include <CLI/CLI.hpp>
#include <charconv>

namespace cli {

std::optional<std::filesystem::path> fileOption(const CLI::App& app, const char* option,
                                                const std::string& value) {
  if (app.count(option) == 0) {
    return std::nullopt;
  }
  if (value.empty()) {
    throw UsageError(std::string(option) + " needs a name, and got an empty one");
  }
  return std::filesystem::path(value);
}

std::optional<unsigned> boundOption(const CLI::App& app, const char* option, const std::string& value,
                                    unsigned most) {
  if (app.count(option) == 0) {
    return std::nullopt;
  }
  unsigned number = 0;
  const char* end = value.data() + value.size();
  const auto result = std::from_chars(value.data(), end, number);
  if (result.ec != std::errc() || result.ptr != end || number == 0 || number > most) {
    throw UsageError(std::string(option) + " '" + value + "' is no number from 1 to " + std::to_string(most));
  }
  return number;
}

}  // namespace cli
