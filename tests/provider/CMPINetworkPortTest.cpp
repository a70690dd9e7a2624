// The network port end against the recording stand-in: what it asks of the object manager, how often, and
// what it makes of the answers.
#include <CMPINetworkPort.h>
#include <Oru/Exceptions.h>
#include <gmock/gmock.h>

#include <sstream>

#include "AssociationWorld.h"

namespace {

using namespace associations;  // NOLINT(google-build-using-namespace): the tests' own vocabulary
using Oru::ProviderException;
using Oru::SoftwareInventoryProfileProvider::CMPISINetworkPort;
using testing::ElementsAre;
using testing::IsEmpty;
using testing::StartsWith;

constexpr const char* noPort = "Could not obtain an instance of Network Port";

class NetworkPortEnd : public MachineTest {
 protected:
  NetworkPortEnd() { servePorts({"A", "B", "C"}); }

  void servePorts(const std::vector<std::string>& ids) {
    serveInstances(world, "KELVO_NetworkPort", "DeviceID", ids);
  }

  standin::Served& answer() { return served("KELVO_NetworkPort"); }
  void open() { end.setObjectPath(path("KELVO_NetworkPort")); }
  bool isTrue() { return static_cast<bool>(end); }
  std::string openFails() {
    return thrownBy<ProviderException>([&] { open(); });
  }

  std::vector<std::string> walkEnd() {
    return walk(end, [](CMPISINetworkPort& at) { return at.getObjectPath(); });
  }

