#include <agent/discovery/BusAddress.h>
#include <agent/discovery/network/Infiniband.h>
#include <agent/discovery/network/NetworkDevice.h>
#include <agent/discovery/network/NetworkQuestions.h>
#include <agent/discovery/network/NetworkSource.h>
#include <agent/framework/OwnNumbers.h>

#include <Oru/NodeLexicon.h>

#include <algorithm>
#include <utility>
#include <vector>

namespace agent::discovery {

namespace {

bool isVirtualFunction(SourceContext& context, const std::string& address) {
  return isPciAddress(address) &&
         context.root().linkTarget("sys/bus/pci/devices/" + address + "/physfn").error == 0;
}

NetworkDevices findDevices(SourceContext& context) {
  NetworkDevices devices;
  for (auto& [address, interfaces] : findInterfaces(context)) {
    devices[address].interfaces = std::move(interfaces);
  }
  for (auto& [address, adapter] : findInfiniband(context)) {
    const bool isKnown = devices.contains(address);
    if (!isKnown && adapter.ports.empty()) {
      continue;
    }
    NetworkDevice& device = devices[address];
    device.firmware.infiniband = std::move(adapter.firmware);
    if (!isKnown) {
      device.interfaces = std::move(adapter.ports);
    }
  }
  for (auto& [address, device] : devices) {
    device.isVirtualFunction = isVirtualFunction(context, address);
  }
  return devices;
}

FoundNode portNode(const std::string& identifier, const NetworkInterface& interface) {
  FoundNode port{Oru::NodeLexicon::NetworkPortNode, identifier, interface.name, {}, {}, {}};
  port.setText(Oru::NodeLexicon::NameProperty, identifier);
  const PortFacts& facts = interface.facts;
  port.setText(PermanentAddressProperty, facts.permanentAddress);
  port.setText(LinkTechnologyProperty, facts.linkTechnology);
  port.setText(StateProperty, facts.state);
  if (facts.speed) {
    port.setValue(SpeedProperty, *facts.speed);
  }
  return port;
}

FoundNode nodeOf(const std::string& address, const NetworkDevice& device) {
  FoundNode node{Oru::NodeLexicon::NetworkDeviceNode, address, "Network Device", {}, {}, {}};
  node.setText(Oru::NodeLexicon::DriverVersionProperty, device.driverVersion);
  node.setText(DeviceDetailsProperty, deviceDetails(device.firmware.devlink));
  if (!device.isVirtualFunction) {
    node.children = firmwareNodes(address, device.firmware);
  }
  std::vector<NetworkInterface> interfaces = device.interfaces;
  const std::vector<std::string> identifiers = sortAndIdentify(address, interfaces);
  for (std::size_t i = 0; i < interfaces.size(); ++i) {
    node.children.push_back(portNode(identifiers[i], interfaces[i]));
  }
  return node;
}

std::vector<FoundNode> nodesOf(const NetworkDevices& devices) {
  std::vector<FoundNode> nodes;
  nodes.reserve(devices.size());
  for (const auto& [address, device] : devices) {
    nodes.push_back(nodeOf(address, device));
  }
  // Clients that follow an association to the first device alone should find one with firmware there.
  std::stable_partition(nodes.begin(), nodes.end(), [](const FoundNode& device) {
    return device.children.front().type == Oru::NodeLexicon::FirmwareNode;
  });
  return nodes;
}

}  // namespace

void readNetwork(SourceContext& context, const std::shared_ptr<Ethtool>& ethtool,
                 const NetlinkOpener& netlink) {
  NetworkDevices devices = findDevices(context);
  context.result().nodes = nodesOf(devices);
  if (devices.empty()) {
    return;
  }
  if (ethtool == nullptr && !netlink) {
    for (const char* what : {"ethtool driver info", "devlink info"}) {
      context.report(what, SourceReport::Reason::Absent,
                     "only the running kernel can tell, and it is not asked for another system root");
    }
    return;
  }
  context.publish();  // a driver may hang, in this and in any later question
  if (ethtool != nullptr) {
    askDrivers(context, *ethtool, devices);
    askAddresses(context, *ethtool, devices);
    context.result().nodes = nodesOf(devices);
  }
  if (netlink) {
    context.publish();
    askDevlink(context, netlink, devices);
    context.result().nodes = nodesOf(devices);
  }
}

}  // namespace agent::discovery
