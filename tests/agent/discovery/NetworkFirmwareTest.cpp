// The firmware of a network device: the driver's own answer, the versions of its parts, InfiniBand's.
#include "DevlinkBytes.h"
#include "Machine.h"

#include <agent/discovery/network/NetworkFirmware.h>
#include <agent/framework/OwnNumbers.h>

#include <gtest/gtest.h>

#include <algorithm>
#include <optional>

namespace agent::discovery::test {
namespace {

using Lines = std::vector<std::string>;

const std::string device = "0000:03:00.0";

FirmwareAnswers answers(std::optional<std::string> driver, std::string_view devlink) {
  return {std::move(driver), std::nullopt, parseDevlinkInfo(devlinkAttributes(devlink))};
}

/// Each node: "POSITION DESCRIPTION ID=TEXT ...", the position without the device's.
Lines linesOf(const FirmwareAnswers& told) {
  Lines lines;
  for (const FoundNode& node : firmwareNodes(device, told)) {
    EXPECT_EQ(node.type, Oru::NodeLexicon::FirmwareNode);
    EXPECT_TRUE(node.position.starts_with(device + "/firmware")) << node.position;
    std::string line = node.position.substr(device.size()) + " " + node.description;
    for (const auto& [property, text] : node.texts) {
      line += " " + std::to_string(property) + "=" + text;
    }
    lines.push_back(line);
  }
  return lines;
}

TEST(NetworkFirmware, IsOneElementForEachPartWithAVersion) {
  EXPECT_EQ(linesOf(answers("4.20 0x8001784e 1.2992.0",
                            "running fw.mgmt=7.1.2;running fw.undi=1.2992.0;running fw.app=1.3.30.0;"
                            "running fw.netlist=2.40.2000;running fw.ncsi=3.1;running fw.roce=5.2;"
                            "running fw.bootloader=1.0;running fpga.rev=0x14")),
            (Lines{"/firmware Network Firmware 307=4.20 0x8001784e 1.2992.0",
                   "/firmware/fw.mgmt Network Control Firmware 108=fw.mgmt 307=7.1.2",
                   "/firmware/fw.undi Network Option ROM 108=fw.undi 307=1.2992.0",
                   "/firmware/fw.app Network Packet Processing Firmware 108=fw.app 307=1.3.30.0",
                   "/firmware/fw.netlist Network Board Configuration 108=fw.netlist 307=2.40.2000",
                   "/firmware/fw.ncsi Network Sideband Firmware 108=fw.ncsi 307=3.1",
                   "/firmware/fw.roce Network RDMA Firmware 108=fw.roce 307=5.2",
                   "/firmware/fw.bootloader Network Boot Loader 108=fw.bootloader 307=1.0",
                   "/firmware/fpga.rev Network Component Firmware 108=fpga.rev 307=0x14"}));
}

TEST(NetworkFirmware, TheWholeDevicesIsNoSecondElement) {
  const Lines once{"/firmware Network Firmware 307=16.32.1010 (MT_0000000012)"};
  EXPECT_EQ(linesOf(answers("16.32.1010 (MT_0000000012)", "running fw=16.32.1010")), once);
  EXPECT_EQ(
      linesOf(answers("16.32.1010 (MT_0000000012)", "running fw.version=16.32.1010;running fw=16.32.1010")),
      once);
}

TEST(NetworkFirmware, APartWithTheDriversVersionIsNoSecondElement) {
  EXPECT_EQ(linesOf(answers("10.20.30", "running fw.mgmt=10.20.30;stored fw.mgmt=10.20.31")),
            (Lines{"/firmware Network Firmware 307=10.20.30 1010=10.20.31"}));
  EXPECT_EQ(linesOf(answers("2.0", "running fw=2.0;running fw.mgmt=2.0")),
            (Lines{"/firmware Network Firmware 307=2.0",
                   "/firmware/fw.mgmt Network Control Firmware 108=fw.mgmt 307=2.0"}))
      << "the whole has a name of its own here";
  EXPECT_EQ(linesOf(answers("2.0", "running fw.mgmt=2.0;running fw.undi=2.0")),
            (Lines{"/firmware Network Firmware 307=2.0",
                   "/firmware/fw.undi Network Option ROM 108=fw.undi 307=2.0"}))
      << "one part is the driver's, not every part";
}

TEST(NetworkFirmware, WithoutTheDriversAnswerIsDevlinks) {
  EXPECT_EQ(linesOf(answers(std::nullopt, "running fw=1.2;running fw.mgmt=3.4")),
            (Lines{"/firmware Network Firmware 307=1.2",
                   "/firmware/fw.mgmt Network Control Firmware 108=fw.mgmt 307=3.4"}));
  EXPECT_EQ(linesOf(answers(std::nullopt, "running fw.mgmt=3.4")),
            (Lines{"/firmware/fw.mgmt Network Control Firmware 108=fw.mgmt 307=3.4"}));
  EXPECT_EQ(linesOf(answers(std::nullopt, "")), Lines{});
}

TEST(NetworkFirmware, ARowOfItsPartsVersionsIsNone) {
  const std::string parts = "running fw.mgmt=7.1.2;running fw.mgmt.api=1.7;running fw.undi=1.2992.0";
  const Lines apart{"/firmware/fw.mgmt Network Control Firmware 108=fw.mgmt 307=7.1.2",
                    "/firmware/fw.undi Network Option ROM 108=fw.undi 307=1.2992.0"};
  EXPECT_EQ(linesOf(answers("7.1.2 1.7 1.2992.0", parts)), apart);
  EXPECT_EQ(linesOf(answers("7.1.2 1.7 1.2992.1", parts)).size(), 3U) << "another text is the driver's own";
  EXPECT_EQ(linesOf(answers("01234567890123456789 0123456789",
                            "running fw.mgmt=01234567890123456789;running fw.undi=0123456789abc")),
            (Lines{"/firmware/fw.mgmt Network Control Firmware 108=fw.mgmt 307=01234567890123456789",
                   "/firmware/fw.undi Network Option ROM 108=fw.undi 307=0123456789abc"}))
      << "cut at the width of the driver's field";
}

TEST(NetworkFirmware, StoredVersionIsToldWhereAnotherOneRuns) {
  EXPECT_EQ(linesOf(answers("1.0",
                            "running fw=1.0;running fw.undi=2.0;stored fw=1.1;stored fw.undi=2.0;"
                            "stored fw.ncsi=9.9")),
            (Lines{"/firmware Network Firmware 307=1.0 1010=1.1",
                   "/firmware/fw.undi Network Option ROM 108=fw.undi 307=2.0"}))
      << "nobody knows what runs of a version that is stored alone";
}

TEST(NetworkFirmware, BuildsAndNamesBelongToTheirPart) {
  EXPECT_EQ(linesOf(answers(std::nullopt,
                            "running fw.mgmt=7.1.2;running fw.mgmt.build=0x305d955f;running fw.app=1.3.30.0;"
                            "running fw.app.name=Packet Default Package")),
            (Lines{"/firmware/fw.mgmt Network Control Firmware 108=fw.mgmt 307=7.1.2 171=0x305d955f",
                   "/firmware/fw.app Network Packet Processing Firmware 108=Packet Default Package "
                   "307=1.3.30.0"}));
}

TEST(NetworkFirmware, WhatIsNoFirmwareIsADetailOfTheDevice) {
  const DevlinkInfo info = parseDevlinkInfo(
      devlinkAttributes("fixed board.id=K91258-000;fixed asic.rev=1;running fw.psid=MT_12;running fw=1;"
                        "running fw.mgmt.api=1.7;running fw.bundle_id=0x8001784e;running fw.undi.build=7;"
                        "running board.rev=A"));
  EXPECT_EQ(deviceDetails(info),
            "board.id=K91258-000, asic.rev=1, fw.psid=MT_12, fw.mgmt.api=1.7, fw.bundle_id=0x8001784e, "
            "fw.undi.build=7, board.rev=A");
  EXPECT_EQ(linesOf({std::nullopt, std::nullopt, info}), (Lines{"/firmware Network Firmware 307=1"}));
  EXPECT_EQ(deviceDetails(parseDevlinkInfo(devlinkAttributes("running fw=1;running fw.mgmt=2"))),
            std::nullopt);
}

TEST(NetworkFirmware, VersionsOfZeroesAreNone) {
  EXPECT_EQ(linesOf(answers("0.0.0", "running fw=0.0;running fw.undi=0.0.0;running fw.mgmt=0.1")),
            (Lines{"/firmware/fw.mgmt Network Control Firmware 108=fw.mgmt 307=0.1"}));
}

TEST(NetworkFirmware, InfinibandTellsWhereNobodyElseDoes) {
  FirmwareAnswers told = answers(std::nullopt, "");
  told.infiniband = "20.31.1014";
  EXPECT_EQ(linesOf(told), (Lines{"/firmware Network Firmware 307=20.31.1014"}));
  told.driver = "20.31.1014 (MT_0000000223)";
  EXPECT_EQ(linesOf(told), (Lines{"/firmware Network Firmware 307=20.31.1014 (MT_0000000223)"}));
  EXPECT_EQ(firmwareNodes(device, told).front().otherVersions, (Lines{"20.31.1014"}))
      << "what a table of the machine may declare it by";
  told = answers(std::nullopt, "running fw.mgmt=3.4");
  told.infiniband = "0.0.0";
  EXPECT_EQ(linesOf(told), (Lines{"/firmware/fw.mgmt Network Control Firmware 108=fw.mgmt 307=3.4"}));
}

TEST(NetworkFirmware, NoNameOfADriverChangesWhatAnElementIs) {
  for (const char* name : {"BIOS", "fw.uefi", "BMC Firmware", "FPGA Firmware", "Baseboard", "fw.diagnostic",
                           "Diagnostic", "fpga.app"}) {
    const auto nodes = firmwareNodes(
        device, answers(std::nullopt, "running " + std::string(name) + "=1;running " + name + ".name=BIOS"));
    ASSERT_EQ(nodes.size(), 1U) << name;
    for (const char* word : {"BIOS", "UEFI", "BMC", "FPGA", "Baseboard", "Diagnostic"}) {
      EXPECT_EQ(nodes.front().description.find(word), std::string::npos) << name;
    }
  }
}

}  // namespace
}  // namespace agent::discovery::test
