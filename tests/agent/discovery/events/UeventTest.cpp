#include <agent/discovery/events/Uevent.h>

#include <gtest/gtest.h>

#include <cstddef>
#include <initializer_list>
#include <string>
#include <string_view>

namespace agent::discovery {
namespace {

using namespace std::string_view_literals;

/// Each text with a NUL behind it.
std::string message(std::initializer_list<std::string_view> fields) {
  std::string bytes;
  for (const std::string_view field : fields) {
    bytes.append(field).push_back('\0');
  }
  return bytes;
}

TEST(UeventParser, ReadsActionPathAndSubsystem) {
  const std::string bytes = message({"move@/devices/pci0000:00/0000:00:03.0/net/wan0", "ACTION=move",
                                     "DEVPATH=/devices/pci0000:00/0000:00:03.0/net/wan0", "SUBSYSTEM=net",
                                     "IFINDEX=2", "SEQNUM=871"});
  const auto event = parseUevent(bytes);
  ASSERT_TRUE(event.has_value());
  EXPECT_EQ(event->action, "move");
  EXPECT_EQ(event->devicePath, "/devices/pci0000:00/0000:00:03.0/net/wan0");
  EXPECT_EQ(event->subsystem, "net");
}

TEST(UeventParser, SubsystemMayBeAbsent) {
  const auto event = parseUevent("add@/bus/pci/drivers/x\0SEQNUM=1\0"sv);
  ASSERT_TRUE(event.has_value());
  EXPECT_EQ(event->action, "add");
  EXPECT_EQ(event->subsystem, "");
}

TEST(UeventParser, FieldThatIsCutShortIsNotThere) {
  const std::string bytes = message({"add@/devices/x", "SUBSYSTEM=net"});
  const auto event = parseUevent(std::string_view(bytes).substr(0, bytes.size() - 2));
  ASSERT_TRUE(event.has_value());
  EXPECT_EQ(event->subsystem, "") << "it could be nets, or ne";
}

TEST(UeventParser, RefusesWhatIsNoMessage) {
  EXPECT_FALSE(parseUevent({}));
  EXPECT_FALSE(parseUevent("add@/devices/x"sv)) << "without an end";
  EXPECT_FALSE(parseUevent("libudev\0\xfe\xed\xca\xfe@/x\0"sv));
  EXPECT_FALSE(parseUevent("@/devices/x\0"sv));
  EXPECT_FALSE(parseUevent("add@\0"sv));
  EXPECT_FALSE(parseUevent("add@devices/x\0"sv));
  EXPECT_FALSE(parseUevent("\0add@/devices/x\0"sv));
}

TEST(UeventParser, LooksAtNoMoreThanTheLongestMessage) {
  const std::string padding(8192, 'x');
  EXPECT_FALSE(parseUevent(message({"add@/" + padding})));
  const std::string bytes = message({"add@/devices/x", padding, "SUBSYSTEM=net"});
  const auto event = parseUevent(bytes);
  ASSERT_TRUE(event.has_value());
  EXPECT_EQ(event->subsystem, "");
}

TEST(UeventParser, AnyPieceOfAMessageIsReadOrRefused) {
  const std::string bytes =
      message({"bind@/devices/pci0000:00/0000:00:03.0", "SUBSYSTEM=pci", "DRIVER=e1000e"});
  for (std::size_t begin = 0; begin < bytes.size(); ++begin) {
    for (std::size_t length = 0; begin + length <= bytes.size(); ++length) {
      const std::string piece = bytes.substr(begin, length);  // of its own, so that a sanitizer sees its end
      if (const auto event = parseUevent(piece)) {
        EXPECT_LE(event->devicePath.size(), length);
      }
    }
  }
}

TEST(UeventConcern, IsWhatTheSourcesRead) {
  constexpr std::string_view pci = "/devices/pci0000:00/0000:00:03.0";
  EXPECT_TRUE(concernsInventory({"add", "/module/e1000e", "module"}));
  EXPECT_TRUE(concernsInventory({"remove", "/module/e1000e", "module"}));
  EXPECT_TRUE(concernsInventory({"add", "/devices/pci0000:00/0000:00:03.0/net/eth0", "net"}));
  EXPECT_TRUE(concernsInventory({"move", "/devices/pci0000:00/0000:00:03.0/net/wan0", "net"}));
  EXPECT_TRUE(concernsInventory({"add", pci, "nvme"}));
  EXPECT_TRUE(concernsInventory({"change", pci, "scsi"}));
  for (const std::string_view subsystem :
       {"drm", "fc_host", "infiniband", "ipmi", "mei", "pci", "platform", "scsi_host", "tpm"}) {
    EXPECT_TRUE(concernsInventory({"remove", pci, subsystem})) << subsystem;
  }
}

TEST(UeventConcern, IsEveryDriverThatTakesOrLeavesADevice) {
  EXPECT_TRUE(concernsInventory({"bind", "/devices/pci0000:00/usb1/1-1/1-1:1.0", "usb"}));
  EXPECT_TRUE(concernsInventory({"unbind", "/devices/LNXSYSTM:00/LNXPWRBN:00", "acpi"}));
}

TEST(UeventConcern, IsNothingElse) {
  EXPECT_FALSE(concernsInventory({"add", "/devices/virtual/net/veth12", "net"}));
  EXPECT_FALSE(concernsInventory({"add", "/devices/pci0000:00/0000:00:03.0/net/eth0/queues/rx-0", "queues"}));
  EXPECT_FALSE(concernsInventory({"change", "/devices/virtual/block/loop0", "block"}));
  EXPECT_FALSE(concernsInventory({"change", "/devices/LNXSYSTM:00/power", "power_supply"}));
  EXPECT_FALSE(concernsInventory({"add", "/kernel/slab/x", ""}));
  EXPECT_FALSE(concernsInventory({"offline", "/devices/system/cpu/cpu1", "cpu"}));
}

}  // namespace
}  // namespace agent::discovery
