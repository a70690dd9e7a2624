// What makes another object manager know the providers, or forget them: which of its tools to run, with what.
#pragma once

#include <cli/RegisterOptions.h>

#include <filesystem>
#include <string>
#include <vector>

namespace cli {

/// One run of a tool: the program by its name, as PATH finds it, and its arguments.
struct Step {
  std::string program;
  std::vector<std::string> arguments;

  friend bool operator==(const Step&, const Step&) = default;
};

/// What to run, in this order, each only after the one before has succeeded. `schema` is the installed folder
/// of MOF and registrations.
std::vector<Step> registrationSteps(ForeignManager manager, const std::filesystem::path& schema);
std::vector<Step> unregistrationSteps(ForeignManager manager, const std::filesystem::path& schema);

/// The files that the steps name, all of `schema`.
std::vector<std::filesystem::path> registrationFiles(ForeignManager manager,
                                                     const std::filesystem::path& schema);

/// A step as a line that a shell takes as it is.
std::string commandLine(const Step& step);

}  // namespace cli
