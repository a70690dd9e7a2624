// The walk and its getters against the recording stand-in: which calls it makes, in which order.
#include <Linux/SoftwareIdentity.h>
#include <Oru/Exceptions.h>
#include <gmock/gmock.h>

#include <new>

#include "../ProviderAccess.h"

namespace {

using Oru::SoftwareInventoryProfileProvider::SoftwareIdentity;
using testing::ElementsAre;

class SoftwareIdentityWalk : public testing::Test {
 protected:
  SoftwareIdentityWalk() {
    world.~World();
    new (&world) standin::World;
    world.nodes = {
        {40, "c0", "", "c0", "Computer System", {}, {}},
        {3, "f1", "c0", "c0", "first", {}, {}},
        {3, "f2", "c0", "c0", "second", {}, {}},
        {44, "d1", "c0", "c0", "driver", {}, {}},
    };
  }

  std::vector<std::string> callsOf(const std::function<void()>& action) {
    world.calls.clear();
    action();
    return world.calls;
  }

  standin::World& world = standin::world();
};

TEST_F(SoftwareIdentityWalk, ConstructionStopsAtTheFirstTypeThatHasNodes) {
  EXPECT_THAT(callsOf([] { const SoftwareIdentity identity; }),
              ElementsAre("Instrumentation()", "selectNode(3)", "operator bool"));
  world.nodes = {{44, "d1", "c0", "c0", "driver", {}, {}}};
  EXPECT_THAT(
      callsOf([] { const SoftwareIdentity identity; }),
      ElementsAre("Instrumentation()", "selectNode(3)", "selectNode(2)", "selectNode(44)", "operator bool"));
  world.missingTypeThrows = false;
  EXPECT_THAT(callsOf([] { const SoftwareIdentity identity; }),
              ElementsAre("Instrumentation()", "selectNode(3)", "operator bool", "selectNode(2)",
                          "operator bool", "selectNode(44)", "operator bool"));
}

TEST_F(SoftwareIdentityWalk, NoNodeAtAllThrows) {
  world.nodes.clear();
  try {
    const SoftwareIdentity identity;
    FAIL() << "nothing was thrown";
  } catch (const Oru::InstrumentationException& exception) {
    EXPECT_STREQ(exception.what(), "Could Not Find Any of the Software Identity Nodes");
  }
}

TEST_F(SoftwareIdentityWalk, ForwardMovesOnToTheNextTypeThatHasNodes) {
  SoftwareIdentity identity;
  EXPECT_THAT(callsOf([&] { identity.forwardInstrumentation(); }),
              ElementsAre("operator++", "operator bool"));
  EXPECT_THAT(callsOf([&] { identity.forwardInstrumentation(); }),
              ElementsAre("operator++", "operator bool", "selectNode(2)", "selectNode(44)", "operator bool"));
}

TEST_F(SoftwareIdentityWalk, AfterTheLastNodeOfTheLastTypeItIsFalse) {
  SoftwareIdentity identity;
  for (int node = 0; node < 3; ++node) {
    EXPECT_TRUE(static_cast<bool>(identity));
    ++identity;
  }
  EXPECT_FALSE(static_cast<bool>(identity));
  ++identity;
  EXPECT_FALSE(static_cast<bool>(identity)) << "an exhausted walk stays exhausted";
}

TEST_F(SoftwareIdentityWalk, IsTrueBetweenTypes) {
  SoftwareIdentity identity;
  // The framework's filter of the next type leaves the cursor on no node instead of throwing.
  identity.setFilter(SoftwareIdentity::InstanceIdFilter, "192@f2");
  world.calls.clear();
  world.failAt = 4;  // operator++, operator bool, selectNode(2) which throws, selectNode(44)
  world.fault = standin::Fault::Result;
  identity.forwardInstrumentation();
  EXPECT_EQ(world.faultCall, "selectNode(44)");
  EXPECT_FALSE(static_cast<bool>(identity)) << "the last type was tried";

  SoftwareIdentity other;
  other.setFilter(SoftwareIdentity::InstanceIdFilter, "192@d1");
  EXPECT_TRUE(other.areNodeAvailable());
}

TEST_F(SoftwareIdentityWalk, AnUnfilteredWalkEvaluatesNothing) {
  SoftwareIdentity identity;
  EXPECT_THAT(callsOf([&] { ++identity; }), ElementsAre("operator++", "operator bool"));
  EXPECT_THAT(callsOf([&] { EXPECT_TRUE(identity.evaluate()); }), ElementsAre());
}

TEST_F(SoftwareIdentityWalk, AnInstanceIdFilterComparesNodeByNodeAndReachesTheFrameworkWithTheNextType) {
  SoftwareIdentity identity;
  EXPECT_THAT(callsOf([&] { identity.setFilter(SoftwareIdentity::InstanceIdFilter, "192@d1"); }),
              ElementsAre("convertStringToPath(\"d1\")",                                               //
                          "operator bool", "getPathToNode", "convertPathToString(\"/f1\")",            //
                          "operator++", "operator bool",                                               //
                          "operator bool", "getPathToNode", "convertPathToString(\"/f2\")",            //
                          "operator++", "operator bool",                                               //
                          "selectNode(2)", "selectNode(44)", "operator bool", "setFilter(0,\"/d1\")",  //
                          "operator bool", "getPathToNode", "convertPathToString(\"/d1\")",            //
                          "operator bool"));
}

TEST_F(SoftwareIdentityWalk, RecordsOfOtherTypesAreKeptAndIgnored) {
  SoftwareIdentity identity;
  identity.setFilter(static_cast<SoftwareIdentity::FilterType>(1), "192@other");
  EXPECT_TRUE(static_cast<bool>(identity));
  EXPECT_THAT(callsOf([&] { EXPECT_TRUE(identity.evaluate()); }), ElementsAre());
}

TEST_F(SoftwareIdentityWalk, AParentFilterIsTheFrameworksAndHasNoPositioningLoop) {
  SoftwareIdentity identity;
  EXPECT_THAT(callsOf([&] { identity.setFilter(SoftwareIdentity::InstanceIdFilter, "192"); }),
              ElementsAre("convertStringToPath(\"c0\")", "getPathToComputer", "setFilter(2,\"/c0\")"));
  EXPECT_THAT(callsOf([&] {
                ++identity;
                ++identity;
              }),
              ElementsAre("operator++", "operator bool", "operator bool",  //
                          "operator++", "operator bool", "selectNode(2)", "selectNode(44)", "operator bool",
                          "setFilter(2,\"/c0\")", "operator bool"));
}

TEST_F(SoftwareIdentityWalk, ASecondFilterAddsARecordAndReplacesThePath) {
  SoftwareIdentity identity;
  identity.setFilter(SoftwareIdentity::InstanceIdFilter, "192@f2");
  identity.setFilter(SoftwareIdentity::InstanceIdFilter, "192@d1");
  EXPECT_FALSE(static_cast<bool>(identity)) << "no node has both paths";
  EXPECT_THAT(world.calls, testing::Contains("setFilter(0,\"/d1\")"));
}

TEST_F(SoftwareIdentityWalk, GettersOfAnExhaustedWalkReadNoTypeBeyondTheList) {
  SoftwareIdentity identity;
  identity.setFilter(SoftwareIdentity::InstanceIdFilter, "192@other");
  ASSERT_FALSE(static_cast<bool>(identity));
  std::vector<unsigned short> classifications;
  std::vector<std::string> descriptions;
  std::string version = "before";
  EXPECT_TRUE(identity.getClassifications(classifications));
  EXPECT_TRUE(identity.getClassificationDescriptions(descriptions));
  EXPECT_FALSE(identity.getVersionString(version));
  EXPECT_THAT(classifications, ElementsAre(0));
  EXPECT_THAT(descriptions, ElementsAre("Unknown"));
}

TEST_F(SoftwareIdentityWalk, ArraysAreAppendedTo) {
  SoftwareIdentity identity;
  std::vector<unsigned short> classifications{9};
  std::vector<std::string> descriptions{"before"};
  identity.getClassifications(classifications);
  identity.getClassificationDescriptions(descriptions);
  EXPECT_THAT(classifications, ElementsAre(9, 10));
  EXPECT_THAT(descriptions, ElementsAre("before", "Firmware"));
}

TEST_F(SoftwareIdentityWalk, VersionNumbersAreWrittenEvenWhereThereAreNone) {
  SoftwareIdentity identity;
  unsigned short major = 77;
  EXPECT_FALSE(identity.getMajorVersion(major));
  EXPECT_EQ(major, 0);
  world.nodes[1].numbers[107] = 0x10001;
  unsigned short minor = 77;
  EXPECT_TRUE(identity.getMinorVersion(minor));
  EXPECT_EQ(minor, 1);
}

TEST_F(SoftwareIdentityWalk, GettersThatNeverPublishLeaveTheirArgumentAlone) {
  SoftwareIdentity identity;
  std::string text = "before";
  unsigned short number = 77;
  bool flag = true;
  std::vector<unsigned short> numbers{1};
  std::vector<std::string> texts{"before"};
  const auto calls = callsOf([&] {
    EXPECT_FALSE(identity.getCaption(text));
    EXPECT_FALSE(identity.getElementName(text));
    EXPECT_FALSE(identity.getHealthState(number));
    EXPECT_FALSE(identity.isEntity(flag));
    EXPECT_FALSE(identity.getOperationalStatus(numbers));
    EXPECT_FALSE(identity.getIdentityInfoType(texts));
  });
  EXPECT_THAT(calls, ElementsAre());
  EXPECT_EQ(text, "before");
  EXPECT_EQ(number, 77);
  EXPECT_TRUE(flag);
  EXPECT_THAT(numbers, ElementsAre(1));
  EXPECT_THAT(texts, ElementsAre("before"));
}

TEST_F(SoftwareIdentityWalk, TheElementSoftwareStatusIsWrittenWidened) {
  SoftwareIdentity identity;
  EXPECT_TRUE(identity.modifyElementSoftwareStatus({1, 65535}));
  EXPECT_THAT(world.written, ElementsAre(1U, 65535U));
  EXPECT_THAT(world.calls, testing::Contains("setProperty(281)"));
  world.writeSucceeds = false;
  EXPECT_FALSE(identity.modifyElementSoftwareStatus({}));
}

}  // namespace