  CMPIContext context{};
  CMPISINetworkPort end{&broker, &context, "root/cimv2"};
};

TEST_F(NetworkPortEnd, AnEmptyEnumerationThrowsAndIsThenAskedForItsNext) {
  servePorts({});
  EXPECT_EQ(openFails(), noPort);
  EXPECT_EQ(end.getObjectPath(), nullptr);
  EXPECT_THAT(callsOf([&] { EXPECT_FALSE(isTrue()); }), ElementsAre("hasNext"));
}

TEST_F(NetworkPortEnd, TheFirstAnswerIsTrueWithoutAskingTheEnumeration) {
  servePorts({"A"});
  open();
  EXPECT_THAT(callsOf([&] { EXPECT_TRUE(isTrue()); }), IsEmpty());
  EXPECT_THAT(callsOf([&] { EXPECT_FALSE(isTrue()) << "no step between"; }), ElementsAre("hasNext"));
}

TEST_F(NetworkPortEnd, AnEnumerationOfOneYieldsIt) {
  servePorts({"A"});
  open();
  EXPECT_THAT(walkEnd(), ElementsAre(portText("A")));
}

TEST_F(NetworkPortEnd, AnEnumerationOfTwoYieldsOnlyTheFirst) {
  servePorts({"A", "B"});
  open();
  EXPECT_THAT(walkEnd(), ElementsAre(portText("A")));
}

TEST_F(NetworkPortEnd, AnEnumerationOfThreeYieldsTheFirstTwo) {
  open();
  EXPECT_THAT(walkEnd(), ElementsAre(portText("A"), portText("B")));
}

TEST_F(NetworkPortEnd, AStepPastTheEndLeavesNoInstance) {
  servePorts({"A"});
  open();
  ++end;
  EXPECT_EQ(end.getObjectPath(), nullptr);
  EXPECT_EQ(end.getCMPIInstance(nullptr), nullptr);
  ++end;
  EXPECT_EQ(end.getCMPIInstance(nullptr), nullptr);
}

TEST_F(NetworkPortEnd, BeforeAnyPathItIsFalseAndDoesNothing) {
  EXPECT_THAT(callsOf([&] {
                EXPECT_FALSE(isTrue());
                ++end;
                EXPECT_EQ(end.getObjectPath(), nullptr);
                EXPECT_EQ(end.getCMPIInstance(nullptr), nullptr);
              }),
              IsEmpty());
}

TEST_F(NetworkPortEnd, APropertyListHasNoEffectOnTheInstance) {
  answer().instances[0]->properties.emplace_back("Speed", "1000000000");
  open();
  const char* properties[] = {"DeviceID", nullptr};
  CMPIInstance* const instance = end.getCMPIInstance(properties);
  EXPECT_EQ(instance, &answer().instances[0]->cmpi) << "the instance as it was delivered";
  EXPECT_EQ(propertyOf(instance, "Speed"), "1000000000");
}

TEST_F(NetworkPortEnd, ARefusedEnumerationThrows) {
  answer().status = CMPI_RC_ERR_FAILED;
  EXPECT_EQ(openFails(), noPort);
  EXPECT_EQ(end.getCMPIInstance(nullptr), nullptr);
  EXPECT_THAT(callsOf([&] { EXPECT_TRUE(isTrue()); }), ElementsAre("hasNext"))
      << "what came with the bad status was stored";
}

TEST_F(NetworkPortEnd, ANullEnumerationThatIsOkThrows) {
  answer().enumerationIsNull = true;
  EXPECT_EQ(openFails(), noPort);
  EXPECT_THAT(callsOf([&] {
                EXPECT_FALSE(isTrue());
                ++end;
              }),
              IsEmpty());
}

TEST_F(NetworkPortEnd, AFirstElementThatCannotBeReadThrows) {
  answer().failingElement = 1;
  EXPECT_EQ(openFails(), noPort);
  EXPECT_EQ(end.getCMPIInstance(nullptr), nullptr);
}

TEST_F(NetworkPortEnd, AnElementThatCannotBeReadIsNoInstance) {
  answer().failingElement = 2;
  open();
  EXPECT_TRUE(isTrue());
  ++end;
  EXPECT_EQ(end.getCMPIInstance(nullptr), nullptr);
  EXPECT_TRUE(isTrue()) << "there is one more";
}

TEST_F(NetworkPortEnd, AFailureKeepsTheInstanceThatWasLoadedBefore) {
  open();
  answer().status = CMPI_RC_ERR_FAILED;
  EXPECT_EQ(openFails(), noPort);
  EXPECT_EQ(textOf(end.getObjectPath()), portText("A"));
  EXPECT_THAT(callsOf([&] { EXPECT_TRUE(isTrue()); }), IsEmpty()) << "it is still pending";
}

TEST_F(NetworkPortEnd, AnotherPathStartsOver) {
  open();
  EXPECT_TRUE(isTrue());
  ++end;
  end.setObjectPath(port("C"));
  EXPECT_EQ(textOf(end.getObjectPath()), portText("C"));
  EXPECT_THAT(walkEnd(), ElementsAre(portText("C")));
}

TEST_F(NetworkPortEnd, OnlyAHasNextOfExactlyOneIsTrue) {
  answer().hasNextAnswers = {2, 2, 255, 1};
  open();
  EXPECT_TRUE(isTrue()) << "any answer but 0 loads the first";
  EXPECT_FALSE(isTrue());
  EXPECT_FALSE(isTrue());
  EXPECT_TRUE(isTrue());
}

TEST_F(NetworkPortEnd, TakesTheseCallsInThisOrder) {
  EXPECT_THAT(callsOf([&] { open(); }),
              ElementsAre("enumerateInstances(KELVO_NetworkPort)", "hasNext", "getNext"));
  EXPECT_THAT(callsOf([&] { walkEnd(); }), ElementsAre("getObjectPath", "getNext", "hasNext",  //
                                                       "getObjectPath", "getNext", "hasNext"));
}

TEST_F(NetworkPortEnd, TheRequestGoesWithItsContextAndWithoutAPropertyList) {
  const CMPIObjectPath* const request = port("B");
  end.setObjectPath(request);
  ASSERT_EQ(world.upcalls.size(), 1U);
  EXPECT_EQ(world.upcalls[0].broker, &broker);
  EXPECT_EQ(world.upcalls[0].context, &context);
  EXPECT_EQ(world.upcalls[0].path, request->hdl);
  EXPECT_EQ(world.upcalls[0].properties, nullptr);
}

TEST_F(NetworkPortEnd, APathWithABadStatusIsNull) {
  open();
  world.forget();
  world.failAt = 1;
  EXPECT_EQ(end.getObjectPath(), nullptr);
  EXPECT_EQ(world.faultCall, "getObjectPath");
}

TEST_F(NetworkPortEnd, TracesItsLifeAsMethods) {
  world.log.clear();
  { const CMPISINetworkPort other(&broker, nullptr, "root/cimv2"); }
  EXPECT_THAT(logTexts(world, 4000),
              ElementsAre("METHOD: CMPISINetworkPort() was invoked in CMPINetworkPort.cpp [Line: N]",
                          "METHOD: ~CMPISINetworkPort() was invoked in CMPINetworkPort.cpp [Line: N]"));
  EXPECT_EQ(logTexts(world, 4000, true), logTexts(world, 4000));
  EXPECT_EQ(world.log.front().category, "Corvane.SoftwareInventoryProvider");
}

TEST_F(NetworkPortEnd, TracesThePathsTextAndItsPropertiesAtTheRoutineLevel) {
  world.log.clear();
  end.setObjectPath(port("B"));
  const char* properties[] = {"DeviceID", nullptr};
  end.getCMPIInstance(properties);
  const std::string place = "() in CMPINetworkPort.cpp [Line: N]";
  std::ostringstream list;
  list << place << ",Parameters List:  properties=" << static_cast<const void*>(properties);
  EXPECT_THAT(
      logTexts(world, 4000),
      ElementsAre("ENTERING: setObjectPath" + place + ",Parameters List:  objectPath=" + portText("B"),
                  StartsWith("EXITING: setObjectPath" + place), "ENTERING: getCMPIInstance" + list.str(),
                  "EXITING: getCMPIInstance" + list.str()));
  EXPECT_THAT(logTexts(world, 3000), IsEmpty());
}

TEST_F(NetworkPortEnd, TracesANullPathCalmly) {
  world.log.clear();
  EXPECT_THROW(end.setObjectPath(nullptr), ProviderException);
  EXPECT_THAT(logTexts(world, 4000).front(), testing::EndsWith(" objectPath=(null)"));
}

}  // namespace
