#include <bench/discovery/GeneratedMachine.h>
#include <tests/agent/discovery/SmbiosBuilder.h>

#include <array>
#include <map>
#include <memory>
#include <set>
#include <string>

namespace bench {

namespace {

using agent::discovery::test::FakeEthtool;
using agent::discovery::test::FakeModules;

struct Kind {
  const char* driver;
  const char* firmware;  ///< what the discovery calls it, and the table as well, so that both are one element
};
constexpr std::array<Kind, 4> kinds{{{"netcard", "Network Firmware"},
                                     {"nvme", "Drive Firmware"},
                                     {"adapter", "Drive Firmware"},
                                     {"display", "Video BIOS"}}};

const Kind& kindOf(std::size_t device) {
  return kinds.at(device % kinds.size());
}

/// A version that no other device has.
std::string versionOf(std::size_t device) {
  return std::to_string(device / 100 + 1) + "." + std::to_string(device % 100) + ".7";
}

std::string driverOf(std::size_t device) {
  return device % 10 == 9 ? "special" + std::to_string(device / 10) : kindOf(device).driver;
}

std::string addressOf(std::size_t device) {
  constexpr std::string_view digits = "0123456789abcdef";
  const std::size_t bus = device / 8;
  return std::string("0000:") + digits[bus / 16 % 16] + digits[bus % 16] + ":0" + digits[device % 8] + ".0";
}

std::string interfaceOf(std::size_t device) {
  return "eth" + std::to_string(device);
}

std::string linesOfKind(std::size_t device, const std::string& folder) {
  const std::string number = std::to_string(device);
  const std::string version = versionOf(device) + "\n";
  switch (device % kinds.size()) {
    case 0: {
      const std::string interface = "sys/class/net/" + interfaceOf(device);
      return interface + "/device -> ../../../../" + folder + "\n" + interface + "/dev_port = 0\n" +
             interface + "/ifindex = " + number + "\n" + interface + "/type = 1\n" + interface +
             "/operstate = up\n";
    }
    case 1: {
      const std::string drive = "sys/devices/pci0000:00/" + addressOf(device) + "/nvme/nvme" + number;
      return "sys/class/nvme/nvme" + number + " -> ../../../" + drive + "\n" + drive +
             "/subsystem -> ../../../../../class/nvme\n" + drive + "/transport = pcie\n" + drive +
             "/model = Drive " + number + "\n" + drive + "/firmware_rev = " + version;
    }
    case 2: {
      const std::string place = number + ":0:0:0";
      const std::string drive = folder + "/host" + number + "/target" + number + ":0:0/" + place;
      return "sys/class/scsi_device/" + place + "/device -> ../../../../" + drive + "\n" + drive +
             "/type = 0\n" + drive + "/model = Disk " + number + "\n" + drive + "/rev = " + version;
    }
    default:
      return "sys/class/drm/card" + number + "/device -> ../../../../" + folder + "\n" + folder +
             "/vbios_version = " + version;
  }
}

std::string linesOf(std::size_t device) {
  const std::string address = addressOf(device);
  const std::string driver = driverOf(device);
  const std::string folder = "sys/devices/pci0000:00/" + address;
  return folder + "/subsystem -> ../../../bus/pci\n" + folder + "/driver -> ../../../bus/pci/drivers/" +
         driver + "\nsys/bus/pci/devices/" + address + " -> ../../../devices/pci0000:00/" + address +
         "\nsys/bus/pci/drivers/" + driver + "/module -> ../../../../module/" + driver + "\nsys/module/" +
         driver + "/refcnt = 1\n" + linesOfKind(device, folder);
}

std::string description(std::size_t devices) {
  std::string text = "proc/sys/kernel/hostname = generated\nproc/sys/kernel/osrelease = 6.1.0\n";
  for (std::size_t device = 0; device < devices; ++device) {
    text += linesOf(device);
  }
  return text;
}

std::string table(std::size_t devices) {
  std::string text = "0 @0: 1b 2b 0w 3b 3b 0q 0w 2b 14b 255b 255b | Norvane | 2.14.1 | 03/22/2024\n";
  for (std::size_t device = 0; device < devices; ++device) {
    text += "45 @" + std::to_string(device + 1) + ": 1b 2b 0b 0b 0b 0b 0b 0b 0q 1w 4b 0b | " +
            kindOf(device).firmware + " | " + versionOf(device) + "\n";
  }
  return agent::discovery::test::smbiosTable(text + "end");
}

std::shared_ptr<FakeEthtool> cardDrivers(std::size_t devices) {
  std::map<std::string, FakeEthtool::Told> told;
  for (std::size_t device = 0; device < devices; device += kinds.size()) {
    told[interfaceOf(device)] = {"6.1.0", versionOf(device)};
  }
  return std::make_shared<FakeEthtool>(std::move(told));
}

std::size_t countNodes(std::size_t devices) {
  std::set<std::string> drivers;
  for (std::size_t device = 0; device < devices; ++device) {
    drivers.insert(driverOf(device));
  }
  const std::size_t cards = (devices + kinds.size() - 1) / kinds.size();
  return 2 + 2 * devices + cards + drivers.size();  // the computer and its BIOS; devices with firmware; ports
}

}  // namespace

GeneratedMachine::GeneratedMachine(std::size_t devices)
    : nodes_(countNodes(devices)), machine_(description(devices)) {
  const std::string bytes = table(devices);
  machine_.write("sys/firmware/dmi/tables/DMI", bytes);
  machine_.write("sys/firmware/dmi/tables/smbios_entry_point",
                 agent::discovery::test::entryPoint64(3, 7, bytes.size()));
  options_.root = machine_.root();
  options_.ethtool = cardDrivers(devices);
  options_.modules =
      std::make_shared<FakeModules>(std::map<std::string, agent::discovery::ModuleDatabase::Answer>{});
}

}  // namespace bench
