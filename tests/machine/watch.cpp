// Keeps the providers loaded, as an object manager does, and tells when what they publish changes.
//
//   machine_watch FOLDER CLASS FILE
//
// FOLDER holds lib/ and share/swinv/schema/. Each time the paths of the class's instances are others than
// before, the first time included, it prints a line: the milliseconds since 1970, and the paths. It ends once
// FILE exists.

#include <cimom/ObjectManager.h>
#include <cimom/broker/WbemUri.h>

#include <chrono>
#include <exception>
#include <filesystem>
#include <iostream>
#include <set>
#include <stdexcept>
#include <string>
#include <string_view>
#include <thread>

namespace {

namespace fs = std::filesystem;

cimom::Configuration configurationOf(const fs::path& folder) {
  std::set<fs::path> files;
  for (const auto& entry : fs::directory_iterator(folder / "share/swinv/schema")) {
    files.insert(entry.path());
  }
  cimom::Configuration configuration;
  configuration.providerFolder = folder / "lib";
  configuration.log = [](std::string_view line) { std::cerr << line << '\n'; };
  for (const fs::path& file : files) {
    if (file.extension() == ".mof") {
      configuration.schema.push_back(file);
    } else if (file.extension() == ".reg") {
      for (auto& registration : cimom::readRegistrations(file)) {
        configuration.providers.push_back(std::move(registration));
      }
    }
  }
  return configuration;
}

std::set<std::string> pathsOf(cimom::ObjectManager& objectManager, const std::string& className) {
  std::set<std::string> paths;
  const auto outcome =
      objectManager.enumerateInstanceNames({}, className, [&](const cimom::ObjectPath& path) {
        paths.insert(cimom::formatWbemUri(path));
        return true;
      });
  if (!outcome.done) {
    throw std::runtime_error("the enumeration of " + className + " failed: " + outcome.status.description);
  }
  return paths;
}

void watch(const fs::path& folder, const std::string& className, const fs::path& end) {
  cimom::ObjectManager objectManager(configurationOf(folder));
  std::set<std::string> before{"nothing was asked yet"};
  while (!fs::exists(end)) {
    const std::set<std::string> now = pathsOf(objectManager, className);
    if (now != before) {
      const auto time = std::chrono::system_clock::now().time_since_epoch();
      std::cout << std::chrono::duration_cast<std::chrono::milliseconds>(time).count();
      for (const std::string& path : now) {
        std::cout << ' ' << path;
      }
      std::cout << std::endl;
      before = now;
    }
    std::this_thread::sleep_for(std::chrono::milliseconds(100));
  }
}

}  // namespace

int main(int count, char** arguments) {
  if (count != 4) {
    std::cerr << "usage: machine_watch FOLDER CLASS FILE\n";
    return 2;
  }
  try {
    watch(arguments[1], arguments[2], arguments[3]);
    return 0;
  } catch (const std::exception& error) {
    std::cerr << "machine_watch: " << error.what() << '\n';
    return 1;
  }
}
