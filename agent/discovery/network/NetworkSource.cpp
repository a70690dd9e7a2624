#include <agent/discovery/network/Interfaces.h>
#include <agent/discovery/network/NetworkSource.h>
#include <agent/framework/OwnNumbers.h>

#include <Oru/NodeLexicon.h>

#include <algorithm>
#include <cerrno>
#include <utility>
#include <vector>

namespace agent::discovery {

namespace {

/// By device: what the driver of its first port that says anything says.
using InfoByDevice = std::map<std::string, DriverInfo>;

std::optional<DriverInfo> ask(SourceContext& context, Ethtool& ethtool, const std::string& interface) {
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
  } else if (!info->firmwareVersion) {
    context.report(what, SourceReport::Reason::Absent, "the driver tells no firmware version");
  }
  return info;
}

void fill(std::optional<std::string>& known, const std::optional<std::string>& told) {
  if (!known) {
    known = told;
  }
}

/// Asks for the permanent addresses that the interfaces' attributes do not tell: of the members of a bond,
/// for example, which all bear the bond's address.
void askAddresses(SourceContext& context, Ethtool& ethtool, InterfacesByDevice& devices) {
  for (auto& [address, interfaces] : devices) {
    for (NetworkInterface& interface : interfaces) {
      if (interface.facts.permanentAddress) {
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

InfoByDevice askDrivers(SourceContext& context, Ethtool& ethtool, const InterfacesByDevice& devices) {
  InfoByDevice infos;
  for (const auto& [address, interfaces] : devices) {
    DriverInfo& known = infos[address];
    for (const NetworkInterface& interface : interfaces) {
      if (const std::optional<DriverInfo> told = ask(context, ethtool, interface.name)) {
        fill(known.driverVersion, told->driverVersion);
        fill(known.firmwareVersion, told->firmwareVersion);
      }
    }
  }
  return infos;
}

FoundNode deviceNode(const std::string& address, std::vector<NetworkInterface> interfaces,
                     const DriverInfo& info) {
  using namespace Oru;
  FoundNode device{NodeLexicon::NetworkDeviceNode, address, "Network Device", {}, {}, {}};
  device.setText(NodeLexicon::DriverVersionProperty, info.driverVersion);
  if (info.firmwareVersion) {
    FoundNode firmware{NodeLexicon::FirmwareNode, address + "/firmware", "Network Firmware", {}, {}, {}};
    firmware.setText(NodeLexicon::VersionStringProperty, info.firmwareVersion);
    device.children.push_back(std::move(firmware));
  }
  const std::vector<std::string> identifiers = sortAndIdentify(address, interfaces);
  for (std::size_t i = 0; i < interfaces.size(); ++i) {
    FoundNode port{NodeLexicon::NetworkPortNode, identifiers[i], interfaces[i].name, {}, {}, {}};
    port.setText(NodeLexicon::NameProperty, identifiers[i]);
    const PortFacts& facts = interfaces[i].facts;
    port.setText(PermanentAddressProperty, facts.permanentAddress);
    port.setText(LinkTechnologyProperty, facts.linkTechnology);
    port.setText(StateProperty, facts.state);
    if (facts.speed) {
      port.setValue(SpeedProperty, *facts.speed);
    }
    device.children.push_back(std::move(port));
  }
  return device;
}

std::vector<FoundNode> nodesOf(const InterfacesByDevice& devices, const InfoByDevice& infos) {
  std::vector<FoundNode> nodes;
  for (const auto& [address, interfaces] : devices) {
    const auto info = infos.find(address);
    nodes.push_back(deviceNode(address, interfaces, info == infos.end() ? DriverInfo{} : info->second));
  }
  // Clients that follow an association to the first device alone should find one with firmware there.
  std::stable_partition(nodes.begin(), nodes.end(), [](const FoundNode& device) {
    return device.children.front().type == Oru::NodeLexicon::FirmwareNode;
  });
  return nodes;
}

}  // namespace

void readNetwork(SourceContext& context, const std::shared_ptr<Ethtool>& ethtool) {
  InterfacesByDevice devices = findInterfaces(context);
  context.result().nodes = nodesOf(devices, {});
  if (devices.empty()) {
    return;
  }
  if (ethtool == nullptr) {
    context.report("ethtool driver info", SourceReport::Reason::Absent,
                   "only the running kernel can tell, and it is not asked for another system root");
    return;
  }
  context.publish();  // a driver may hang
  const InfoByDevice infos = askDrivers(context, *ethtool, devices);
  askAddresses(context, *ethtool, devices);
  context.result().nodes = nodesOf(devices, infos);
}

}  // namespace agent::discovery
