#include <agent/framework/OwnNumbers.h>
#include <cli/TreePrinter.h>

#include <gtest/gtest.h>

namespace {

using agent::NodeTreeBuilder;
namespace lexicon = Oru::NodeLexicon;

cli::Terminal terminal(cli::Charset charset) {
  cli::Terminal result;
  result.drawing = charset;
  result.values = charset;
  return result;
}

agent::NodeTree sampleTree() {
  NodeTreeBuilder builder;
  const auto computer =
      builder.add(NodeTreeBuilder::noParent, lexicon::ComputerSystemNode, "computer", "alpha");
  builder.setNumber(computer, 1);
  const auto bios = builder.add(computer, lexicon::FirmwareNode, "bios", "BIOS");
  builder.setNumber(bios, 0x2a);
  builder.setText(bios, lexicon::VersionStringProperty, "2.4.1");
  const auto card = builder.add(computer, lexicon::NetworkDeviceNode, "pci:0000:01:00.0", "Ethernet X");
  builder.setNumber(card, 26);
  const auto firmware = builder.add(card, lexicon::FirmwareNode, "fw", "Boot code");
  builder.setNumber(firmware, 0xabc);
  builder.setText(firmware, lexicon::NameProperty, "Mörk");
  const auto port = builder.add(card, lexicon::NetworkPortNode, "port", "eth0");
  builder.setNumber(port, 27);
  builder.setText(port, lexicon::NameProperty, "0000:01:00.0/0");
  const auto driver = builder.add(computer, lexicon::DriverNode, "module", "ixgbe");
  builder.setNumber(driver, 0xd);
  builder.setText(driver, lexicon::DriverVersionProperty, "5.1.0");
  builder.setText(driver, agent::DrivenDevicesProperty, "pci:0000:01:00.0");
  return builder.build();
}

TEST(TreePrinter, DrawsBranchesAndIdentifiers) {
  EXPECT_EQ(cli::printTree(sampleTree(), terminal(cli::Charset::Utf8)),
            "ComputerSystem alpha  [1]\n"
            "├─ Firmware BIOS, version 2.4.1  [1@2a]\n"
            "├─ NetworkDevice Ethernet X  [26]\n"
            "│  ├─ Firmware Boot code (Mörk)  [26@abc]\n"
            "│  └─ NetworkPort eth0 (0000:01:00.0/0)  [27]\n"
            "└─ Driver ixgbe, version 5.1.0, drives pci:0000:01:00.0  [1@d]\n");
}

TEST(TreePrinter, DrawsInAsciiWhereThatIsAll) {
  EXPECT_EQ(cli::printTree(sampleTree(), terminal(cli::Charset::Ascii)),
            "ComputerSystem alpha  [1]\n"
            "|- Firmware BIOS, version 2.4.1  [1@2a]\n"
            "|- NetworkDevice Ethernet X  [26]\n"
            "|  |- Firmware Boot code (M?rk)  [26@abc]\n"
            "|  `- NetworkPort eth0 (0000:01:00.0/0)  [27]\n"
            "`- Driver ixgbe, version 5.1.0, drives pci:0000:01:00.0  [1@d]\n");
}

TEST(TreePrinter, SaysWhatCouldNotBeRead) {
  NodeTreeBuilder builder;
  builder.setNumber(builder.add(NodeTreeBuilder::noParent, lexicon::ComputerSystemNode, "computer", "alpha"),
                    1);
  builder.addReport({"dmi", "/sys/class/dmi/id", agent::SourceReport::Reason::Absent, ""});
  builder.addReport(
      {"network", "eth0", agent::SourceReport::Reason::NoPermission, "Operation not permitted"});
  builder.addReport({"drivers", "", agent::SourceReport::Reason::TimedOut, ""});
  EXPECT_EQ(cli::printTree(builder.build(), terminal(cli::Charset::Utf8)),
            "ComputerSystem alpha  [1]\n"
            "\n"
            "Could not be read:\n"
            "  dmi: /sys/class/dmi/id: absent\n"
            "  network: eth0: no permission (Operation not permitted)\n"
            "  drivers: timed out\n");
}

TEST(TreePrinter, SeveralComputersStandSideBySide) {
  NodeTreeBuilder builder;
  for (const agent::NodeNumber number : {1U, 5U}) {
    const auto computer = builder.add(NodeTreeBuilder::noParent, lexicon::ComputerSystemNode,
                                      "c" + std::to_string(number), "host");
    builder.setNumber(computer, number);
    builder.setNumber(builder.add(computer, lexicon::BiosNode, "b" + std::to_string(number), ""), number + 1);
  }
  EXPECT_EQ(cli::printTree(builder.build(), terminal(cli::Charset::Utf8)),
            "ComputerSystem host  [1]\n"
            "└─ Bios  [1@2]\n"
            "ComputerSystem host  [5]\n"
            "└─ Bios  [5@6]\n");
}

TEST(TreePrinter, SoftwareWithoutAParentAndUnknownTypes) {
  NodeTreeBuilder builder;
  builder.setNumber(builder.add(NodeTreeBuilder::noParent, lexicon::DriverNode, "d", "x"), 0x10);
  builder.setNumber(builder.add(NodeTreeBuilder::noParent, 1234, "y", "y"), 17);
  EXPECT_EQ(cli::printTree(builder.build(), terminal(cli::Charset::Utf8)),
            "Driver x  [0@10]\n"
            "type 1234 y  [17]\n");
}

TEST(TreePrinter, AnEmptyTreeIsEmpty) {
  EXPECT_EQ(cli::printTree(agent::NodeTree(), terminal(cli::Charset::Utf8)), "");
}

}  // namespace
