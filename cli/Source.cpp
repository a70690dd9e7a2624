#include <cli/Messages.h>
#include <cli/Source.h>

#include <cstdlib>
#include <exception>
#include <filesystem>
#include <string>
#include <system_error>

namespace cli {
namespace {

void setVariable(const char* name, const std::string& value) {
  setenv(name, value.c_str(), 1);
}

const char* levelName(LogLevel level) {
  switch (level) {
    case LogLevel::Off:
      return "off";
    case LogLevel::Error:
      return "error";
    case LogLevel::Trace:
      return "trace";
  }
  return "off";
}

/// Nothing is logged unless asked for; what is asked for goes to standard error, unless the caller's
/// environment names another place.
void setLogging(LogLevel level) {
  setVariable("ORU_LOG_LEVEL", levelName(level));
  const char* target = std::getenv("ORU_LOG");
  if (level == LogLevel::Off || target == nullptr || *target == '\0') {
    setVariable("ORU_LOG", "stderr");
  }
  if (level == LogLevel::Off) {
    unsetenv("ORU_TRACE");
  }
}

[[noreturn]] void missing(const char* what, const std::filesystem::path& path, std::error_code error) {
  throw CommandError(std::string("there is no ") + what + " " + path.string() + ": " + error.message());
}

}  // namespace

void setEnvironment(const Options& options) {
  // An option names the machine outright: whatever the caller's environment says of another is set aside.
  if (options.inventory || options.systemRoot) {
    unsetenv("ORU_INVENTORY");
    unsetenv("ORU_SYSTEM_ROOT");
  }
  if (options.inventory) {
    setVariable("ORU_INVENTORY", options.inventory->string());
  }
  if (options.systemRoot) {
    setVariable("ORU_SYSTEM_ROOT", options.systemRoot->string());
  }
  setLogging(options.logLevel.value_or(LogLevel::Off));
}

agent::TreeSource checkedSource() {
  agent::TreeSource source = agent::TreeSource::fromEnvironment();
  std::error_code error;
  if (source.inventory) {
    const auto type = std::filesystem::status(*source.inventory, error).type();
    if (type == std::filesystem::file_type::not_found || type == std::filesystem::file_type::none) {
      missing("inventory file", *source.inventory, error);
    }
  } else if (source.systemRoot && !std::filesystem::is_directory(*source.systemRoot, error)) {
    missing("system root", *source.systemRoot,
            error ? error : std::make_error_code(std::errc::not_a_directory));
  }
  return source;
}

agent::NodeTree readTreeOf(const agent::TreeSource& source) {
  try {
    return agent::readTree(source);
  } catch (const std::exception& error) {
    throw CommandError(error.what());
  }
}

}  // namespace cli
