// The command line: which command, with what.
#pragma once

#include <cli/RegisterOptions.h>
#include <cli/ServeOptions.h>

#include <filesystem>
#include <optional>
#include <string>
#include <vector>

namespace cli {

enum class Command { List, Names, Get, Associators, Tree, Capture, Serve, Passwd, Register, Unregister };
enum class Format { Table, Json, Csv };
enum class LogLevel { Off, Error, Trace };

struct Options {
  Command command = Command::List;
  std::string className = "KELVO_SoftwareIdentity";
  std::string object;             ///< get, associators: an InstanceID or an object path
  std::string associationClass;   ///< associators: along this class alone; empty: along any
  std::string resultClass;        ///< associators: objects of this class alone; empty: of any
  std::string role;               ///< associators: where the object stands in it; empty: in any
  std::string resultRole;         ///< associators: where the others stand in it; empty: in any
  bool namesOnly = false;         ///< associators: object paths, no instances
  std::string captureFile;        ///< capture: the file, "-" for standard output
  bool force = false;             ///< capture: replace an existing file
  Format format = Format::Table;  ///< all but capture
  std::vector<std::string>
      properties;  ///< list, get, associators: in the order given; empty: the format chooses
  std::optional<std::filesystem::path> inventory;
  std::optional<std::filesystem::path> systemRoot;
  std::optional<std::filesystem::path> provider;  ///< a library, or a registration file (*.reg)
  std::vector<std::filesystem::path> schema;      ///< MOF files besides the installed ones
  std::optional<LogLevel> logLevel;               ///< none: off; of serve: error
  ServeOptions serve;
  PasswdOptions passwd;
  RegisterOptions registration;
};

/// What a command line asks for: a command, or (without options) that `standardOutput` and `standardError` be
/// printed and the program end with `exitCode`.
struct CommandLine {
  std::optional<Options> options;
  int exitCode = 0;
  std::string standardOutput;
  std::string standardError;
};

/// Parses the arguments behind the program's name. Touches nothing but its arguments.
CommandLine parseCommandLine(const std::vector<std::string>& arguments);

/// Every option with its leading dashes, as `swinv` takes them.
std::vector<std::string> optionNames();

}  // namespace cli
