// Drives and the adapters that they hang on.
#include "Machine.h"

#include <agent/discovery/storage/AtaPage.h>
#include <agent/discovery/storage/ScsiPlace.h>

#include <gtest/gtest.h>

#include <cerrno>

namespace agent::discovery::test {
namespace {

/// Writes `text` as words with swapped bytes, filled up with blanks.
void putWords(std::string& page, std::size_t word, std::size_t count, const std::string& text) {
  std::string field = text;
  field.resize(2 * count, ' ');
  for (std::size_t i = 0; i < field.size(); i += 2) {
    page[60 + 2 * word + i] = field[i + 1];
    page[60 + 2 * word + i + 1] = field[i];
  }
}

/// A vital product data page 89h.
std::string ataPage(const std::string& firmware, const std::string& model) {
  std::string page(572, '\0');
  page[1] = '\x89';
  page[2] = '\x02';
  page[3] = '\x38';
  page[56] = '\xec';
  putWords(page, 10, 10, "SERIAL-1");
  putWords(page, 23, 4, firmware);
  putWords(page, 27, 20, model);
  return page;
}

TEST(AtaPage, ByteSwappedWordsAreReadInOrder) {
  const auto identity = parseAtaPage(ataPage("KT0A1234", "Solid Drive 960 with a long name"));
  ASSERT_TRUE(identity);
  EXPECT_EQ(identity->firmware, "KT0A1234");
  EXPECT_EQ(identity->model, "Solid Drive 960 with a long name");
}

TEST(AtaPage, BlankPaddingIsNoPartOfAValue) {
  EXPECT_EQ(parseAtaPage(ataPage("2.5+", "Drive"))->firmware, "2.5+");
  EXPECT_EQ(parseAtaPage(ataPage("    1.0", "  Drive"))->firmware, "1.0") << "in front as well";
  EXPECT_EQ(parseAtaPage(ataPage(std::string("3B\0\0\0\0\0\0", 8), "D"))->firmware, "3B");
  EXPECT_EQ(parseAtaPage(ataPage("", ""))->firmware, std::nullopt);
  EXPECT_EQ(parseAtaPage(ataPage("", ""))->model, std::nullopt);
}

TEST(AtaPage, OtherBytesAreNone) {
  const std::string page = ataPage("KT0A1234", "Drive");
  EXPECT_FALSE(parseAtaPage(""));
  EXPECT_FALSE(parseAtaPage(std::string_view(page).substr(0, page.size() - 1)));
  std::string otherPage = page;
  otherPage[1] = '\x83';
  EXPECT_FALSE(parseAtaPage(otherPage));
  std::string otherCommand = page;
  otherCommand[56] = '\0';
  EXPECT_FALSE(parseAtaPage(otherCommand));
  std::string packet = page;
  packet[56] = '\xa1';
  EXPECT_TRUE(parseAtaPage(packet));
}

TEST(ScsiAddressText, HasFourNumbers) {
  const auto address = parseScsiAddress("10:0:3:4294967296");
  ASSERT_TRUE(address);
  EXPECT_EQ(address->host, 10U);
  EXPECT_EQ(address->target, 3U);
  EXPECT_EQ(address->lun, 4294967296U);
  for (const char* text : {"", "0", "0:0:0", "0:0:0:", "0:0:0:0:0", "a:0:0:0", "0:0:0:0 ", "4294967296:0:0:0",
                           "-1:0:0:0", "0::0:0"}) {
    EXPECT_FALSE(parseScsiAddress(text)) << text;
  }
}

TEST(StorageSource, NvmeDriveWithItsFirmware) {
  const Machine machine(R"(
    sys/class/nvme/nvme0 -> ../../devices/pci0000:00/0000:00:04.0/nvme/nvme0
    sys/devices/pci0000:00/0000:00:04.0/subsystem -> ../../../bus/pci
    sys/devices/pci0000:00/0000:00:04.0/nvme/nvme0/subsystem -> ../../../../../class/nvme
    sys/devices/pci0000:00/0000:00:04.0/nvme/nvme0/firmware_rev = EDA7602Q   
    sys/devices/pci0000:00/0000:00:04.0/nvme/nvme0/model = Fast Drive 2T           
    sys/devices/pci0000:00/0000:00:04.0/nvme/nvme0/transport = pcie
  )");
  const NodeTree tree = discoverAt(machine);
  EXPECT_EQ(shown(tree), R"(40 Computer System
  1000 NVMe Drive 108="Fast Drive 2T"
    3 Drive Firmware 108="Fast Drive 2T" 307="EDA7602Q"
)");
  EXPECT_EQ(tree.position(described(tree, "NVMe Drive")), "0000:00:04.0");
}

TEST(StorageSource, NvmeDrivesOfOtherMachinesAreNoPartOfThisOne) {
  const Machine machine(R"(
    sys/class/nvme/nvme0/firmware_rev = 6.1.0
    sys/class/nvme/nvme0/transport = tcp
  )");
  EXPECT_EQ(shown(discoverAt(machine)), "40 Computer System\n");
}

TEST(StorageSource, AVersionThatIsMissingIsReportedOrMakesNoNode) {
  const Machine machine(R"(
    sys/class/nvme/nvme0/model = Fast Drive
    sys/class/scsi_device/0:0:0:0/device/model = Old Drive
    sys/class/scsi_device/0:0:0:0/device/rev = N/A
  )");
  const NodeTree tree = discoverAt(machine);
  EXPECT_EQ(shown(tree), "40 Computer System\n");
  const auto report = reportOn(tree, "storage", "nvme0/firmware_rev");
  ASSERT_TRUE(report);
  EXPECT_EQ(report->reason, SourceReport::Reason::Absent);
}

/// A SATA controller with a drive on its second port, as the third host of the machine.
const std::string sata = "sys/devices/pci0000:00/0000:00:1f.2/ata3/host2/target2:0:0/2:0:0:0";
constexpr std::string_view sataDrive = R"(
  sys/class/scsi_device/2:0:0:0/device -> ../../../devices/pci0000:00/0000:00:1f.2/ata3/host2/target2:0:0/2:0:0:0
  sys/devices/pci0000:00/0000:00:1f.2/subsystem -> ../../../bus/pci
  sys/devices/pci0000:00/0000:00:1f.2/ata3/ata_port/ata3/port_no = 2
  sys/devices/pci0000:00/0000:00:1f.2/ata3/host2/subsystem -> ../../../../../bus/scsi
  sys/devices/pci0000:00/0000:00:1f.2/ata3/host2/target2:0:0/2:0:0:0/type = 0
  sys/devices/pci0000:00/0000:00:1f.2/ata3/host2/target2:0:0/2:0:0:0/vendor = ATA     
  sys/devices/pci0000:00/0000:00:1f.2/ata3/host2/target2:0:0/2:0:0:0/model = Solid Drive 960 
  sys/devices/pci0000:00/0000:00:1f.2/ata3/host2/target2:0:0/2:0:0:0/rev = 1234
)";

TEST(StorageSource, AtaDriveShowsTheWholeOfItsRevision) {
  Machine machine(sataDrive);
  machine.write(sata + "/vpd_pg89", ataPage("KT0A1234", "Solid Drive 960 with a long name"));
  const NodeTree tree = discoverAt(machine);
  EXPECT_EQ(shown(tree), R"(40 Computer System
  1000 Drive 108="Solid Drive 960 with a long name"
    3 Drive Firmware 108="Solid Drive 960 with a long name" 307="KT0A1234"
)");
  EXPECT_EQ(tree.position(described(tree, "Drive")), "0000:00:1f.2/ata2/0:0:0")
      << "the port of its controller, not the third of the machine";
}

TEST(StorageSource, WithoutThePageTheCutRevisionStands) {
  Machine machine(sataDrive);
  EXPECT_NE(shown(discoverAt(machine)).find("3 Drive Firmware 108=\"Solid Drive 960\" 307=\"1234\""),
            std::string::npos);
  machine.write(sata + "/vpd_pg89", "too short");
  EXPECT_NE(shown(discoverAt(machine)).find("307=\"1234\""), std::string::npos);
}

TEST(StorageSource, ScsiDevicesAreCalledByTheirType) {
  Machine machine("");
  const auto device = [&](const std::string& address, const std::string& type, const std::string& model) {
    const std::string folder = "sys/class/scsi_device/" + address + "/device/";
    machine.add(folder + "type = " + type + "\n" + folder + "vendor = Corvane\n" + folder +
                "model = " + model + "\n" + folder + "rev = 1.00\n");
  };
  device("0:0:0:0", "0", "Disk BIOS UEFI Diagnostic");
  device("0:0:1:0", "5", "Optical FPGA Firmware");
  device("0:0:2:0", "13", "Shelf Baseboard");
  device("0:0:3:0", "12", "Controller BMC Firmware");
  EXPECT_EQ(shown(discoverAt(machine)), R"(40 Computer System
  1000 Drive 36="Corvane" 108="Disk BIOS UEFI Diagnostic"
    3 Drive Firmware 36="Corvane" 108="Disk BIOS UEFI Diagnostic" 307="1.00"
  1000 Optical Drive 36="Corvane" 108="Optical FPGA Firmware"
    3 Drive Firmware 36="Corvane" 108="Optical FPGA Firmware" 307="1.00"
  1000 Storage Enclosure 36="Corvane" 108="Shelf Baseboard"
    3 Storage Enclosure Firmware 36="Corvane" 108="Shelf Baseboard" 307="1.00"
  1000 Storage Controller 36="Corvane" 108="Controller BMC Firmware"
    3 Storage Controller Firmware 36="Corvane" 108="Controller BMC Firmware" 307="1.00"
)") << "whatever the models are called";
}

TEST(StorageSource, LogicalUnitsThatSayTheSameAreOneDevice) {
  Machine machine("sys/devices/pci0000:00/0000:02:00.0/subsystem -> ../../../bus/pci");
  for (const char* unit : {"0", "1", "2", "10"}) {
    const std::string name = std::string("4:0:7:") + unit;
    const std::string folder = "sys/devices/pci0000:00/0000:02:00.0/host4/target4:0:7/" + name;
    machine.add("sys/class/scsi_device/" + name + "/device -> ../../../../" + folder + "\n" + folder +
                "/rev = 8.00\n" + folder + "/model = " + (unit[0] == '2' ? "Other" : "Volume") + "\n");
  }
  const NodeTree tree = discoverAt(machine);
  std::vector<std::string> positions;
  for (const NodeTree::Index device : tree.ofType(1000)) {
    positions.emplace_back(tree.position(device));
  }
  EXPECT_EQ(positions, (std::vector<std::string>{"0000:02:00.0/host0/0:7:0", "0000:02:00.0/host0/0:7:2"}));
}

TEST(StorageSource, TargetsOfATransportAreKnownByItsAddress) {
  Machine machine(R"(
    sys/devices/pci0000:00/0000:02:00.0/subsystem -> ../../../bus/pci
    sys/class/scsi_device/6:0:9:0/device -> ../../../devices/pci0000:00/0000:02:00.0/host6/port-6:0/end_device-6:0/target6:0:9/6:0:9:0
    sys/devices/pci0000:00/0000:02:00.0/host6/port-6:0/end_device-6:0/sas_device/end_device-6:0/sas_address = 0x5000c500a1b2c3d5
    sys/devices/pci0000:00/0000:02:00.0/host6/port-6:0/end_device-6:0/target6:0:9/6:0:9:0/rev = N004
    sys/class/scsi_device/7:0:1:5/device -> ../../../devices/pci0000:00/0000:02:00.0/host7/rport-7:0-1/target7:0:1/7:0:1:5
    sys/devices/pci0000:00/0000:02:00.0/host7/rport-7:0-1/fc_remote_ports/rport-7:0-1/port_name = 0x20000025b5000001
    sys/devices/pci0000:00/0000:02:00.0/host7/rport-7:0-1/target7:0:1/7:0:1:5/rev = 0001
    sys/class/scsi_device/8:0:1:0/device -> ../../../devices/pci0000:00/0000:02:00.0/host8/target8:0:1/8:0:1:0
    sys/devices/pci0000:00/0000:02:00.0/host8/target8:0:1/8:0:1:0/rev = 2
  )");
  const NodeTree tree = discoverAt(machine);
  std::vector<std::string> positions;
  for (const NodeTree::Index device : tree.ofType(1000)) {
    positions.emplace_back(tree.position(device));
  }
  EXPECT_EQ(positions,
            (std::vector<std::string>{"0000:02:00.0/fc:0x20000025b5000001:5", "0000:02:00.0/host2/0:1:0",
                                      "0000:02:00.0/sas:0x5000c500a1b2c3d5:0"}));
}

TEST(StorageSource, AdapterTheVersionBelongsToIsTheDevice) {
  const Machine machine(R"(
    sys/devices/pci0000:00/0000:05:00.0/subsystem -> ../../../bus/pci
    sys/class/scsi_host/host0 -> ../../devices/pci0000:00/0000:05:00.0/host0/scsi_host/host0
    sys/devices/pci0000:00/0000:05:00.0/host0/scsi_host/host0/version_fw = 16.00.11.00
    sys/devices/pci0000:00/0000:05:00.0/host0/scsi_host/host0/version_bios = 08.37.00.00
    sys/devices/pci0000:00/0000:05:00.0/host0/scsi_host/host0/board_name = SAS9300-8i UEFI
    sys/devices/pci0000:00/0000:06:00.0/subsystem -> ../../../bus/pci
    sys/class/scsi_host/host1 -> ../../devices/pci0000:00/0000:06:00.0/host1/scsi_host/host1
    sys/devices/pci0000:00/0000:06:00.0/host1/scsi_host/host1/firmware_revision = 8.32
    sys/class/scsi_host/host2 -> ../../devices/pci0000:00/0000:00:1f.2/ata1/host2/scsi_host/host2
    sys/devices/pci0000:00/0000:00:1f.2/ata1/host2/scsi_host/host2/proc_name = ahci
  )");
  const NodeTree tree = discoverAt(machine);
  EXPECT_EQ(shown(tree), R"(40 Computer System
  1000 Storage Adapter 108="SAS9300-8i UEFI"
    3 Storage Adapter Firmware 108="SAS9300-8i UEFI" 307="16.00.11.00"
    3 Storage Adapter BIOS 108="SAS9300-8i UEFI" 307="08.37.00.00"
  1000 Storage Adapter
    3 Storage Adapter Firmware 307="8.32"
)");
  EXPECT_EQ(tree.position(described(tree, "Storage Adapter")), "0000:05:00.0");
  EXPECT_FALSE(reportOn(tree, "storage", ""));
}

TEST(StorageSource, AdapterVersionOfZerosIsAbsent) {
  const Machine machine(R"(
    sys/class/scsi_host/host0 -> ../../devices/0000:05:00.0/host0/scsi_host/host0
    sys/devices/0000:05:00.0/host0/scsi_host/host0/version_fw = 01.10.00.00
    sys/devices/0000:05:00.0/host0/scsi_host/host0/version_bios = 00.00.00.00
  )");
  EXPECT_EQ(shown(discoverAt(machine)), R"(40 Computer System
  1000 Storage Adapter
    3 Storage Adapter Firmware 307="01.10.00.00"
)");
}

TEST(StorageSource, FibreChannelHostsOfOneFunctionAreOneAdapter) {
  const Machine machine(R"(
    sys/devices/pci0000:00/0000:07:00.0/subsystem -> ../../../bus/pci
    sys/class/fc_host/host3 -> ../../devices/pci0000:00/0000:07:00.0/host3/fc_host/host3
    sys/devices/pci0000:00/0000:07:00.0/host3/fc_host/host3/firmware_version = 9.12.01
    sys/devices/pci0000:00/0000:07:00.0/host3/fc_host/host3/optionrom_version = 3.70
    sys/devices/pci0000:00/0000:07:00.0/host3/fc_host/host3/manufacturer = Corvane
    sys/devices/pci0000:00/0000:07:00.0/host3/fc_host/host3/model = FC32
    sys/class/fc_host/host5 -> ../../devices/pci0000:00/0000:07:00.0/host3/vport-3:0-0/host5/fc_host/host5
    sys/devices/pci0000:00/0000:07:00.0/host3/vport-3:0-0/host5/fc_host/host5/firmware_version = 9.12.01
  )");
  EXPECT_EQ(shown(discoverAt(machine)), R"(40 Computer System
  1000 Storage Adapter 36="Corvane" 108="FC32"
    3 Storage Adapter Firmware 36="Corvane" 108="FC32" 307="9.12.01"
    3 Storage Adapter Option ROM 36="Corvane" 108="FC32" 307="3.70"
)");
}

TEST(StorageSource, TheOrderInWhichHostsAreFoundChangesNoNumber) {
  Machine first(sataDrive);
  std::string later(sataDrive);
  for (std::size_t at = 0; (at = later.find("ata3", at)) != std::string::npos; ++at) {
    later.replace(at, 4, "ata9");
  }
  for (const auto& [before, after] :
       {std::pair{"host2", "host8"}, {"target2:", "target8:"}, {"2:0:0:0", "8:0:0:0"}}) {
    const std::string_view from = before;
    for (std::size_t at = 0; (at = later.find(from, at)) != std::string::npos; ++at) {
      later.replace(at, from.size(), after);
    }
  }
  Machine second(later);
  const NodeTree one = discoverAt(first);
  const NodeTree two = discoverAt(second);
  ASSERT_NE(described(one, "Drive"), NodeTree::none);
  ASSERT_NE(described(two, "Drive"), NodeTree::none);
  EXPECT_EQ(one.number(described(one, "Drive")), two.number(described(two, "Drive")));
}

}  // namespace
}  // namespace agent::discovery::test
