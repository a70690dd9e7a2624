#include <cli/Commands.h>
#include <cli/Layout.h>
#include <cli/Messages.h>
#include <cli/RegistrationSteps.h>
#include <cli/RunTool.h>

#include <filesystem>
#include <map>
#include <string>
#include <system_error>
#include <vector>

namespace cli {
namespace {

const char* nameOf(ForeignManager manager) {
  return manager == ForeignManager::Sfcb ? "sfcb" : "OpenPegasus";
}

void checkFiles(const std::vector<std::filesystem::path>& files) {
  for (const std::filesystem::path& file : files) {
    std::error_code error;
    if (!std::filesystem::is_regular_file(file, error)) {
      throw CommandError("there is no file " + file.string() +
                         "\nIt belongs to swinv; install or build swinv again.");
    }
  }
}

/// Where each tool is. None is run before all are there: half a registration helps nobody.
std::map<std::string, std::string> findTools(const std::vector<Step>& steps, ForeignManager manager) {
  std::map<std::string, std::string> tools;
  for (const Step& step : steps) {
    std::string& file = tools[step.program];
    file = findProgram(step.program);
    if (file.empty()) {
      throw CommandError("there is no " + step.program + " on PATH; it comes with " + nameOf(manager) +
                         "\nNothing was run. --print shows what would be.");
    }
  }
  return tools;
}

void runSteps(const std::vector<Step>& steps, const RegisterOptions& options, Output& output) {
  if (options.print) {
    for (const Step& step : steps) {
      output.write(commandLine(step) + "\n");
    }
    return;
  }
  const std::map<std::string, std::string> tools = findTools(steps, options.manager);
  for (const Step& step : steps) {
    output.write(commandLine(step) + "\n");
    output.flush();  // what the tool prints stands below it
    if (const int status = runTool(tools.at(step.program), step.arguments); status != 0) {
      throw CommandError(step.program + " ended with exit status " + std::to_string(status) +
                         "; what it printed says why\nNothing after it was run.");
    }
  }
}

}  // namespace

void runRegister(const Options& options, Output& output) {
  const ForeignManager manager = options.registration.manager;
  const Layout layout = ownLayout();
  checkFiles(registrationFiles(manager, layout.schema));
  runSteps(registrationSteps(manager, layout.schema), options.registration, output);
  if (!options.registration.print) {
    output.write("Registered. The libraries are in " + layout.libraries.string() + ": " + nameOf(manager) +
                 " must find them there" +
                 (manager == ForeignManager::Sfcb ? ", and be restarted.\n" : ".\n"));
  }
}

void runUnregister(const Options& options, Output& output) {
  const ForeignManager manager = options.registration.manager;
  runSteps(unregistrationSteps(manager, ownLayout().schema), options.registration, output);
}

}  // namespace cli
