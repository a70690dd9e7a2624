#include <agent/discovery/BusAddress.h>
#include <agent/discovery/network/NetworkQuestions.h>

#include <cerrno>
#include <string>
#include <string_view>
#include <utility>

namespace agent::discovery {

namespace {

constexpr std::chrono::milliseconds devlinkLimit{1000};

std::optional<DriverInfo> ask(SourceContext& context, Ethtool& ethtool, const std::string& interface,
                              bool isVirtualFunction) {
  const std::string what = "ethtool driver info of " + interface;
  context.doing(what);
  const Ethtool::Answer answer = ethtool.driverInfo(interface);
  if (answer.error == EOPNOTSUPP) {
    context.report(what, SourceReport::Reason::Absent, "the driver does not tell");
    return std::nullopt;
  }
  if (answer.error != 0) {
    context.reportError(what, answer.error);
    return std::nullopt;
  }
  std::optional<DriverInfo> info = parseDriverInfo(answer.bytes);
  if (!info) {
    context.report(what, SourceReport::Reason::Unreadable,
                   "only " + std::to_string(answer.bytes.size()) + " bytes came");
  } else if (!info->firmwareVersion && !isVirtualFunction) {
    context.report(what, SourceReport::Reason::Absent, "the driver tells no firmware version");
  }
  return info;
}

void fill(std::optional<std::string>& known, const std::optional<std::string>& told) {
  if (!known) {
    known = told;
  }
}

/// Bus and name of a device, as devlink takes them; nothing for a device on no bus.
std::optional<std::pair<std::string, std::string>> devlinkName(const std::string& address) {
  if (isPciAddress(address)) {
    return std::pair(std::string("pci"), address);
  }
  const std::size_t colon = address.find(':');
  if (colon == std::string::npos || address.starts_with("device:")) {
    return std::nullopt;
  }
  return std::pair(address.substr(0, colon), address.substr(colon + 1));
}

/// Whether there is any sense in asking about further devices.
bool takeAnswer(SourceContext& context, const std::string& what, Devlink::Answer answer,
                NetworkDevice& device) {
  switch (answer.error) {
    case 0:
      device.firmware.devlink = std::move(answer.info);
      return true;
    case ENODEV:  // a driver that has nothing to do with devlink
      return true;
    case EOPNOTSUPP:
      context.report(what, SourceReport::Reason::Absent, "the driver does not tell");
      return true;
    case ENOENT:
      context.report("devlink info", SourceReport::Reason::Absent, "the kernel has no devlink");
      return false;
    case ETIMEDOUT:
      context.report(what, SourceReport::Reason::TimedOut,
                     "no answer in " + std::to_string(devlinkLimit.count()) +
                         " ms; devlink is not asked about further devices");
      return false;
    default:
      context.reportError(what, answer.error);
      return true;
  }
}

}  // namespace

void askDrivers(SourceContext& context, Ethtool& ethtool, NetworkDevices& devices) {
  for (auto& [address, device] : devices) {
    for (const NetworkInterface& interface : device.interfaces) {
      if (!interface.hasInterface) {
        continue;
      }
      if (const auto told = ask(context, ethtool, interface.name, device.isVirtualFunction)) {
        fill(device.driverVersion, told->driverVersion);
        fill(device.firmware.driver, told->firmwareVersion);
      }
    }
  }
}

void askAddresses(SourceContext& context, Ethtool& ethtool, NetworkDevices& devices) {
  for (auto& [address, device] : devices) {
    for (NetworkInterface& interface : device.interfaces) {
      if (interface.facts.permanentAddress || !interface.hasInterface) {
        continue;
      }
      const std::string what = "ethtool permanent address of " + interface.name;
      context.doing(what);
      const Ethtool::Answer answer = ethtool.permanentAddress(interface.name);
      if (answer.error == 0) {
        interface.facts.permanentAddress = addressText(answer.bytes);
      } else if (answer.error != EOPNOTSUPP) {
        context.reportError(what, answer.error);
      }
    }
  }
}

void askDevlink(SourceContext& context, const NetlinkOpener& netlink, NetworkDevices& devices) {
  context.doing("devlink info");
  OpenedNetlink opened = netlink();
  if (!opened.channel) {
    context.reportError("devlink info", opened.error);
    return;
  }
  Devlink devlink(std::move(opened.channel), devlinkLimit);
  for (auto& [address, device] : devices) {
    const auto name = devlinkName(address);
    if (!name || device.isVirtualFunction) {
      continue;
    }
    const std::string what = "devlink info of " + name->first + "/" + name->second;
    context.doing(what);
    if (!takeAnswer(context, what, devlink.info(name->first, name->second), device)) {
      return;
    }
  }
}

}  // namespace agent::discovery
