// The instance interface through its function table: every case that a request can meet.
#include <gmock/gmock.h>

#include "ProviderAccess.h"

namespace {

using testing::ElementsAre;
using testing::IsEmpty;

using InstanceOperations = ProviderTest;

TEST_F(InstanceOperations, TablesCarryVersionsNamesAndEverySlot) {
  EXPECT_EQ(instances->hdl, nullptr);
  EXPECT_EQ(instances->ft->ftVersion, 200);
  EXPECT_EQ(instances->ft->miVersion, 200);
  EXPECT_STREQ(instances->ft->miName, "instanceSoftwareInventoryProvider");
  EXPECT_EQ(associations->hdl, nullptr);
  EXPECT_EQ(associations->ft->ftVersion, 200);
  EXPECT_EQ(associations->ft->miVersion, 200);
  EXPECT_STREQ(associations->ft->miName, "associationSoftwareInventoryProvider");
  EXPECT_NE(instances->ft->cleanup, nullptr);
  EXPECT_NE(instances->ft->execQuery, nullptr);
  EXPECT_NE(associations->ft->referenceNames, nullptr);
}

TEST_F(InstanceOperations, FactoriesReturnTheSameObjectsEachTime) {
  CMPIBroker other{};
  EXPECT_EQ(providerAccess().createInstanceMI(&other, nullptr, nullptr), instances);
  EXPECT_EQ(providerAccess().createAssociationMI(&other, nullptr, nullptr), associations);
}

TEST_F(InstanceOperations, TheSecondBrokerIsInUseForBothInterfaces) {
  CMPIBroker second{};
  providerAccess().createAssociationMI(&second, nullptr, nullptr);
  enumInstanceNames(path());
  ASSERT_FALSE(world.brokersUsed.empty());
  EXPECT_THAT(world.brokersUsed, testing::Each(&second));
}

TEST_F(InstanceOperations, NamesComeInOrderFirmwareBiosDrivers) {
  EXPECT_EQ(enumInstanceNames(path()).rc, CMPI_RC_OK);
  EXPECT_THAT(returnedNames(), ElementsAre("26@f1", "192@f2", "192@b1", "192@d1", "192@d2"));
  EXPECT_EQ(world.done, 1);
  EXPECT_EQ(world.calls.back(), "returnDone");
}

TEST_F(InstanceOperations, InstancesComeInTheSameOrder) {
  EXPECT_EQ(enumInstances(path()).rc, CMPI_RC_OK);
  EXPECT_THAT(returnedInstanceNames(), ElementsAre("26@f1", "192@f2", "192@b1", "192@d1", "192@d2"));
  EXPECT_EQ(world.done, 1);
}

TEST_F(InstanceOperations, TheSecondClassIdIsServedAlike) {
  EXPECT_EQ(enumInstanceNames(path("Second_SoftwareIdentity")).rc, CMPI_RC_OK);
  EXPECT_EQ(world.returnedPaths.size(), 5U);
  EXPECT_EQ(world.returnedPaths.front()->className, "KELVO_SoftwareIdentity");
}

TEST_F(InstanceOperations, PathsAreMadeInTheRequestsNamespace) {
  enumInstanceNames(&world.newPath("KELVO_SoftwareIdentity", "root/other")->cmpi);
  ASSERT_FALSE(world.returnedPaths.empty());
  EXPECT_EQ(world.returnedPaths.front()->nameSpace, "root/other");
}

TEST_F(InstanceOperations, ClassId11IsInvalidToEnumerateAndNotSupportedToGet) {
  EXPECT_EQ(enumInstanceNames(path("Refused_Class")).rc, CMPI_RC_ERR_INVALID_CLASS);
  EXPECT_EQ(enumInstances(path("Refused_Class")).rc, CMPI_RC_ERR_INVALID_CLASS);
  EXPECT_EQ(getInstance(path("Refused_Class")).rc, CMPI_RC_ERR_NOT_SUPPORTED);
  EXPECT_EQ(world.done, 0);
}

TEST_F(InstanceOperations, AnUnknownClassIsInvalidAndHasNoDoneMarker) {
  EXPECT_EQ(enumInstanceNames(path("Other")).rc, CMPI_RC_ERR_INVALID_CLASS);
  EXPECT_EQ(enumInstances(path("KELVO_ComputerSystem")).rc, CMPI_RC_ERR_INVALID_CLASS);
  EXPECT_EQ(getInstance(path("Other")).rc, CMPI_RC_ERR_INVALID_CLASS);
  EXPECT_EQ(enumInstances(nullptr).rc, CMPI_RC_ERR_INVALID_CLASS);
  EXPECT_EQ(world.done, 0);
}

TEST_F(InstanceOperations, AnAdapterThatYieldsNothingIsOkWithTheDoneMarkerAlone) {
  EXPECT_EQ(enumInstances(pathOf("192@nothing")).rc, CMPI_RC_OK);
  EXPECT_EQ(enumInstanceNames(pathOf("192@nothing")).rc, CMPI_RC_OK);
  EXPECT_EQ(getInstance(pathOf("192@nothing")).rc, CMPI_RC_OK);
  EXPECT_THAT(world.returnedInstances, IsEmpty());
  EXPECT_THAT(world.returnedPaths, IsEmpty());
  EXPECT_EQ(world.done, 3);
}

TEST_F(InstanceOperations, ModifyInstanceWithoutInstanceFails) {
  CMPIInstance noHandle{};
  const auto modify = instances->ft->modifyInstance;
  EXPECT_EQ(modify(instances, nullptr, world.result(), path(), nullptr, nullptr).rc, CMPI_RC_ERR_FAILED);
  EXPECT_EQ(modify(instances, nullptr, world.result(), path(), &noHandle, nullptr).rc, CMPI_RC_ERR_FAILED);
  EXPECT_THAT(world.calls, IsEmpty());
}

TEST_F(InstanceOperations, ModifyInstanceAnswersTheBrokersClassNameStatusAndChangesNothing) {
  standin::Instance* instance = world.newInstance(world.newPath("KELVO_SoftwareIdentity"));
  const auto modify = instances->ft->modifyInstance;
  const CMPIStatus answer = modify(instances, nullptr, world.result(), path(), &instance->cmpi, nullptr);
  EXPECT_EQ(answer.rc, CMPI_RC_OK);
  EXPECT_EQ(answer.msg, nullptr);
  EXPECT_THAT(world.calls, ElementsAre("getClassId(path)", "getClassName", "getClassName"));

  world.classNameStatus = CMPI_RC_ERR_INVALID_HANDLE;
  EXPECT_EQ(modify(instances, nullptr, world.result(), path(), &instance->cmpi, nullptr).rc,
            CMPI_RC_ERR_INVALID_HANDLE);
  EXPECT_THAT(world.written, IsEmpty());
}

TEST_F(InstanceOperations, RefusedOperationsTouchNothing) {
  EXPECT_EQ(instances->ft->createInstance(instances, nullptr, nullptr, nullptr, nullptr).rc,
            CMPI_RC_ERR_NOT_SUPPORTED);
  EXPECT_EQ(instances->ft->deleteInstance(instances, nullptr, nullptr, nullptr).rc,
            CMPI_RC_ERR_NOT_SUPPORTED);
  EXPECT_EQ(instances->ft->execQuery(instances, nullptr, nullptr, nullptr, nullptr, nullptr).rc,
            CMPI_RC_ERR_NOT_SUPPORTED);
  EXPECT_EQ(instances->ft->cleanup(instances, nullptr, 1).rc, CMPI_RC_OK);
  EXPECT_EQ(associations->ft->cleanup(associations, nullptr, 1).rc, CMPI_RC_OK);
  EXPECT_EQ(
      associations->ft->references(associations, nullptr, nullptr, nullptr, nullptr, nullptr, nullptr).rc,
      CMPI_RC_ERR_NOT_SUPPORTED);
  EXPECT_EQ(associations->ft->referenceNames(associations, nullptr, nullptr, nullptr, nullptr, nullptr).rc,
            CMPI_RC_ERR_NOT_SUPPORTED);
  EXPECT_THAT(world.calls, IsEmpty());
  for (const standin::LogLine& line : world.log) {
    EXPECT_EQ(
        line.text.rfind("METHOD: " + line.function + "() was invoked in SoftwareInventoryProvider.cpp", 0),
        0U)
        << line.text;
  }
  EXPECT_EQ(world.log.size(), 14U) << "one event, to two channels, of each of the seven";
}

TEST_F(InstanceOperations, AnExceptionInTheMiddleKeepsWhatWasReturnedAndSendsNoDoneMarker) {
  // The third path that is asked for: the two before it are delivered.
  enumInstanceNames(path());
  std::size_t third = 0;
  for (std::size_t i = 0, seen = 0; i < world.calls.size() && third == 0; ++i) {
    seen += world.calls[i] == "getPathToParentNode" ? 1 : 0;
    third = seen == 3 ? i + 1 : 0;
  }
  world.forget();
  world.failAt = third;
  world.fault = standin::Fault::Throw;
  EXPECT_EQ(enumInstanceNames(path()).rc, CMPI_RC_OK);
  EXPECT_THAT(returnedNames(), ElementsAre("26@f1", "192@f2"));
  EXPECT_EQ(world.done, 0);
  EXPECT_THAT(texts(3000),
              ElementsAre(testing::MatchesRegex(
                  "MESSAGE \\[File: SoftwareInventoryProvider.cpp, Line: [0-9]+\\]: injected failure")));
  EXPECT_EQ(texts(3000), texts(3000, true)) << "the same on both channels";
}

TEST_F(InstanceOperations, NoSoftwareAtAllIsLoggedAndOkWithoutDoneMarker) {
  world.nodes = {{40, "c0", "", "c0", "Computer System", {}, {}}};
  for (const bool throws : {true, false}) {
    world.forget();
    world.missingTypeThrows = throws;
    EXPECT_EQ(enumInstances(path()).rc, CMPI_RC_OK);
    EXPECT_EQ(world.done, 0);
    ASSERT_EQ(texts(3000).size(), 1U);
    EXPECT_THAT(texts(3000).front(), testing::HasSubstr("Could Not Find Any of the Software Identity Nodes"));
  }
}

TEST_F(InstanceOperations, StartsOnTheTypeTwoNodesWhereThereIsNoFirmware) {
  std::erase_if(world.nodes, [](const standin::Node& node) { return node.type == 3; });
  for (const bool throws : {true, false}) {
    world.forget();
    world.missingTypeThrows = throws;
    enumInstanceNames(path());
    EXPECT_THAT(returnedNames(), ElementsAre("192@b1", "192@d1", "192@d2"));
  }
}

TEST_F(InstanceOperations, AnInstanceIdOfADriverPassesTheOtherTypesComparingPaths) {
  EXPECT_EQ(getInstance(pathOf("192@d2")).rc, CMPI_RC_OK);
  EXPECT_THAT(returnedInstanceNames(), ElementsAre("192@d2"));
  // Firmware is compared node by node; the filter reaches the framework with the next types, and passes only
  // in the last.
  EXPECT_EQ(countCalls("setFilter(0,\"/d2\")"), 2U);
  EXPECT_EQ(countCalls("selectNode(2)"), 1U);
  EXPECT_EQ(countCalls("selectNode(44)"), 1U);
  EXPECT_EQ(world.done, 1);
}

TEST_F(InstanceOperations, AnInstanceIdOfFirmwareIsFoundWithoutAFilter) {
  EXPECT_EQ(enumInstanceNames(pathOf("26@f1")).rc, CMPI_RC_OK);
  EXPECT_THAT(returnedNames(), ElementsAre("26@f1"));
}

TEST_F(InstanceOperations, TheParentNumberOfAnInstanceIdIsNotCompared) {
  enumInstanceNames(pathOf("9999@f2"));
  EXPECT_THAT(returnedNames(), ElementsAre("192@f2"));
}

TEST_F(InstanceOperations, TheComputersOwnIdentifierAppliesPathTypeTwo) {
  enumInstanceNames(pathOf("192"));
  EXPECT_THAT(world.calls, testing::Contains("setFilter(2,\"/c0\")"));
  EXPECT_THAT(world.calls, testing::Not(testing::Contains("setFilter(1,\"/c0\")")));
  EXPECT_THAT(returnedNames(), ElementsAre("26@f1", "192@f2", "192@b1", "192@d1", "192@d2"));
}

TEST_F(InstanceOperations, AnyOtherParentIdentifierAppliesPathTypeOne) {
  enumInstanceNames(pathOf("26"));
  EXPECT_THAT(world.calls, testing::Contains("setFilter(1,\"/1a\")"));
  EXPECT_THAT(returnedNames(), ElementsAre("26@f1"));
}

TEST_F(InstanceOperations, AParentIdentifierThatIsNoNumberReadsAsZero) {
  EXPECT_EQ(enumInstanceNames(pathOf("other")).rc, CMPI_RC_OK);
  EXPECT_THAT(world.calls, testing::Contains("convertStringToPath(\"0\")"));
  EXPECT_THAT(returnedNames(), IsEmpty());
  EXPECT_EQ(world.done, 0) << "the framework's filter throws, where nothing passes";
}

TEST_F(InstanceOperations, ANumberAndTheSeparatorAloneMatchNoNode) {
  EXPECT_EQ(enumInstanceNames(pathOf("12@")).rc, CMPI_RC_OK);
  EXPECT_THAT(world.calls, testing::Contains("convertStringToPath(\"\")"));
  EXPECT_THAT(returnedNames(), IsEmpty());
  EXPECT_EQ(world.done, 1);
}

TEST_F(InstanceOperations, TheNodePathOfAnInstanceIdEndsAtWhiteSpace) {
  enumInstanceNames(pathOf(" 26 @ f1 trailing"));
  EXPECT_THAT(returnedNames(), ElementsAre("26@f1"));
}

TEST_F(InstanceOperations, APathWithoutInstanceIdIsNotNarrowed) {
  standin::Path* other = world.newPath("KELVO_SoftwareIdentity");
  other->keys.emplace_back("Name", "26@f1");
  enumInstanceNames(&other->cmpi);
  EXPECT_EQ(returnedNames().size(), 5U);
}

TEST_F(InstanceOperations, ANullPathIsSkippedSilently) {
  failFirst("createObjectPath(KELVO_SoftwareIdentity)", [&] { enumInstanceNames(path()); });
  EXPECT_EQ(enumInstanceNames(path()).rc, CMPI_RC_OK);
  EXPECT_THAT(returnedNames(), ElementsAre("192@f2", "192@b1", "192@d1", "192@d2"));
  EXPECT_EQ(world.done, 1);
  EXPECT_THAT(texts(3000), IsEmpty());
}

TEST_F(InstanceOperations, ANullInstanceIsSkippedInAnEnumeration) {
  for (const char* call : {"createObjectPath(KELVO_SoftwareIdentity)", "createInstance"}) {
    failFirst(call, [&] { enumInstances(path()); });
    EXPECT_EQ(enumInstances(path()).rc, CMPI_RC_OK);
    EXPECT_THAT(returnedInstanceNames(), ElementsAre("192@f2", "192@b1", "192@d1", "192@d2"));
    EXPECT_EQ(world.done, 1);
  }
}

TEST_F(InstanceOperations, ANullInstanceIsHandedOnByGetInstance) {
  for (const char* call : {"createObjectPath(KELVO_SoftwareIdentity)", "createInstance"}) {
    failFirst(call, [&] { getInstance(pathOf("26@f1")); });
    EXPECT_EQ(getInstance(pathOf("26@f1")).rc, CMPI_RC_OK);
    EXPECT_THAT(returnedInstanceNames(), ElementsAre("(null)"));
    EXPECT_EQ(world.done, 1);
  }
}

TEST_F(InstanceOperations, OneInstanceTakesTheseCallsInThisOrder) {
  world.nodes = {{40, "c0", "", "c0", "Computer System", {}, {}},
                 {44, "d1", "c0", "c0", "driver", {{134, "5"}, {164, "12/31/2010"}}, {{104, 1}}}};
  getInstance(pathOf("192@d1"));
  EXPECT_THAT(
      world.calls,
      ElementsAre("getClassId(path)", "getNamespace",  // the request
                  "Instrumentation()", "selectNode(3)", "selectNode(2)", "selectNode(44)",
                  "operator bool",  // the walk
                  "getKeyCount", "getKeyProperty(InstanceID)", "convertStringToPath(\"d1\")",
                  "operator bool",  // its filter
                  "getPathToNode", "convertPathToString(\"/d1\")", "operator bool",
                  "operator bool",                             // on an element
                  "createObjectPath(KELVO_SoftwareIdentity)",  // its path
                  "getPathToParentNode", "convertPathToString(\"/c0\")", "getPathToNode",
                  "convertPathToString(\"/d1\")", "setKeyProperty(InstanceID)",
                  "createInstance",  // its properties
                  "getNodeDescription", "getProperty(108,string)", "setProperty(Description)",
                  "getProperty(164,string)", "setProperty(InstallDate)", "getProperty(108,string)",
                  "getPathToParentNode", "convertPathToString(\"/c0\")", "getPathToNode",
                  "convertPathToString(\"/d1\")", "setProperty(InstanceID)", "getProperty(104,number)",
                  "setProperty(MajorVersion)", "getProperty(107,number)", "getProperty(134,string)",
                  "setProperty(VersionString)", "getProperty(171,string)", "getProperty(36,string)",
                  "setProperty(Classifications)", "setProperty(ClassificationDescriptions)",
                  "getProperty(164,string)", "setProperty(ReleaseDate)", "returnInstance", "operator++",
                  "operator bool", "operator bool",  // no other element
                  "operator bool", "returnDone"));
}

}  // namespace
