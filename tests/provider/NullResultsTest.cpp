// Nulls among the answers: handed on to every object manager but the small-footprint broker, which they kill.
#include <gmock/gmock.h>

#include "AssociationRequests.h"

namespace {

using namespace associations;  // NOLINT(google-build-using-namespace): the tests' own vocabulary
using testing::Contains;
using testing::ElementsAre;
using testing::IsEmpty;
using testing::Not;

constexpr const char* smallFootprintBroker = "RequestHandler";

class NullResults : public AssociationRequests {
 protected:
  /// The answers of every request that yields a null, by the call that is made to fail where one must.
  std::vector<Answer> answersWithNulls() {
    std::vector<Answer> answers = {
        names(software(bios), installedClass),
        associators(software(bios), installedClass),
        names(port("eth0"), installedClass),
        associators(port("eth0"), installedClass),
        names(path(bmcClass), bmcClass),
        associators(path(biosClass), biosClass),
        names(path(networkClass), networkClass),
        associators(path(networkClass), networkClass),
        enumerateNames(path("KELVO_InstalledSoftwareIdentity", {}, oneWithoutComputer())),
        enumerate(path("KELVO_InstalledSoftwareIdentity", {}, oneWithoutComputer())),
        get(path("KELVO_InstalledSoftwareIdentity", {}, oneWithoutComputer())),
    };
    return answers;
  }

  /// The references of an association whose computer nobody serves.
  References oneWithoutComputer() {
    std::erase_if(served("KELVO_ComputerSystem").instances, [](const standin::Instance* instance) {
      return instance->properties.front().second == "beta";
    });
    return {{"System", computer("beta")}, {"InstalledSoftware", software(betaDriver)}};
  }

  /// Of the request, with the first such call failing.
  template <typename Ask>
  std::size_t nullsWithFailing(const std::string& call, Ask ask) {
    failFirst(call, ask);
    EXPECT_EQ(ask().rc, CMPI_RC_OK);
    EXPECT_EQ(world.done, 1);
    return static_cast<std::size_t>(
        std::count(world.returnedPaths.begin(), world.returnedPaths.end(), nullptr) +
        std::count(world.returnedInstances.begin(), world.returnedInstances.end(), nullptr));
  }
};

TEST_F(NullResults, AreHandedOnToEveryObjectManager) {
  for (const char* name : {"recording stand-in", "", "requesthandler", "RequestHandler2", "Request"}) {
    useBroker(name);
    for (const Answer& answer : answersWithNulls()) {
      EXPECT_THAT(answer.objects, Contains("(null)")) << name;
      EXPECT_EQ(answer.done, 1);
    }
  }
}

TEST_F(NullResults, AreLeftOutForTheSmallFootprintBroker) {
  useBroker(smallFootprintBroker);
  for (const Answer& answer : answersWithNulls()) {
    EXPECT_THAT(answer.objects, Not(Contains("(null)")));
    EXPECT_TRUE(answer.isComplete()) << "all else is as before";
  }
  EXPECT_THAT(names(software(bios), installedClass).objects, ElementsAre(computerText("alpha")));
  EXPECT_THAT(names(port("eth0"), installedClass).objects, IsEmpty());
}

TEST_F(NullResults, OfGetInstanceFollowTheSameRule) {
  const auto ask = [&] { return getInstance(pathOf(bios)); };
  EXPECT_EQ(nullsWithFailing("createInstance", ask), 1U);
  useBroker(smallFootprintBroker);
  EXPECT_EQ(nullsWithFailing("createInstance", ask), 0U);
  EXPECT_EQ(nullsWithFailing("createObjectPath(KELVO_SoftwareIdentity)", ask), 0U);
}

TEST_F(NullResults, OfAssociationEnumerationsFollowTheSameRule) {
  for (const char* className : {installedClass, networkClass, bmcClass, biosClass}) {
    const std::string call = std::string("createObjectPath(") + className + ")";
    const auto askNames = [&] { return enumInstanceNames(path(className)); };
    const auto askInstances = [&] { return enumInstances(path(className)); };
    useBroker("another");
    EXPECT_EQ(nullsWithFailing(call, askNames), 1U) << className;
    EXPECT_EQ(nullsWithFailing("createInstance", askInstances), 1U) << className;
    useBroker(smallFootprintBroker);
    EXPECT_EQ(nullsWithFailing(call, askNames), 0U) << className;
    EXPECT_EQ(nullsWithFailing("createInstance", askInstances), 0U) << className;
  }
}

TEST_F(NullResults, TheBrokerIsKnownWhenAFactoryIsCalledByEitherFactory) {
  const auto hasNull = [&] {
    const std::vector<std::string> objects = names(software(bios), installedClass).objects;
    return std::find(objects.begin(), objects.end(), "(null)") != objects.end();
  };
  broker = world.newBroker(smallFootprintBroker);
  EXPECT_TRUE(hasNull()) << "no factory has been told";
  providerAccess().createInstanceMI(&broker, nullptr, nullptr);
  EXPECT_FALSE(hasNull());
  CMPIBroker other = world.newBroker("another");
  providerAccess().createAssociationMI(&other, nullptr, nullptr);
  EXPECT_TRUE(hasNull()) << "the second broker is in use for both";
}

TEST_F(NullResults, ABrokerWithoutATableOrANameIsNoSmallFootprintBroker) {
  CMPIBroker bare{};
  CMPIBroker nameless = world.newBroker(nullptr);
  for (const CMPIBroker* each :
       {static_cast<const CMPIBroker*>(nullptr), static_cast<const CMPIBroker*>(&bare),
        static_cast<const CMPIBroker*>(&nameless)}) {
    providerAccess().createAssociationMI(each, nullptr, nullptr);
    EXPECT_THAT(names(port("eth0"), installedClass).objects, ElementsAre("(null)"));
  }
}

}  // namespace
