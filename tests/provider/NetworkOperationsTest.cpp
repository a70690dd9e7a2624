// Network firmware and ports through the function tables: every case of the resolver, the adapter and the
// port end that a request can meet.
#include <gmock/gmock.h>

#include "AssociationRequests.h"

namespace {

using namespace associations;  // NOLINT(google-build-using-namespace): the tests' own vocabulary
using testing::Contains;
using testing::ElementsAre;
using testing::IsEmpty;

class NetworkOperations : public AssociationRequests {
 protected:
  Answer fromSoftware(const std::string& instanceId) { return names(software(instanceId), networkClass); }
  Answer fromPort(const std::string& deviceId) { return names(port(deviceId), networkClass); }
  Answer fromEverySoftware() { return names(path("KELVO_SoftwareIdentity"), networkClass); }
  /// Of a request that fails as a whole: what it says.
  static std::string failure(const Answer& answer) {
    EXPECT_EQ(answer.status.rc, CMPI_RC_OK);
    EXPECT_EQ(answer.done, 1);
    EXPECT_THAT(answer.objects, IsEmpty());
    return answer.failures.size() == 1 ? answer.failures.front() : "(not one)";
  }
};

// ---- From a port.

TEST_F(NetworkOperations, FromAPortComesAllFirmwareOfItsDevice) {
  const Answer answer = fromPort("eth1");
  EXPECT_THAT(answer.objects, ElementsAre(softwareText(nicFirmware), softwareText(nicBootRom)));
  EXPECT_TRUE(answer.isComplete());
  EXPECT_EQ(associators(port("eth1"), networkClass).objects, answer.objects);
  EXPECT_EQ(property(1, "Description"), "Network Boot ROM");
}

TEST_F(NetworkOperations, AClassPathOfPortsGivesTheFirstDeviceAndOneOfSoftwareEveryPortButTheLast) {
  EXPECT_THAT(names(path("KELVO_NetworkPort"), networkClass).objects,
              ElementsAre(softwareText(nicFirmware), softwareText(nicBootRom)));
  EXPECT_THAT(fromEverySoftware().objects, ElementsAre(portText("eth0"), portText("eth1")));
}

TEST_F(NetworkOperations, TheDeviceIdIsFoundBehindAnotherKeyAndInNoOtherSpelling) {
  EXPECT_EQ(names(path("KELVO_NetworkPort", {{"Name", "x"}, {"DeviceID", "eth2"}}), networkClass).objects,
            std::vector<std::string>{softwareText(otherNicFirmware)});
  EXPECT_EQ(failure(names(path("KELVO_NetworkPort", {{"deviceid", "eth2"}}), networkClass)),
            "Could not find 'DeviceId' Key in Moniker");
}

TEST_F(NetworkOperations, OfTwoPortsWithTheSameIdTheFirstDecides) {
  node("5c").texts[108] = "eth1";
  EXPECT_THAT(fromPort("eth1").objects, ElementsAre(softwareText(nicFirmware), softwareText(nicBootRom)));
}

TEST_F(NetworkOperations, APortThatIsNotThereIsSaid) {
  EXPECT_EQ(failure(fromPort("eth9")), "Specified Network Port not found.");
}

TEST_F(NetworkOperations, WithoutANetworkDeviceTheClassPathSelectsWhatHasTheNumberZero) {
  std::erase_if(world.nodes, [](const standin::Node& candidate) { return candidate.type == 49; });
  world.missingTypeThrows = false;
  names(path("KELVO_NetworkPort"), networkClass);
  EXPECT_THAT(world.calls, Contains("setFilter(1,\"/0\")"));
}

// ---- From firmware.

TEST_F(NetworkOperations, FromFirmwareComesItsDevicesFirstPortAlone) {
  const Answer answer = fromSoftware(nicBootRom);
  EXPECT_THAT(answer.objects, ElementsAre(portText("eth0")));
  EXPECT_TRUE(answer.isComplete());
  EXPECT_EQ(associators(software(nicBootRom), networkClass).objects, answer.objects);
  EXPECT_THAT(fromSoftware("26@xyz").objects, ElementsAre(portText("eth0"))) << "the number alone counts";
  EXPECT_THAT(fromSoftware("26").objects, ElementsAre(portText("eth0")));
}

TEST_F(NetworkOperations, FirmwareBelowNoNetworkDeviceIsRefused) {
  for (const std::string& id : {bios, driver, std::string("x26@f3")}) {
    EXPECT_EQ(failure(fromSoftware(id)), "The specified firmware does not belong to a network device");
  }
  EXPECT_THAT(world.calls, Contains("convertStringToPath(\"0\")")) << "what begins with no digit";
}

TEST_F(NetworkOperations, ADeviceWithoutPortsIsSaid) {
  node("5c").parent = "1a";
  world.emptyFilterThrows = false;
  EXPECT_EQ(failure(fromSoftware(otherNicFirmware)), "Could not extract DeviceID Property.");
}

TEST_F(NetworkOperations, AnIdentityWithoutInstanceIdIsSaid) {
  EXPECT_EQ(failure(names(path("KELVO_SoftwareIdentity", {{"Name", "x"}}), networkClass)),
            "Could not find 'InstanceId' key in Moniker");
}

// ---- The port end.

TEST_F(NetworkOperations, TheLastOfTwoOrMorePortsIsSkipped) {
  serve("KELVO_NetworkPort", "DeviceID", {"A"});
  EXPECT_THAT(fromEverySoftware().objects, ElementsAre(portText("A")));
  serve("KELVO_NetworkPort", "DeviceID", {"A", "B"});
  EXPECT_THAT(fromEverySoftware().objects, ElementsAre(portText("A")));
  serve("KELVO_NetworkPort", "DeviceID", {"A", "B", "C"});
  EXPECT_THAT(fromEverySoftware().objects, ElementsAre(portText("A"), portText("B")));
}

TEST_F(NetworkOperations, NoPortAtAllIsSaid) {
  serve("KELVO_NetworkPort", "DeviceID", {});
  EXPECT_EQ(failure(fromSoftware(nicFirmware)), "Could not obtain an instance of Network Port");
}

TEST_F(NetworkOperations, RefusalsNullsAndUnreadablePortsAreOneFailure) {
  const char* const expected = "Could not obtain an instance of Network Port";
  served("KELVO_NetworkPort").status = CMPI_RC_ERR_ACCESS_DENIED;
  EXPECT_EQ(failure(fromSoftware(nicFirmware)), expected);
  serve("KELVO_NetworkPort", "DeviceID", {"eth0"});
  served("KELVO_NetworkPort").enumerationIsNull = true;
  EXPECT_EQ(failure(fromSoftware(nicFirmware)), expected);
  serve("KELVO_NetworkPort", "DeviceID", {"eth0"});
  served("KELVO_NetworkPort").failingElement = 1;
  EXPECT_EQ(failure(fromSoftware(nicFirmware)), expected);
}

TEST_F(NetworkOperations, OnlyAHasNextOfExactlyOneGoesOn) {
  served("KELVO_NetworkPort").hasNextAnswers = {2, 1, 255};
  EXPECT_THAT(fromEverySoftware().objects, ElementsAre(portText("eth0"), portText("eth1")));
  served("KELVO_NetworkPort").hasNextAnswers = {2, 2};
  EXPECT_THAT(fromEverySoftware().objects, ElementsAre(portText("eth0")));
}

TEST_F(NetworkOperations, AHasNextThatLiesEndsInANull) {
  serve("KELVO_NetworkPort", "DeviceID", {"eth0"});
  served("KELVO_NetworkPort").hasNextAnswers = {1, 1};
  EXPECT_THAT(fromEverySoftware().objects, ElementsAre(portText("eth0"), "(null)"));
}

TEST_F(NetworkOperations, ThePortsInstanceIsWholeWhateverThePropertyList) {
  served("KELVO_NetworkPort").instances[0]->properties.emplace_back("Speed", "1000");
  const char* properties[] = {"DeviceID", nullptr};
  associators(software(nicFirmware), networkClass, properties);
  EXPECT_EQ(property(0, "Speed"), "1000");
}

TEST_F(NetworkOperations, OneFirmwareTakesTheseQuestionsToTheObjectManager) {
  fromSoftware(nicFirmware);
  std::vector<std::string> questions = world.calls;
  std::erase_if(questions, [](const std::string& call) {
    return call != "hasNext" && call != "getNext" && call != "getObjectPath" &&
           call.rfind("enumerateInstances", 0) != 0 && call.rfind("return", 0) != 0;
  });
  EXPECT_THAT(questions,
              ElementsAre("enumerateInstances(" + portText("eth0") + ")", "hasNext", "getNext",
                          "getObjectPath", "returnObjectPath", "getNext", "hasNext", "returnDone"));
}

// ---- The association itself.

TEST_F(NetworkOperations, EnumerationReachesTheFirstDeviceAloneAndAsksForItsPortAnew) {
  const Answer answer = enumerateNames(path(networkClass));
  EXPECT_THAT(answer.objects, ElementsAre(networkText(nicFirmware, "eth0"), networkText(nicBootRom, "eth0")));
  EXPECT_EQ(countCalls("enumerateInstances(" + portText("eth0") + ")"), 2U) << "once for each firmware";
}

TEST_F(NetworkOperations, AnEnumerationThatFailsInTheMiddleHasNoDoneMarker) {
  node("e0").parent = "1a";
  std::swap(node("f2"), node("f3"));
  const Answer answer = enumerateNames(path(networkClass));
  EXPECT_THAT(answer.objects, ElementsAre(networkText(nicFirmware, "eth0")));
  EXPECT_EQ(answer.done, 0);
  EXPECT_THAT(answer.failures, ElementsAre("The specified firmware does not belong to a network device"));
}

TEST_F(NetworkOperations, OtherSourcesYieldNothing) {
  for (CMPIObjectPath* source : {computer("alpha"), path("Other")}) {
    const Answer answer = names(source, networkClass);
    EXPECT_THAT(answer.objects, IsEmpty());
    EXPECT_TRUE(answer.isComplete());
  }
  EXPECT_THAT(names(path(networkClass), networkClass).objects, ElementsAre("(null)", "(null)"))
      << "from the association itself there is no far end";
}

}  // namespace
