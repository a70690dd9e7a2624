// The command line: which command, with what.
#pragma once

#include <filesystem>
#include <optional>
#include <string>
#include <vector>

namespace cli {

enum class Command { List, Names, Get, Tree, Capture };
enum class Format { Table, Json, Csv };
enum class LogLevel { Off, Error, Trace };

struct Options {
  Command command = Command::List;
  std::string className = "KELVO_SoftwareIdentity";
  std::string object;                   ///< get: an InstanceID or an object path
  std::string captureFile;              ///< capture: the file, "-" for standard output
  bool force = false;                   ///< capture: replace an existing file
  Format format = Format::Table;        ///< list, names, get, tree
  std::vector<std::string> properties;  ///< list, get: in the order given; empty: those the format chooses
  std::optional<std::filesystem::path> inventory;
  std::optional<std::filesystem::path> systemRoot;
  std::optional<std::filesystem::path> provider;
  std::optional<LogLevel> logLevel;  ///< none: off
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
