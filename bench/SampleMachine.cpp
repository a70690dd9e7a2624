#include <bench/SampleMachine.h>

#include <cstdio>
#include <string>

namespace bench {

namespace {

using agent::NodeTreeBuilder;

std::string busAddress(std::size_t number) {
  char text[32];
  static_cast<void>(std::snprintf(text, sizeof(text), "%04zx:%02zx:%02zx.%zx", number >> 16U,
                                  (number >> 8U) & 0xffU, (number >> 3U) & 31U, number & 7U));
  return text;
}

std::string version(std::size_t number) {
  return std::to_string(number % 23) + "." + std::to_string(number % 7) + "." + std::to_string(number % 101);
}

}  // namespace

agent::NodeTree sampleMachine(std::size_t softwareElements) {
  NodeTreeBuilder builder;
  const auto computer = builder.add(NodeTreeBuilder::noParent, Oru::NodeLexicon::ComputerSystemNode,
                                    agent::computerPosition, "Computer System");
  builder.setText(computer, Oru::NodeLexicon::NameProperty, sampleComputerName);
  for (std::size_t i = 0; i < softwareElements; ++i) {
    const std::string address = busAddress(i);
    NodeTreeBuilder::Handle node = 0;
    if (i % 5 < 2) {
      const auto device =
          builder.add(computer, Oru::NodeLexicon::NetworkDeviceNode, "pci/" + address, "Network Device");
      node = builder.add(device, Oru::NodeLexicon::FirmwareNode, "pci/" + address + "/firmware",
                         "Network Firmware");
      builder.setText(node, Oru::NodeLexicon::VersionStringProperty, version(i));
      builder.setText(node, Oru::NodeLexicon::ManufacturerProperty, "Norvane Networks");
    } else if (i % 5 == 2) {
      node = builder.add(computer, Oru::NodeLexicon::FirmwareNode, "nvme/" + address, "Drive Firmware");
      builder.setText(node, Oru::NodeLexicon::VersionStringProperty, version(i));
      builder.setText(node, Oru::NodeLexicon::BuildIdProperty, "build-" + std::to_string(i));
    } else {
      node = builder.add(computer, Oru::NodeLexicon::DriverNode, "module/driver" + std::to_string(i),
                         "Device Driver");
      builder.setText(node, Oru::NodeLexicon::DriverVersionProperty, version(i));
    }
    builder.setText(node, Oru::NodeLexicon::NameProperty, "element " + std::to_string(i));
    builder.setText(node, Oru::NodeLexicon::ReleaseDateProperty, "12/31/20" + std::to_string(10 + i % 15));
    builder.setValue(node, Oru::NodeLexicon::MajorVersionProperty, static_cast<std::uint32_t>(i % 23));
    builder.setValue(node, Oru::NodeLexicon::MinorVersionProperty, static_cast<std::uint32_t>(i % 7));
  }
  return builder.build();
}

}  // namespace bench
