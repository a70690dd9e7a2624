#include <cli/HostedManager.h>
#include <cli/Layout.h>
#include <cli/Messages.h>

#include <algorithm>
#include <filesystem>
#include <iterator>
#include <string>
#include <system_error>
#include <utility>
#include <vector>

namespace cli {
namespace {

namespace fs = std::filesystem;

/// The library, by its name in registrations, whose place --provider takes.
constexpr std::string_view inventoryProvider = "SoftwareInventoryProvider";

/// The schema's files with this extension, by name.
std::vector<fs::path> schemaFiles(const fs::path& folder, const char* extension) {
  std::vector<fs::path> files;
  std::error_code error;
  for (fs::directory_iterator entry(folder, error), end; !error && entry != end; entry.increment(error)) {
    if (entry->path().extension() == extension) {
      files.push_back(entry->path());
    }
  }
  if (error) {
    throw CommandError("cannot read the schema folder " + folder.string() + ": " + error.message());
  }
  std::sort(files.begin(), files.end());
  return files;
}

void addAll(std::vector<cimom::ProviderRegistration> registrations, cimom::Configuration& configuration) {
  std::move(registrations.begin(), registrations.end(), std::back_inserter(configuration.providers));
}

/// A registration file brings classes of its own, a library takes the place of the inventory provider.
void applyProvider(const fs::path& file, cimom::Configuration& configuration) {
  std::error_code error;
  if (!fs::exists(file, error)) {
    throw CommandError("there is no provider library " + file.string() +
                       "; --provider takes the file that holds it, or a registration file (*.reg)");
  }
  const fs::path absolute = fs::absolute(file);
  if (file.extension() != ".reg") {
    for (cimom::ProviderRegistration& registration : configuration.providers) {
      if (registration.location == inventoryProvider) {
        registration.location = absolute.string();
        registration.keepsNothing = false;  // nobody knows of this one
      }
    }
    return;
  }
  std::vector<cimom::ProviderRegistration> registrations = cimom::readRegistrations(file);
  for (cimom::ProviderRegistration& registration : registrations) {
    const fs::path beside = absolute.parent_path() / ("lib" + registration.location + ".so");
    if (fs::exists(beside, error)) {
      registration.location = beside.string();
    }
  }
  addAll(std::move(registrations), configuration);
}

cimom::Configuration configure(const Options& options) {
  const Layout layout = ownLayout();
  cimom::Configuration configuration;
  // In the order of their names: the CIM schema's files, which include what they stand on, before this
  // system's.
  configuration.schema = schemaFiles(layout.schema, ".mof");
  if (options.command != Command::Serve) {
    // What the interop namespace is made of: nobody can ask for it, and every command would wait for it.
    std::erase_if(configuration.schema, [](const fs::path& file) {
      return file.filename() == "CIM_Interop.mof" || file.filename() == "interop.mof";
    });
  }
  configuration.providerFolder = layout.libraries;
  configuration.schema.insert(configuration.schema.end(), options.schema.begin(), options.schema.end());
  for (const fs::path& file : schemaFiles(layout.schema, ".reg")) {
    addAll(cimom::readRegistrations(file), configuration);
  }
  if (configuration.providers.empty()) {
    throw CommandError("no provider is registered: no .reg file in the schema folder " +
                       layout.schema.string() +
                       " names a class\nThe files belong to swinv; install or build swinv again.");
  }
  if (options.command == Command::Serve) {
    configuration.interop.emplace();  // who comes over the network has nothing else to start from
    configuration.interop->elementName = "swinv";
  }
  if (options.provider) {
    applyProvider(*options.provider, configuration);
  }
  if (options.logLevel.value_or(LogLevel::Off) != LogLevel::Off) {
    configuration.log = [](std::string_view line) { complain(line); };
  }
  return configuration;
}

}  // namespace

std::unique_ptr<cimom::ObjectManager> makeManager(const Options& options) {
  try {
    return std::make_unique<cimom::ObjectManager>(configure(options));
  } catch (const CommandError&) {
    throw;
  } catch (const cimom::RegistrationError& error) {
    throw CommandError(std::string("the registration of the providers cannot be used: ") + error.what());
  } catch (const std::exception& error) {
    throw CommandError(std::string("the CIM schema cannot be used: ") + error.what());
  }
}

}  // namespace cli
