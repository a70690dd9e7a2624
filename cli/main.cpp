#include <cli/Commands.h>
#include <cli/Endpoint.h>
#include <cli/Messages.h>
#include <cli/Source.h>

#include <cerrno>
#include <csignal>
#include <exception>
#include <string>
#include <system_error>
#include <vector>

#include <fcntl.h>
#include <unistd.h>

namespace {

/// A file that this process opens must not become its standard output because the caller closed that one: it
/// is put on what cannot be written to, so that writing fails as it should.
void occupyStandardDescriptors() {
  for (const int descriptor : {STDIN_FILENO, STDOUT_FILENO, STDERR_FILENO}) {
    if (fcntl(descriptor, F_GETFD) == -1 && errno == EBADF) {
      open("/dev/null", O_RDONLY);
    }
  }
}

void run(const cli::Options& options, cli::Output& output, char* const* arguments) {
  cli::setEnvironment(options);
  switch (options.command) {
    case cli::Command::List:
      return cli::runList(options, output);
    case cli::Command::Names:
      return cli::runNames(options, output);
    case cli::Command::Get:
      return cli::runGet(options, output);
    case cli::Command::Associators:
      return cli::runAssociators(options, output);
    case cli::Command::Tree:
      return cli::runTree(options, output);
    case cli::Command::Capture:
      return cli::runCapture(options, output);
    case cli::Command::Register:
      return cli::runRegister(options, output);
    case cli::Command::Unregister:
      return cli::runUnregister(options, output);
    case cli::Command::Serve:
    case cli::Command::Passwd:
      return cli::runEndpoint(options, output, arguments);
  }
}

/// The exit status that the output leaves: a reader that went away has seen what it wanted.
int finish(cli::Output& output, int exitCode) {
  output.flush();
  if (output.error() == 0 || output.error() == EPIPE) {
    return exitCode;
  }
  cli::complain("cannot write to standard output: " + std::generic_category().message(output.error()));
  return 1;
}

int mainProgram(int argc, char** argv) {
  occupyStandardDescriptors();
  // A reader that goes away shows as EPIPE where it is written to.
  static_cast<void>(std::signal(SIGPIPE, SIG_IGN));
  cli::Output output(STDOUT_FILENO);
  const cli::CommandLine line =
      cli::parseCommandLine(std::vector<std::string>(argv + (argc > 0), argv + argc));
  if (!line.options) {
    output.write(line.standardOutput);
    if (!line.standardError.empty()) {
      cli::complain(line.standardError);
    }
    return finish(output, line.exitCode);
  }
  try {
    run(*line.options, output, argv);
    return finish(output, 0);
  } catch (const cli::CommandError& error) {
    // What was printed goes out first: the message is about what is missing from it.
    const int exitCode = finish(output, 1);
    cli::complain(error.what());
    return exitCode;
  }
}

}  // namespace

int main(int argc, char** argv) {
  try {
    return mainProgram(argc, argv);
  } catch (const std::exception& error) {
    cli::complain(error.what());
    return 1;
  }
}
