// Programs of other packages, run without a shell.
#pragma once

#include <string>
#include <vector>

namespace cli {

/// The file that PATH leads to, or empty.
std::string findProgram(const std::string& name);

/// Runs a program to its end with this process's environment, output and working folder, and gives its exit
/// status. Throws `CommandError` where it cannot be started, and where a signal ended it.
int runTool(const std::string& program, const std::vector<std::string>& arguments);

}  // namespace cli
