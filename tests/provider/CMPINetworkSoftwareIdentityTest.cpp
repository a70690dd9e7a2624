// The association of a network device's firmware and its port, against the recording stand-in.
#include <CMPINetworkSoftwareIdentity.h>
#include <Oru/Exceptions.h>
#include <gmock/gmock.h>

#include "AssociationWorld.h"

namespace {

using namespace associations;  // NOLINT(google-build-using-namespace): the tests' own vocabulary
using Oru::FrameworkException;
using Oru::InstrumentationException;
using Oru::ProviderException;
using Adapter = Oru::SoftwareInventoryProfileProvider::CMPINetworkSoftwareIdentity;
using testing::Contains;
using testing::ElementsAre;
using testing::IsEmpty;
using testing::Not;
using testing::StartsWith;

constexpr const char* className = "KELVO_NetworkSoftwareIdentity";

std::string pair(const std::string& instanceId, const std::string& deviceId) {
  return std::string(className) + ".Antecedent={" + softwareText(instanceId) + "},Dependent={" +
         portText(deviceId) + "}";
}

class NetworkAssociation : public MachineTest {
 protected:
  std::vector<std::string> namesFrom(const CMPIObjectPath* given) {
    Adapter adapter(&broker, nullptr, given);
    return walk(adapter, [](Adapter& at) { return at.getAssociatorNames(); });
  }
  std::vector<std::string> pathsFrom(const CMPIObjectPath* given) {
    Adapter adapter(&broker, nullptr, given);
    return walk(adapter, [](Adapter& at) { return at.getObjectPath(); });
  }
  std::string constructionFails(const CMPIObjectPath* given) {
    return thrownBy<InstrumentationException>([&] { const Adapter adapter(&broker, nullptr, given); });
  }
  std::size_t asksOfPorts() const { return entriesOf(world, "operator bool", "CMPINetworkPort.cpp"); }
  std::size_t asksOfSoftware() const { return entriesOf(world, "operator bool", "CMPISoftwareIdentity.cpp"); }
};

// ---- From firmware.

TEST_F(NetworkAssociation, FromFirmwareComesItsDevicesFirstPortAlone) {
  EXPECT_THAT(namesFrom(software(nicFirmware)), ElementsAre(portText("eth0")));
  EXPECT_THAT(namesFrom(software(nicBootRom)), ElementsAre(portText("eth0")));
  EXPECT_THAT(namesFrom(software(otherNicFirmware)), ElementsAre(portText("eth2")));
}

TEST_F(NetworkAssociation, FromFirmwareBelowNoNetworkDeviceConstructionFails) {
  for (const std::string& id : {bios, bmc, driver}) {
    EXPECT_EQ(constructionFails(software(id)), "The specified firmware does not belong to a network device");
  }
}

TEST_F(NetworkAssociation, FromASoftwareClassPathEveryPortIsEnumeratedAndTheLastIsSkipped) {
  EXPECT_THAT(namesFrom(path("KELVO_SoftwareIdentity")), ElementsAre(portText("eth0"), portText("eth1")));
  EXPECT_THAT(world.calls, Contains("enumerateInstances(KELVO_NetworkPort)"));
  EXPECT_THAT(world.calls, Not(Contains(StartsWith("selectNode(\"")))) << "nothing is resolved";
}

TEST_F(NetworkAssociation, FromSoftwareWithoutInstanceIdConstructionFails) {
  EXPECT_EQ(thrownBy<FrameworkException>([&] {
              namesFrom(path("KELVO_SoftwareIdentity", {{"Name", "x"}}));
            }),
            "Could not find 'InstanceId' key in Moniker");
}

TEST_F(NetworkAssociation, FromFirmwareAPortThatNobodyServesFailsConstruction) {
  served("KELVO_NetworkPort").instances.clear();
  EXPECT_EQ(thrownBy<ProviderException>([&] { namesFrom(software(nicFirmware)); }),
            "Could not obtain an instance of Network Port");
}

TEST_F(NetworkAssociation, FromFirmwareADeviceWithoutPortsFailsConstruction) {
  node("5c").parent = "1a";
  world.emptyFilterThrows = false;
  EXPECT_EQ(constructionFails(software(otherNicFirmware)), "Could not extract DeviceID Property.");
}

// ---- From a port.

TEST_F(NetworkAssociation, FromAPortComesAllFirmwareOfItsDevice) {
  EXPECT_THAT(namesFrom(port("eth0")), ElementsAre(softwareText(nicFirmware), softwareText(nicBootRom)));
  EXPECT_THAT(namesFrom(port("eth1")), ElementsAre(softwareText(nicFirmware), softwareText(nicBootRom)));
  EXPECT_THAT(namesFrom(port("eth2")), ElementsAre(softwareText(otherNicFirmware)));
}

TEST_F(NetworkAssociation, FromAPortThatIsNotThereConstructionFails) {
  EXPECT_EQ(constructionFails(port("eth9")), "Specified Network Port not found.");
}

TEST_F(NetworkAssociation, FromAPortWithoutDeviceIdConstructionFails) {
  EXPECT_EQ(thrownBy<FrameworkException>([&] {
              namesFrom(path("KELVO_NetworkPort", {{"Name", "eth0"}}));
            }),
            "Could not find 'DeviceId' Key in Moniker");
}

TEST_F(NetworkAssociation, FromAPortClassPathComesTheFirstDevicesFirmware) {
  EXPECT_THAT(namesFrom(path("KELVO_NetworkPort")),
              ElementsAre(softwareText(nicFirmware), softwareText(nicBootRom)));
  EXPECT_TRUE(world.upcalls.empty()) << "the given end is never asked about";
}

TEST_F(NetworkAssociation, AssociatorsAreTheInstancesOfTheFarEnd) {
  Adapter fromSoftware(&broker, nullptr, software(otherNicFirmware));
  EXPECT_EQ(fromSoftware.getAssociator(nullptr), &served("KELVO_NetworkPort").instances[2]->cmpi);
  Adapter fromPort(&broker, nullptr, port("eth2"));
  EXPECT_EQ(propertyOf(fromPort.getAssociator(nullptr), "InstanceID"), otherNicFirmware);
}

// ---- The association itself.

TEST_F(NetworkAssociation, WithoutKeysOnlyTheFirstDeviceIsReachedEachFirmwareWithItsFirstPort) {
  EXPECT_THAT(pathsFrom(path(className)), ElementsAre(pair(nicFirmware, "eth0"), pair(nicBootRom, "eth0")));
  std::swap(node("1a"), node("1b"));
  EXPECT_THAT(pathsFrom(path(className)), ElementsAre(pair(otherNicFirmware, "eth2")));
}

TEST_F(NetworkAssociation, ThePortIsLocatedFromTheDeviceAndNotFromTheFirstFirmware) {
  // The first firmware of the walk hangs below something else between it and its device.
  node("e0").parent = "1a";
  node("f3").parent = "e0";
  EXPECT_EQ(textOf(Adapter(&broker, nullptr, path(className)).getObjectPath()), pair("224@f2", "eth0"));
}

TEST_F(NetworkAssociation, AKeyedAssociationPathNeedsADeviceId) {
  EXPECT_EQ(
      thrownBy<FrameworkException>([&] {
        pathsFrom(path(className, {}, {{"Antecedent", software(nicFirmware)}, {"Dependent", port("eth0")}}));
      }),
      "Could not find 'DeviceId' Key in Moniker");
  EXPECT_THAT(pathsFrom(path(className, {{"DeviceID", "eth2"}})), ElementsAre(pair(otherNicFirmware, "eth2")))
      << "with one it is a port's path";
}

TEST_F(NetworkAssociation, TheInstanceCarriesBothReferences) {
  Adapter adapter(&broker, nullptr, path(className));
  CMPIInstance* const instance = adapter.getCMPIInstance(nullptr);
  EXPECT_EQ(propertyOf(instance, "Antecedent"), softwareText(nicFirmware));
  EXPECT_EQ(propertyOf(instance, "Dependent"), portText("eth0"));
}

TEST_F(NetworkAssociation, ManyPortsInOneAnswerArePairedWithEachFirmwareButTheLast) {
  served("KELVO_NetworkPort").narrows = false;
  EXPECT_THAT(pathsFrom(path(className)), ElementsAre(pair(nicFirmware, "eth0"), pair(nicFirmware, "eth1"),
                                                      pair(nicBootRom, "eth0"), pair(nicBootRom, "eth1")));
}

TEST_F(NetworkAssociation, APortThatCannotBeLocatedEndsTheWalkInItsStep) {
  node("e0").parent = "1a";
  node("f4").parent = "e0";
  std::swap(node("f2"), node("f3"));
  // Below the device come f3 and then f2, whose parent is something else than the device.
  Adapter adapter(&broker, nullptr, path(className));
  EXPECT_TRUE(static_cast<bool>(adapter));
  EXPECT_EQ(thrownBy<InstrumentationException>([&] { ++adapter; }),
            "The specified firmware does not belong to a network device");
}

TEST_F(NetworkAssociation, FromTheAssociationThereIsNoAssociator) {
  Adapter adapter(&broker, nullptr, path(className));
  EXPECT_EQ(adapter.getAssociatorNames(), nullptr);
  EXPECT_EQ(adapter.getAssociator(nullptr), nullptr);
}

// ---- How often the ends are asked.

TEST_F(NetworkAssociation, TheEnumerationIsAskedExactlyAsOftenAsThePortEndIs) {
  Adapter adapter(&broker, nullptr, path(className));
  EXPECT_THAT(callsOf([&] { EXPECT_TRUE(static_cast<bool>(adapter)); }), IsEmpty()) << "the first is pending";
  // The step: no further port, so the next firmware, whose port is loaded.
  world.calls.clear();
  ++adapter;
  EXPECT_EQ(world.calls[0], "getNext");
  EXPECT_EQ(world.calls[1], "hasNext");
  EXPECT_EQ(world.calls[2], "operator++") << "of the software's cursor";
  const auto upcall = std::find_if(world.calls.begin(), world.calls.end(), [](const std::string& call) {
    return call.rfind("enumerateInstances", 0) == 0;
  });
  EXPECT_THAT(std::vector<std::string>(upcall, world.calls.end()),
              ElementsAre("enumerateInstances(" + portText("eth0") + ")", "hasNext", "getNext"));
  EXPECT_THAT(callsOf([&] { EXPECT_TRUE(static_cast<bool>(adapter)); }), IsEmpty());
  // The last step: neither a further port nor further firmware, and nothing is located again.
  world.calls.clear();
  ++adapter;
  EXPECT_EQ(countOf(world.calls, "hasNext"), 1U);
  EXPECT_EQ(countOf(world.calls, "enumerateInstances"), 0U);
  const std::vector<std::string> calls = callsOf([&] { EXPECT_FALSE(static_cast<bool>(adapter)); });
  EXPECT_EQ(countOf(calls, "hasNext"), 1U) << "asked again, and then the software";
}

TEST_F(NetworkAssociation, TheSoftwareIsAskedOnlyWhereThePortSaidNo) {
  Adapter adapter(&broker, nullptr, path(className));
  world.log.clear();
  EXPECT_TRUE(static_cast<bool>(adapter));
  EXPECT_EQ(asksOfPorts(), 1U);
  EXPECT_EQ(asksOfSoftware(), 0U);
  world.log.clear();
  ++adapter;
  EXPECT_EQ(asksOfPorts(), 1U);
  EXPECT_EQ(asksOfSoftware(), 1U);
  EXPECT_TRUE(static_cast<bool>(adapter));
  ++adapter;
  world.log.clear();
  EXPECT_FALSE(static_cast<bool>(adapter));
  EXPECT_EQ(asksOfPorts(), 1U);
  EXPECT_EQ(asksOfSoftware(), 1U);
}

TEST_F(NetworkAssociation, AHasNextOfTwoIsNoFurtherPort) {
  served("KELVO_NetworkPort").narrows = false;
  served("KELVO_NetworkPort").hasNextAnswers = {2, 2, 2};
  EXPECT_THAT(pathsFrom(path(className)), ElementsAre(pair(nicFirmware, "eth0"), pair(nicBootRom, "eth0")))
      << "enough to load the first, not to go on";
}

TEST_F(NetworkAssociation, EachDirectionAsksItsOwnEndAlone) {
  Adapter fromPort(&broker, nullptr, port("eth0"));
  Adapter fromSoftware(&broker, nullptr, software(nicFirmware));
  world.log.clear();
  EXPECT_TRUE(static_cast<bool>(fromPort));
  EXPECT_EQ(asksOfPorts(), 0U);
  EXPECT_EQ(asksOfSoftware(), 1U);
  world.log.clear();
  EXPECT_TRUE(static_cast<bool>(fromSoftware));
  EXPECT_EQ(asksOfPorts(), 1U);
  EXPECT_EQ(asksOfSoftware(), 0U);
  world.log.clear();
  ++fromPort;
  ++fromSoftware;
  EXPECT_EQ(asksOfPorts() + asksOfSoftware(), 0U) << "a step asks nobody";
}

// ---- Nulls, and other classes.

TEST_F(NetworkAssociation, APathOfAnyOtherClassLeavesBothEndsUnset) {
  for (CMPIObjectPath* given : {computer("alpha"), path("KELVO_BMCSoftwareIdentity"), path("Other")}) {
    Adapter adapter(&broker, nullptr, given);
    EXPECT_THAT(callsOf([&] {
                  EXPECT_FALSE(static_cast<bool>(adapter));
                  ++adapter;
                  EXPECT_FALSE(static_cast<bool>(adapter));
                  EXPECT_EQ(adapter.getAssociatorNames(), nullptr);
                  EXPECT_EQ(adapter.getAssociator(nullptr), nullptr);
                }),
                IsEmpty());
    EXPECT_EQ(textOf(adapter.getObjectPath()),
              std::string(className) + ".Antecedent={" + softwareText(bios) + "},Dependent={(null)}")
        << "what unset ends report";
  }
}

TEST_F(NetworkAssociation, AnInstanceCarriesNoReferenceThatIsNull) {
  Adapter adapter(&broker, nullptr, port("eth0"));
  CMPIInstance* const instance = adapter.getCMPIInstance(nullptr);
  EXPECT_EQ(propertyOf(instance, "Antecedent"), softwareText(nicFirmware));
  EXPECT_EQ(propertyOf(instance, "Dependent"), "(unset)");
}

TEST_F(NetworkAssociation, APathThatCannotBeMadeIsNullAndStillAskedAnInstanceOf) {
  Adapter adapter(&broker, nullptr, path(className));
  world.forget();
  world.failAt = 1;
  EXPECT_THAT(callsOf([&] { EXPECT_EQ(adapter.getObjectPath(), nullptr); }),
              ElementsAre("createObjectPath(KELVO_NetworkSoftwareIdentity)"));
  world.calls.clear();
  EXPECT_EQ(adapter.getCMPIInstance(nullptr), nullptr);
  EXPECT_THAT(world.calls, ElementsAre("createObjectPath(KELVO_NetworkSoftwareIdentity)", "createInstance"));
}

TEST_F(NetworkAssociation, ReferencesAreSetSoftwareFirst) {
  Adapter adapter(&broker, nullptr, path(className));
  std::vector<std::string> calls = callsOf([&] { adapter.getObjectPath(); });
  std::erase_if(calls, [](const std::string& call) {
    return call.rfind("setKeyProperty(", 0) != 0 && call != "getObjectPath";
  });
  EXPECT_THAT(calls, ElementsAre("setKeyProperty(InstanceID)",
                                 "setKeyProperty(Antecedent," + softwareText(nicFirmware) + ")",
                                 "getObjectPath", "setKeyProperty(Dependent," + portText("eth0") + ")"));
}

TEST_F(NetworkAssociation, APathWithoutKeysIsResolvedToFirmwareAndNotToAPort) {
  Adapter adapter(&broker, nullptr, path("Other"));
  EXPECT_EQ(textOf(adapter.locateIdentity(path("Other"))), softwareText("26"));
  EXPECT_EQ(textOf(adapter.locateNetwork(path("Other"))), "KELVO_NetworkPort");
}

TEST_F(NetworkAssociation, LocatingMakesThePathFirstAndCountsTheKeysOnce) {
  Adapter adapter(&broker, nullptr, path("Other"));
  const auto helperCalls = [&](auto locate, CMPIObjectPath* given) {
    std::vector<std::string> calls = callsOf([&] { (adapter.*locate)(given); });
    std::erase_if(calls, [](const std::string& call) {
      return call.rfind("createObjectPath", 0) != 0 && call != "getKeyCount" &&
             call.rfind("transform", 0) != 0;
    });
    return calls;
  };
  EXPECT_THAT(helperCalls(&Adapter::locateIdentity, port("eth0")),
              ElementsAre("createObjectPath(KELVO_SoftwareIdentity)", "getKeyCount",
                          "transformObjectPathToMoniker", "transformMonikerToObjectPath"));
  EXPECT_THAT(
      helperCalls(&Adapter::locateIdentity, path("Other")),
      ElementsAre("createObjectPath(KELVO_SoftwareIdentity)", "getKeyCount", "transformMonikerToObjectPath"));
  EXPECT_THAT(helperCalls(&Adapter::locateNetwork, software(nicFirmware)),
              ElementsAre("createObjectPath(KELVO_NetworkPort)", "getKeyCount",
                          "transformObjectPathToMoniker", "transformMonikerToObjectPath"));
  EXPECT_THAT(helperCalls(&Adapter::locateNetwork, path("Other")),
              ElementsAre("createObjectPath(KELVO_NetworkPort)", "getKeyCount"));
}

TEST_F(NetworkAssociation, ALocatedPathThatCannotBeMadeIsHandedOn) {
  Adapter adapter(&broker, nullptr, path("Other"));
  for (const auto& locate : {&Adapter::locateNetwork, &Adapter::locateIdentity}) {
    world.forget();
    world.failAt = 1;
    EXPECT_EQ((adapter.*locate)(path("Other")), nullptr);
    EXPECT_THAT(world.faultCall, StartsWith("createObjectPath("));
  }
}

}  // namespace
