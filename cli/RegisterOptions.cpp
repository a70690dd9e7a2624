#include <cli/RegisterOptions.h>
#include <cli/UsageError.h>

#include <CLI/CLI.hpp>

namespace cli {

void addRegisterOptions(CLI::App& app, RawRegister& raw) {
  app.add_option("--for", raw.manager);
  app.add_flag("--print", raw.print);
}

RegisterOptions interpretRegister(const RawRegister& raw, const std::string& command) {
  if (raw.manager == "sfcb") {
    return {ForeignManager::Sfcb, raw.print};
  }
  if (raw.manager == "pegasus") {
    return {ForeignManager::Pegasus, raw.print};
  }
  throw UsageError(raw.manager.empty()
                       ? "'swinv " + command + "' needs an object manager: --for sfcb or --for pegasus"
                       : "--for '" + raw.manager + "' is none of sfcb, pegasus");
}

}  // namespace cli
