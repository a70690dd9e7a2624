// What `swinv register` and `swinv unregister` are told on the command line.
#pragma once

#include <string>

namespace CLI {  // NOLINT(readability-identifier-naming): that library's own name
class App;
}

namespace cli {

/// The object managers whose staging tools are known.
enum class ForeignManager { Sfcb, Pegasus };

struct RegisterOptions {
  ForeignManager manager = ForeignManager::Sfcb;
  bool print = false;  ///< say what would be run, and run nothing
};

/// The arguments of both commands as they were typed.
struct RawRegister {
  std::string manager;
  bool print = false;
};

/// Declares the options in the program.
void addRegisterOptions(CLI::App& app, RawRegister& raw);

/// Throws `UsageError` where --for is missing, or names an object manager that is not known; `command` is
/// for its text.
RegisterOptions interpretRegister(const RawRegister& raw, const std::string& command);

}  // namespace cli
