// The association interface through its function table: which adapters a request reaches, in which order, and
// how it ends.
#include <gmock/gmock.h>

#include "AssociationRequests.h"

namespace {

using namespace associations;  // NOLINT(google-build-using-namespace): the tests' own vocabulary
using testing::Contains;
using testing::ElementsAre;
using testing::IsEmpty;

using AssociationOperations = AssociationRequests;

constexpr const char* elementSoftware = "CIM_ElementSoftwareIdentity";

// ---- From an association class to its adapters.

TEST_F(AssociationOperations, OneAssociationClassYieldsItsFarEndAlone) {
  const Answer answer = names(software(bmc), bmcClass);
  EXPECT_THAT(answer.objects, ElementsAre(serviceProcessorText("alpha")));
  EXPECT_TRUE(answer.isComplete());
  EXPECT_THAT(associators(software(bmc), bmcClass).objects, ElementsAre(serviceProcessorText("alpha")));
}

TEST_F(AssociationOperations, AParentClassReachesNetworkBmcAndBiosInThisOrder) {
  // Firmware of all three kinds at once: below a network device, and found as BMC and as BIOS in turn.
  const Answer network = names(software(nicFirmware), elementSoftware);
  EXPECT_THAT(network.objects, ElementsAre(portText("eth0")));
  EXPECT_THAT(network.failures, ElementsAre("The specified firmware is not a BMC firmware",
                                            "The specified firmware is not a BIOS firmware"));
  const Answer fromBmc = names(software(bmc), elementSoftware);
  EXPECT_THAT(fromBmc.objects, ElementsAre(serviceProcessorText("alpha")));
  EXPECT_THAT(fromBmc.failures, ElementsAre("The specified firmware does not belong to a network device",
                                            "The specified firmware is not a BIOS firmware"));
  const Answer fromBios = names(software(bios), elementSoftware);
  EXPECT_THAT(fromBios.objects, ElementsAre(computerText("alpha")));
  EXPECT_EQ(fromBios.done, 1);
}

TEST_F(AssociationOperations, EachAdapterContributesInItsTurn) {
  // A class path of software goes every way: each adapter enumerates its far end's class.
  const Answer answer = names(path("KELVO_SoftwareIdentity"), elementSoftware);
  EXPECT_THAT(answer.objects, ElementsAre(portText("eth0"), portText("eth1"), serviceProcessorText("alpha"),
                                          computerText("alpha"), computerText("beta")));
  EXPECT_TRUE(answer.isComplete());
  EXPECT_EQ(associators(path("KELVO_SoftwareIdentity"), elementSoftware).objects, answer.objects);
}

TEST_F(AssociationOperations, AClassRelatedToBothParentsReachesAllFourInstalledFirst) {
  const Answer answer = names(path("KELVO_SoftwareIdentity"), "CIM_Both");
  EXPECT_THAT(answer.objects,
              ElementsAre(computerText("alpha"), computerText("beta"), portText("eth0"), portText("eth1"),
                          serviceProcessorText("alpha"), computerText("alpha"), computerText("beta")));
  EXPECT_EQ(answer.done, 1);
}

TEST_F(AssociationOperations, ANullAssociationClassIsRelatedToAll) {
  for (const Answer& answer : {names(path("KELVO_SoftwareIdentity"), nullptr),
                               associators(path("KELVO_SoftwareIdentity"), nullptr)}) {
    EXPECT_EQ(answer.objects.size(), 7U);
    EXPECT_TRUE(answer.isComplete());
  }
}

TEST_F(AssociationOperations, RelationshipsAreAskedInTheSourcesNamespace) {
  names(&world.newPath("KELVO_SoftwareIdentity", "root/other")->cmpi, elementSoftware);
  EXPECT_THAT(world.calls, Contains("areClassesRelated(CIM_InstalledSoftwareIdentity) in root/other"));
  EXPECT_THAT(world.calls, Contains("areClassesRelated(CIM_ElementSoftwareIdentity) in root/other"));
}

TEST_F(AssociationOperations, FarEndsAreMadeInTheSourcesNamespace) {
  standin::Path* const source = world.newPath("KELVO_NetworkPort", "root/other");
  source->keys = {{"DeviceID", "eth2"}};
  names(&source->cmpi, networkClass);
  ASSERT_EQ(world.returnedPaths.size(), 1U);
  EXPECT_EQ(world.returnedPaths[0]->nameSpace, "root/other");
}

TEST_F(AssociationOperations, AResultClassAndRolesNarrowNothing) {
  world.forget();
  associations->ft->associatorNames(associations, nullptr, world.result(), software(bios), biosClass,
                                    "KELVO_NetworkPort", "Antecedent", "NoSuchRole");
  associations->ft->associators(associations, nullptr, world.result(), software(bios), biosClass,
                                "KELVO_NetworkPort", "Antecedent", "NoSuchRole", nullptr);
  EXPECT_EQ(world.returnedPaths.size(), 1U);
  EXPECT_EQ(world.returnedInstances.size(), 1U);
}

TEST_F(AssociationOperations, ThePropertyListReachesTheSoftwareAndNarrowsNothing) {
  const char* properties[] = {"InstanceID", nullptr};
  EXPECT_TRUE(associators(port("eth2"), networkClass, properties).isComplete());
  EXPECT_EQ(property(0, "InstanceID"), otherNicFirmware);
  EXPECT_EQ(property(0, "Description"), "Network Firmware");
}

// ---- How a request ends.

TEST_F(AssociationOperations, AnUnrelatedClassIsInvalidAfterAnEmptyCompletedResult) {
  for (const Answer& answer :
       {names(software(bios), "CIM_Chassis"), associators(software(bios), "CIM_Chassis")}) {
    EXPECT_EQ(answer.status.rc, CMPI_RC_ERR_INVALID_CLASS);
    EXPECT_EQ(answer.status.msg, nullptr);
    EXPECT_THAT(answer.objects, IsEmpty());
    EXPECT_EQ(answer.done, 1);
  }
}

TEST_F(AssociationOperations, AClassWithoutAnAdapterIsInvalidWithoutTheDoneMarker) {
  for (const char* className : {"KELVO_SoftwareIdentity", "Second_SoftwareIdentity", "KELVO_ComputerSystem",
                                "Refused_Class", "KELVO_NetworkPort", "KELVO_SPComputerSystem"}) {
    for (const Answer& answer : {names(software(bios), className), associators(software(bios), className)}) {
      EXPECT_EQ(answer.status.rc, CMPI_RC_ERR_INVALID_CLASS) << className;
      EXPECT_THAT(answer.objects, IsEmpty());
      EXPECT_EQ(answer.done, 0) << className;
    }
  }
}

TEST_F(AssociationOperations, AnExceptionInTheNetworkAdapterDoesNotStopTheOthers) {
  serve("KELVO_NetworkPort", "DeviceID", {});
  for (const Answer& answer : {names(path("KELVO_SoftwareIdentity"), elementSoftware),
                               associators(path("KELVO_SoftwareIdentity"), elementSoftware)}) {
    EXPECT_THAT(answer.objects,
                ElementsAre(serviceProcessorText("alpha"), computerText("alpha"), computerText("beta")));
    EXPECT_EQ(answer.status.rc, CMPI_RC_OK);
    EXPECT_EQ(answer.done, 1);
    EXPECT_THAT(answer.failures, ElementsAre("Could not obtain an instance of Network Port"));
  }
}

TEST_F(AssociationOperations, ADeliveredObjectStaysWhereALaterStepFails) {
  node("f2").parent = "1a";
  const Answer all = names(port("eth0"), networkClass);
  ASSERT_EQ(all.objects.size(), 3U);
  const auto second = std::find(world.calls.rbegin(), world.calls.rend(), "getPathToParentNode");
  const auto number = static_cast<std::size_t>(world.calls.rend() - second);
  world.forget();
  world.failAt = number;
  world.fault = standin::Fault::Throw;
  const CMPIStatus status = associations->ft->associatorNames(
      associations, nullptr, world.result(), port("eth0"), networkClass, nullptr, nullptr, nullptr);
  EXPECT_EQ(status.rc, CMPI_RC_OK);
  EXPECT_EQ(world.returnedPaths.size(), 2U);
  EXPECT_EQ(world.done, 1);
}

TEST_F(AssociationOperations, ReferencesAreNeverSupported) {
  world.forget();
  const auto* table = associations->ft;
  EXPECT_EQ(
      table->references(associations, nullptr, world.result(), software(bios), bmcClass, nullptr, nullptr).rc,
      CMPI_RC_ERR_NOT_SUPPORTED);
  EXPECT_EQ(
      table->referenceNames(associations, nullptr, world.result(), software(bios), bmcClass, nullptr).rc,
      CMPI_RC_ERR_NOT_SUPPORTED);
  EXPECT_THAT(world.calls, IsEmpty());
  EXPECT_EQ(world.done, 0);
}

TEST_F(AssociationOperations, ASourceOfAnotherClassYieldsNothingFromThreeAndOneNullFromInstalled) {
  EXPECT_THAT(names(path("Other"), elementSoftware).objects, IsEmpty());
  EXPECT_THAT(names(path("Other"), installedClass).objects, ElementsAre("(null)"));
  EXPECT_THAT(names(nullptr, installedClass).objects, ElementsAre("(null)"));
  EXPECT_TRUE(names(nullptr, elementSoftware).isComplete());
}

TEST_F(AssociationOperations, AKnownClassReachesItsOwnAdapterWhateverItsAncestors) {
  world.ancestors[bmcClass] = {elementSoftware, "CIM_InstalledSoftwareIdentity"};
  EXPECT_THAT(names(software(bmc), bmcClass).objects, ElementsAre(serviceProcessorText("alpha")));
  EXPECT_EQ(countOf(world.calls, "areClassesRelated"), 0U);
}

// ---- Exceptions that nobody expects.

class AssociationDeathTest : public AssociationRequests {
 protected:
  /// Another exception than the framework's own comes out of this call, the first of its kind.
  void throwFrom(const std::string& call, const CMPIObjectPath* source, const char* associationClass) {
    world.fault = standin::Fault::Result;
    failFirst(call, [&] { ask(source, associationClass); });
    world.fault = standin::Fault::ThrowOther;
    ask(source, associationClass);
  }
  void ask(const CMPIObjectPath* source, const char* associationClass) {
    associations->ft->associatorNames(associations, nullptr, world.result(), source, associationClass,
                                      nullptr, nullptr, nullptr);
  }
};

TEST_F(AssociationDeathTest, EndTheProcessInTheInstalledAndTheNetworkResolver) {
  testing::FLAGS_gtest_death_test_style = "threadsafe";
  EXPECT_DEATH(throwFrom("selectNode(\"/f1\")", software(bios), installedClass), "terminate called");
  EXPECT_DEATH(throwFrom("selectNode(12)", port("eth0"), networkClass), "terminate called");
  EXPECT_DEATH(throwFrom("selectNode(\"/1a\")", software(nicFirmware), networkClass), "terminate called");
  EXPECT_DEATH(throwFrom("selectNode(49)", path("KELVO_NetworkPort"), networkClass), "terminate called");
}

TEST_F(AssociationDeathTest, PassTheFirmwareResolversToTheLog) {
  const std::string expected = "MESSAGE [File: SoftwareInventoryProvider.cpp, Line: N]: another failure";
  throwFrom("selectNode(\"/f2\")", software(bmc), bmcClass);
  EXPECT_THAT(logTexts(world, 3000), ElementsAre(expected));
  EXPECT_EQ(world.done, 1);
  throwFrom("getNodeDescription", computer("alpha"), biosClass);
  EXPECT_THAT(logTexts(world, 3000), ElementsAre(expected));
  EXPECT_EQ(world.done, 1);
}

// ---- What a request says of itself.

std::vector<std::string> withoutAdapters(const standin::World& world) {
  std::vector<std::string> texts;
  for (const standin::LogLine& line : world.log) {
    if (!line.trace && (line.file == "SoftwareInventoryProvider.cpp" || line.file == "include/Trace.h") &&
        line.function != "getClassId") {
      texts.push_back(line.text.substr(0, line.text.find(" [Line")).substr(0, line.text.find(" at line")));
    }
  }
  return texts;
}

TEST_F(AssociationOperations, TracesResultClassThenAssociationClass) {
  names(software(bios), biosClass, "CIM_ComputerSystem");
  EXPECT_THAT(withoutAdapters(world),
              ElementsAre(std::string(78, '='),
                          "ENTERING: SoftwareInventory_AssociatorNames() in SoftwareInventoryProvider.cpp",
                          "VARIABLE: 'resultClass' has Value 'CIM_ComputerSystem'",
                          "VARIABLE: 'associationClass' has Value 'KELVO_BIOSSoftwareIdentity'",
                          "VARIABLE: 'rcode' has Value '1'",
                          "EXITING: SoftwareInventory_AssociatorNames() in SoftwareInventoryProvider.cpp",
                          std::string(78, '=')));
}

TEST_F(AssociationOperations, TracesRcodeOnceForEachIdAndTwiceForOneWithoutAnAdapter) {
  const auto rcodes = [&] {
    std::vector<std::string> found = logTexts(world, 4000);
    std::erase_if(found, [](const std::string& text) { return text.find("'rcode'") == std::string::npos; });
    return found;
  };
  const std::string yes = "VARIABLE: 'rcode' has Value '1' at line N in SoftwareInventoryProvider.cpp";
  const std::string no = "VARIABLE: 'rcode' has Value '0' at line N in SoftwareInventoryProvider.cpp";
  names(software(bios), "CIM_Both");
  EXPECT_THAT(rcodes(), ElementsAre(yes, yes, yes, yes)) << "an exception does not count";
  names(software(bios), "KELVO_SoftwareIdentity");
  EXPECT_THAT(rcodes(), ElementsAre(no, no));
  names(software(bios), "CIM_Chassis");
  EXPECT_THAT(rcodes(), IsEmpty());
  associators(software(bios), "CIM_Both");
  EXPECT_THAT(rcodes(), IsEmpty()) << "of names alone";
}

TEST_F(AssociationOperations, TracesTheInvalidClassAsANumber) {
  associators(software(bios), "CIM_Chassis");
  EXPECT_THAT(withoutAdapters(world),
              ElementsAre(std::string(78, '='),
                          "ENTERING: SoftwareInventory_Associators() in SoftwareInventoryProvider.cpp",
                          "VARIABLE: 'resultClass' has Value '(null)'",
                          "VARIABLE: 'associationClass' has Value 'CIM_Chassis'",
                          "VARIABLE: 'CMPI_RC_ERR_INVALID_CLASS' has Value '5'",
                          "EXITING: SoftwareInventory_Associators() in SoftwareInventoryProvider.cpp",
                          std::string(78, '=')));
}

TEST_F(AssociationOperations, TracesAnExceptionAsAMessageAtTheErrorLevelOnBothChannels) {
  names(software(driver), bmcClass);
  const std::string expected =
      "MESSAGE [File: SoftwareInventoryProvider.cpp, Line: N]: The specified software is not a firmware";
  EXPECT_THAT(logTexts(world, 3000), ElementsAre(expected));
  EXPECT_THAT(logTexts(world, 3000, true), ElementsAre(expected));
}

}  // namespace
