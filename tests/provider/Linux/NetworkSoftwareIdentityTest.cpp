// Which firmware a network port has, and which port firmware has, against the recording stand-in.
#include <Linux/NetworkSoftwareIdentity.h>
#include <Oru/Exceptions.h>
#include <gmock/gmock.h>

#include "../AssociationWorld.h"

namespace {

using namespace associations;  // NOLINT(google-build-using-namespace): the tests' own vocabulary
using Oru::FrameworkException;
using Oru::InstrumentationException;
using Oru::Moniker;
using Oru::SoftwareInventoryProfileProvider::NetworkSoftwareIdentity;
using testing::Contains;
using testing::ElementsAre;
using testing::Not;

class NetworkResolver : public MachineTest {
 protected:
  std::string firmwareOf(const Keys& keys) {
    Moniker given = moniker(keys);
    return textOf(resolver.getSoftwareIdentityMoniker(given));
  }
  std::string firmwareOf(const char* deviceId) { return firmwareOf(Keys{{"DeviceID", deviceId}}); }
  std::string portOf(const Keys& keys) {
    Moniker given = moniker(keys);
    return textOf(resolver.getNetworkPortMoniker(given));
  }
  std::string portOf(const std::string& instanceId) { return portOf(Keys{{"InstanceID", instanceId}}); }
  void removeType(int type) {
    std::erase_if(world.nodes, [type](const standin::Node& candidate) { return candidate.type == type; });
  }

