// The firmware of management controllers and the BIOS through the function tables: every case of the
// resolvers and adapters of both that a request can meet.
#include <gmock/gmock.h>

#include "AssociationRequests.h"

namespace {

using namespace associations;  // NOLINT(google-build-using-namespace): the tests' own vocabulary
using testing::Contains;
using testing::ElementsAre;
using testing::IsEmpty;

struct Kind {
  const char* name;
  const char* className;
  const char* computerClass;
  const char* text;  ///< of the firmware's node
  const char* id;
  const char* otherKind;
  const char* description;
  const char* almost;
  const char* noFirmware;
  const char* noComputer;
  const char* otherComputer;
  const char* wrongKind;
  const char* noSystem;
};

// Names the case where GoogleTest prints its parameter.
void PrintTo(const Kind& kind, std::ostream* stream) {  // NOLINT(readability-identifier-naming)
  *stream << kind.name;
}

const Kind kinds[] = {
    {"BMC", bmcClass, "KELVO_SPComputerSystem", "f2", "224@f2", "192@f1", "BMC Firmware", "BMC firmware",
     "Could not find BMC firmware", "Could not find Computer associated with BMC",
     "A BMC associated with this computer is not available.", "The specified firmware is not a BMC firmware",
     "Could not find BMC Computer System"},
    {"BIOS", biosClass, "KELVO_ComputerSystem", "f1", "192@f1", "224@f2", "BIOS", "Bios",
     "Could not find BIOS firmware", "Could not find Computer associated with BIOS",
     "A BIOS associated with this computer is not available.",
     "The specified firmware is not a BIOS firmware", "Could not find BIOS Computer System"},
};

class FirmwareOperations : public AssociationRequests, public testing::WithParamInterface<Kind> {
 protected:
  Answer fromComputer(const char* name) {
    return names(path(GetParam().computerClass, {{"Name", name}}), GetParam().className);
  }
  Answer fromSoftware(const std::string& instanceId) {
    return names(software(instanceId), GetParam().className);
  }
  /// Of a request that fails as a whole: what it says.
  static std::string failure(const Answer& answer) {
    EXPECT_EQ(answer.status.rc, CMPI_RC_OK);
    EXPECT_EQ(answer.done, 1);
    EXPECT_THAT(answer.objects, IsEmpty());
    return answer.failures.size() == 1 ? answer.failures.front() : "(not one)";
  }
  std::string computerName(const std::string& name) const {
    return std::string(GetParam().computerClass) + ".Name=" + name;
  }
};

INSTANTIATE_TEST_SUITE_P(Kinds, FirmwareOperations, testing::ValuesIn(kinds),
                         [](const auto& param) { return std::string(param.param.name); });

TEST_P(FirmwareOperations, FromTheComputerComesItsFirmwareAndBack) {
  const Answer there = fromComputer("alpha");
  EXPECT_THAT(there.objects, ElementsAre(softwareText(GetParam().id)));
  EXPECT_TRUE(there.isComplete());
  const Answer back = fromSoftware(GetParam().id);
  EXPECT_THAT(back.objects, ElementsAre(computerName("alpha")));
  EXPECT_TRUE(back.isComplete());
}

TEST_P(FirmwareOperations, AssociatorsAreTheInstancesOfTheFarEnd) {
  associators(path(GetParam().computerClass, {{"Name", "alpha"}}), GetParam().className);
  EXPECT_EQ(property(0, "Description"), GetParam().description);
  const Answer back = associators(software(GetParam().id), GetParam().className);
  EXPECT_THAT(back.objects, ElementsAre(computerName("alpha")));
}

TEST_P(FirmwareOperations, FirmwareOfOtherKindsIsPassedOver) {
  std::swap(node("f1"), node("f2"));
  EXPECT_THAT(fromComputer("alpha").objects, ElementsAre(softwareText(GetParam().id)));
}

TEST_P(FirmwareOperations, ADescriptionInAnotherLetterCaseIsAnotherKind) {
  node(GetParam().text).description = GetParam().almost;
  EXPECT_EQ(failure(fromComputer("alpha")), GetParam().noFirmware);
  EXPECT_EQ(failure(fromSoftware(GetParam().id)), GetParam().wrongKind);
}

TEST_P(FirmwareOperations, TheFirstOfItsKindDecidesEvenIfALaterOneBelongsToTheComputer) {
  world.nodes.push_back({3, "fb", "c1", "c1", GetParam().description, {}, {}});
  EXPECT_EQ(failure(fromComputer("beta")), GetParam().otherComputer);
}

TEST_P(FirmwareOperations, SoftwareThatIsNotOfTheKindIsRefused) {
  EXPECT_EQ(failure(fromSoftware(driver)), "The specified software is not a firmware");
  EXPECT_EQ(failure(fromSoftware("192@nothing")), "The specified software is not a firmware");
  EXPECT_EQ(failure(fromSoftware(GetParam().otherKind)), GetParam().wrongKind);
}

TEST_P(FirmwareOperations, TheClimbStartsFromTheNumberOfTheInstanceId) {
  node(GetParam().text).text = "xyz";
  EXPECT_THAT(fromSoftware("26@xyz").objects, ElementsAre(computerName("alpha")));
  EXPECT_THAT(world.calls, Contains("selectNode(\"/1a\")"));
  EXPECT_EQ(failure(fromSoftware("7@xyz")), GetParam().noSystem);
}

TEST_P(FirmwareOperations, MissingKeysAreSaid) {
  EXPECT_EQ(failure(names(path(GetParam().computerClass, {{"name", "alpha"}}), GetParam().className)),
            "Could not find 'Name' key in Moniker");
  EXPECT_EQ(failure(names(path("KELVO_SoftwareIdentity", {{"Name", "x"}}), GetParam().className)),
            "Could not find 'InstanceId' key in Moniker");
}

TEST_P(FirmwareOperations, AComputerThatIsMissingOrUnnamedIsSaid) {
  node("c0").texts.clear();
  EXPECT_EQ(failure(fromComputer("alpha")), "Name Property on computer not available.");
  EXPECT_EQ(failure(fromSoftware(GetParam().id)), "Name Property on computer not available.");
  node("c0").sensorType = 41;
  EXPECT_EQ(failure(fromComputer("alpha")), GetParam().noComputer);
  EXPECT_EQ(failure(fromSoftware(GetParam().id)), GetParam().noSystem);
}

TEST_P(FirmwareOperations, AComputerThatNobodyServesIsSaid) {
  serve(GetParam().computerClass, "Name", {});
  EXPECT_EQ(failure(fromSoftware(GetParam().id)), "Could not obtain an instance of Computer System");
}

TEST_P(FirmwareOperations, PairsAreInStepAndEndWithEitherEnd) {
  serve(GetParam().computerClass, "Name", {"alpha", "beta", "gamma"});
  const Answer answer = enumerateNames(path(GetParam().className));
  ASSERT_EQ(answer.objects.size(), 1U) << "three computers, one firmware";
  EXPECT_THAT(answer.objects[0], testing::HasSubstr("Antecedent={" + computerName("alpha") + "}"));
  EXPECT_THAT(answer.objects[0], testing::HasSubstr("Dependent={" + softwareText(GetParam().id) + "}"));
  EXPECT_TRUE(answer.isComplete());
}

TEST_P(FirmwareOperations, TheFirmwareIsLocatedFromTheFirstComputer) {
  serve(GetParam().computerClass, "Name", {"beta", "alpha"});
  const Answer answer = enumerateNames(path(GetParam().className));
  EXPECT_THAT(answer.failures, ElementsAre(GetParam().otherComputer));
  EXPECT_EQ(answer.done, 0);
}

TEST_P(FirmwareOperations, OtherSourcesYieldNothing) {
  for (CMPIObjectPath* source : {port("eth0"), path("Other"), path(GetParam().className)}) {
    // From the association itself one position without a far end.
    const std::size_t nulls =
        std::string(GetParam().className) == static_cast<standin::Path*>(source->hdl)->className ? 1 : 0;
    const Answer answer = names(source, GetParam().className);
    EXPECT_EQ(answer.objects, std::vector<std::string>(nulls, "(null)"));
    EXPECT_TRUE(answer.isComplete());
  }
}

}  // namespace
