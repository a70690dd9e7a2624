#include <agent/discovery/Values.h>
#include <agent/discovery/drivers/DriverSource.h>
#include <agent/framework/OwnNumbers.h>

#include <Oru/NodeLexicon.h>

#include <algorithm>
#include <cerrno>
#include <map>
#include <utility>
#include <vector>

namespace agent::discovery {

namespace {

constexpr std::size_t drivenDevicesLimit = 1024;

struct Driver {
  std::string name;  ///< of the module; for a built-in driver that no module is known of, its own
  std::vector<std::string> devices;
  std::optional<std::string> version;
};

/// By the module's name, whatever way it was found: the same driver, built in today and a module after the
/// next kernel update, stays the same element.
using Drivers = std::map<std::string, Driver>;

/// The kernel writes "-" in names of modules as "_".
std::string moduleSpelling(std::string name) {
  std::replace(name.begin(), name.end(), '-', '_');
  return name;
}

/// The module of a driver. Kernels without loadable modules, and some buses, link no driver to its module;
/// then a module's folder of the driver's name is the driver's.
std::string moduleName(SourceContext& context, const std::string& bus, const std::string& driver) {
  const std::string link = within(within(within("sys/bus", bus), within("drivers", driver)), "module");
  const Outcome<std::string> linked = context.root().linkedName(link);
  if (linked) {
    return *linked.value;
  }
  if (reasonOf(linked.error) != SourceReport::Reason::Absent) {
    context.reportError(context.root().outside(link), linked.error);
  }
  const std::string module = moduleSpelling(driver);
  return context.root().resolve("sys/module/" + module) ? module : driver;
}

void findBound(SourceContext& context, const std::string& bus, Drivers& drivers) {
  std::map<std::string, std::string> moduleOf;  // by driver
  const std::string folder = "sys/bus/" + bus + "/devices";
  for (const std::string& device : context.list(folder)) {
    const std::string link = within(within(folder, device), "driver");
    const Outcome<std::string> driver = context.root().linkedName(link);
    if (!driver) {
      if (reasonOf(driver.error) != SourceReport::Reason::Absent) {
        context.reportError(context.root().outside(link), driver.error);
      }
      continue;
    }
    auto known = moduleOf.find(*driver.value);
    if (known == moduleOf.end()) {
      known = moduleOf.emplace(*driver.value, moduleName(context, bus, *driver.value)).first;
    }
    Driver& found = drivers[moduleSpelling(known->second)];
    if (found.name.empty()) {
      found.name = known->second;
    }
    found.devices.emplace_back(bus).append(1, ':').append(device);
  }
}

std::vector<FoundNode> nodesOf(const Drivers& drivers) {
  std::vector<FoundNode> nodes;
  for (const auto& [key, driver] : drivers) {
    FoundNode node{Oru::NodeLexicon::DriverNode, "driver:" + key, driver.name + " driver", {}, {}, {}};
    node.setText(Oru::NodeLexicon::NameProperty, driver.name);
    node.setText(Oru::NodeLexicon::DriverVersionProperty, driver.version);
    node.setText(DrivenDevicesProperty, joinNames(driver.devices, drivenDevicesLimit));
    nodes.push_back(std::move(node));
  }
  return nodes;
}

std::shared_ptr<ModuleDatabase> openDatabase(SourceContext& context, const std::string& release) {
  const std::string folder = "lib/modules/" + release;
  context.doing(context.root().outside(folder));
  const Outcome<std::string> resolved = context.root().resolve(folder);
  if (!resolved) {
    context.reportError(context.root().outside(folder), resolved.error);
    return nullptr;
  }
  std::shared_ptr<ModuleDatabase> database = makeModuleDatabase(context.root().outside(*resolved.value));
  if (database == nullptr) {
    context.report(context.root().outside(folder), SourceReport::Reason::Unreadable,
                   "libkmod cannot open it, or is not installed");
  }
  return database;
}

void askDatabase(SourceContext& context, ModuleDatabase& modules, const std::string& key, Driver& driver) {
  const std::string what = "module information of " + key;
  context.doing(what);
  const ModuleDatabase::Answer answer = modules.version(key);
  if (answer.error != 0 && answer.error != ENOENT) {
    context.reportError(what, answer.error);
  }
  if (answer.version) {
    driver.version = meaningful(*answer.version);
  }
}

/// Whether a version that sysfs lacks is none. The running kernel shows there the version of every module,
/// loaded or built in, that has one: it takes it from the section of the module's file that libkmod reads. So
/// the files, which cost the most of a look, could tell nothing else, or that of a file that was replaced
/// since. A copy of another machine's sysfs may lack what it likes.
bool kernelTellsAll(SourceContext& context) {
  return context.root().isLive() && !context.list("sys/module").empty();
}

/// The versions that sysfs lacks: what the module files tell, else the release of the kernel that brought
/// them.
void completeVersions(SourceContext& context, std::shared_ptr<ModuleDatabase> modules, Drivers& drivers) {
  const std::optional<std::string> release = context.text("proc/sys/kernel/osrelease");
  if (modules == nullptr && release && !kernelTellsAll(context)) {
    modules = openDatabase(context, *release);
  }
  for (auto& [key, driver] : drivers) {
    if (!driver.version && modules != nullptr) {
      askDatabase(context, *modules, key, driver);
    }
    if (!driver.version) {
      driver.version = release;
    }
  }
}

}  // namespace

void readDrivers(SourceContext& context, std::shared_ptr<ModuleDatabase> modules) {
  Drivers drivers;
  for (const std::string& bus : context.list("sys/bus")) {
    findBound(context, bus, drivers);
  }
  bool complete = true;
  for (auto& [key, driver] : drivers) {
    driver.version = context.textIfAny("sys/module/" + key + "/version");
    complete = complete && driver.version;
  }
  if (!complete) {
    context.result().nodes = nodesOf(drivers);
    context.publish();  // module files may lie on a slow disk
    completeVersions(context, std::move(modules), drivers);
  }
  context.result().nodes = nodesOf(drivers);
}

}  // namespace agent::discovery