  NetworkSoftwareIdentity resolver;
};

// ---- From a port to its device's firmware.

TEST_F(NetworkResolver, TheDeviceIdIsFoundBehindAnotherKey) {
  EXPECT_EQ(firmwareOf(Keys{{"Name", "eth2"}, {"DeviceID", "eth0"}}), "InstanceID=26");
}

TEST_F(NetworkResolver, AKeyInAnotherLetterCaseIsNoDeviceId) {
  for (const Keys& keys : {Keys{}, Keys{{"deviceid", "eth0"}}, Keys{{"DeviceId", "eth0"}}}) {
    EXPECT_EQ(thrownBy<FrameworkException>([&] { firmwareOf(keys); }),
              "Could not find 'DeviceId' Key in Moniker");
  }
}

TEST_F(NetworkResolver, OfTwoPortsWithTheSameIdTheFirstOfTheWalkDecides) {
  node("5c").texts[108] = "eth1";
  EXPECT_EQ(firmwareOf("eth1"), "InstanceID=26");
  std::swap(node("5b"), node("5c"));
  EXPECT_EQ(firmwareOf("eth1"), "InstanceID=27");
}

TEST_F(NetworkResolver, ADevicesPathTextIsReadAsHexadecimal) {
  EXPECT_EQ(firmwareOf("eth0"), "InstanceID=26") << "its device is 1a";
  EXPECT_EQ(firmwareOf("eth2"), "InstanceID=27") << "and 1b";
  node("5c").parent = "zz";
  EXPECT_EQ(firmwareOf("eth2"), "InstanceID=0");
  node("5c").parent = "1azz";
  EXPECT_EQ(firmwareOf("eth2"), "InstanceID=26") << "what follows the number is dropped";
}

TEST_F(NetworkResolver, APortIdOfNoPortIsRefused) {
  for (const char* id : {"eth3", "Eth0", "eth", "eth00", ""}) {
    EXPECT_EQ(thrownBy<InstrumentationException>([&] { firmwareOf(id); }),
              "Specified Network Port not found.")
        << id;
  }
}

TEST_F(NetworkResolver, APortWithoutAnIdIsPassedOver) {
  node("5a").texts.clear();
  EXPECT_EQ(firmwareOf("eth1"), "InstanceID=26");
  EXPECT_EQ(thrownBy<InstrumentationException>([&] { firmwareOf(""); }), "Specified Network Port not found.")
      << "absent is not empty";
}

TEST_F(NetworkResolver, WithoutPortsNoneIsFound) {
  removeType(12);
  world.missingTypeThrows = false;
  EXPECT_EQ(thrownBy<InstrumentationException>([&] { firmwareOf("eth0"); }),
            "Specified Network Port not found.");
}

TEST_F(NetworkResolver, TheCursorIsTestedBeforeEachPortsId) {
  EXPECT_THAT(callsOf([&] { firmwareOf("eth1"); }),
              ElementsAre("selectNode(12)", "operator bool", "getProperty(108,string)",  //
                          "operator++", "operator bool", "getProperty(108,string)",      //
                          "getPathToParentNode", "convertPathToString(\"/1a\")"));
}

// ---- The first device.

TEST_F(NetworkResolver, WithoutAPortTheFirstNetworkDeviceIsMeant) {
  EXPECT_EQ(textOf(resolver.getSoftwareIdentityMoniker()), "InstanceID=26");
  std::swap(node("1a"), node("1b"));
  EXPECT_EQ(textOf(resolver.getSoftwareIdentityMoniker()), "InstanceID=27");
}

TEST_F(NetworkResolver, WithoutANetworkDeviceTheNumberIsThatOfNoNode) {
  removeType(49);
  world.missingTypeThrows = false;
  EXPECT_EQ(textOf(resolver.getSoftwareIdentityMoniker()), "InstanceID=0") << "and nothing is thrown";
}

TEST_F(NetworkResolver, TheFirstDeviceIsTakenWithoutATestOfTheCursor) {
  EXPECT_THAT(callsOf([&] { resolver.getSoftwareIdentityMoniker(); }),
              ElementsAre("selectNode(49)", "getPathToNode", "convertPathToString(\"/1a\")"));
}

// ---- From firmware to its port.

TEST_F(NetworkResolver, ADeviceWithTwoPortsAlwaysNamesItsFirst) {
  EXPECT_EQ(portOf(nicFirmware), "DeviceID=eth0");
  EXPECT_EQ(portOf(nicBootRom), "DeviceID=eth0");
  EXPECT_EQ(portOf("26@5b"), "DeviceID=eth0") << "what follows the number is not used";
  std::swap(node("5a"), node("5b"));
  EXPECT_EQ(portOf(nicFirmware), "DeviceID=eth1");
  EXPECT_EQ(portOf(otherNicFirmware), "DeviceID=eth2");
}

TEST_F(NetworkResolver, TheNumberOfAnInstanceIdSelectsTheNodeOfThatText) {
  EXPECT_EQ(portOf("26@xyz"), "DeviceID=eth0");
  EXPECT_THAT(world.calls, Contains("selectNode(\"/1a\")"));
  EXPECT_EQ(portOf("26"), "DeviceID=eth0") << "a parent identifier alone";
}

TEST_F(NetworkResolver, AnInstanceIdThatBeginsWithNoDigitSelectsNodeZero) {
  EXPECT_THROW(portOf("x26@f3"), InstrumentationException);
  EXPECT_THAT(world.calls, Contains("convertStringToPath(\"0\")"));
  EXPECT_THAT(world.calls, Contains("selectNode(\"/0\")"));
}

TEST_F(NetworkResolver, FirmwareBelowNoNetworkDeviceIsRefused) {
  for (const std::string& id : {bios, bmc, driver, std::string("7@nothing")}) {
    EXPECT_EQ(thrownBy<InstrumentationException>([&] { portOf(id); }),
              "The specified firmware does not belong to a network device")
        << id;
  }
}

TEST_F(NetworkResolver, TheSensorTypeDecidesWhatIsANetworkDevice) {
  node("1a").sensorType = 50;
  EXPECT_THROW(portOf(nicFirmware), InstrumentationException);
  node("e0").sensorType = 49;
  node("5c").parent = "e0";
  EXPECT_EQ(portOf(bmc), "DeviceID=eth2");
}

TEST_F(NetworkResolver, ADeviceWithoutPortsShowsAsAFailedRead) {
  node("5c").parent = "1a";
  world.emptyFilterThrows = false;
  EXPECT_EQ(thrownBy<InstrumentationException>([&] { portOf(otherNicFirmware); }),
            "Could not extract DeviceID Property.");
  world.emptyFilterThrows = true;
  EXPECT_EQ(thrownBy<InstrumentationException>([&] { portOf(otherNicFirmware); }),
            "nothing passes the filter")
      << "what the framework throws passes unchanged";
}

TEST_F(NetworkResolver, AFirstPortWithoutAnIdIsRefused) {
  node("5a").texts.clear();
  EXPECT_EQ(thrownBy<InstrumentationException>([&] { portOf(nicFirmware); }),
            "Could not extract DeviceID Property.");
}

TEST_F(NetworkResolver, AnIdentityWithoutInstanceIdIsRefused) {
  for (const Keys& keys : {Keys{}, Keys{{"InstanceId", "26@f3"}}, Keys{{"DeviceID", "26@f3"}}}) {
    EXPECT_EQ(thrownBy<FrameworkException>([&] { portOf(keys); }),
              "Could not find 'InstanceId' key in Moniker");
  }
}

TEST_F(NetworkResolver, NothingTestsTheCursorOnTheWayToAPort) {
  EXPECT_THAT(callsOf([&] { portOf(nicFirmware); }),
              ElementsAre("convertStringToPath(\"1a\")", "selectNode(\"/1a\")", "getSensorType",
                          "selectNode(12)", "setFilter(1,\"/1a\")", "getProperty(108,string)"));
}

// ---- What it says of itself.

TEST_F(NetworkResolver, TracesItsLifeAsMethods) {
  world.log.clear();
  { const NetworkSoftwareIdentity other; }
  EXPECT_THAT(
      logTexts(world, 4000),
      ElementsAre(
          "METHOD: NetworkSoftwareIdentity() was invoked in Linux/NetworkSoftwareIdentity.cpp [Line: N]",
          "METHOD: ~NetworkSoftwareIdentity() was invoked in Linux/NetworkSoftwareIdentity.cpp [Line: N]"));
  EXPECT_EQ(world.log.front().category, "Corvane.SoftwareInventoryProvider");
}

TEST_F(NetworkResolver, TracesWhatItWasGivenAndTheKeyThatItFound) {
  const std::string place = "() in Linux/NetworkSoftwareIdentity.cpp [Line: N]";
  world.log.clear();
  firmwareOf("eth1");
  EXPECT_EQ(logTexts(world, 4000).front(), "ENTERING: getSoftwareIdentityMoniker" + place +
                                               ",Parameters List:  monikerNetwork=DeviceID=eth1");
  EXPECT_THAT(logTexts(world, 4000),
              Contains(testing::MatchesRegex(
                  "VARIABLE: '.*' has Value 'eth1' at line N in Linux/NetworkSoftwareIdentity.cpp")));
  EXPECT_EQ(logTexts(world, 4000), logTexts(world, 4000, true));
  world.log.clear();
  portOf(nicFirmware);
  EXPECT_EQ(logTexts(world, 4000).front(), "ENTERING: getNetworkPortMoniker" + place +
                                               ",Parameters List:  monikerIdentity=InstanceID=26@f3");
  EXPECT_THAT(logTexts(world, 4000),
              Contains(testing::MatchesRegex(
                  "VARIABLE: '.*' has Value '26@f3' at line N in Linux/NetworkSoftwareIdentity.cpp")));
  world.log.clear();
  resolver.getSoftwareIdentityMoniker();
  EXPECT_EQ(logTexts(world, 4000).front(), "ENTERING: getSoftwareIdentityMoniker" + place)
      << "without parameters there is no list";
}

TEST_F(NetworkResolver, TracesNoExitAfterAnException) {
  world.log.clear();
  EXPECT_THROW(portOf(bios), InstrumentationException);
  EXPECT_THAT(logTexts(world, 4000), Not(Contains(testing::StartsWith("EXITING"))));
}

}  // namespace
