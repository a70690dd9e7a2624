// The resolvers of the two kinds of system firmware, BMCSoftwareIdentity and BIOSSoftwareIdentity, against
// the recording stand-in: one suite for both.
#include <Linux/BIOSSoftwareIdentity.h>
#include <Linux/BMCSoftwareIdentity.h>
#include <Oru/Exceptions.h>
#include <gmock/gmock.h>

#include "../AssociationWorld.h"

namespace {

using namespace associations;  // NOLINT(google-build-using-namespace): the tests' own vocabulary
using Oru::FrameworkException;
using Oru::InstrumentationException;
using Oru::Moniker;
using Oru::SoftwareInventoryProfileProvider::BIOSSoftwareIdentity;
using Oru::SoftwareInventoryProfileProvider::BMCSoftwareIdentity;
using testing::Contains;
using testing::ElementsAre;

struct BMC {
  using Resolver = BMCSoftwareIdentity;
  static Moniker firmwareOf(Resolver& resolver, Moniker& given) { return resolver.getBMCMoniker(given); }
  static constexpr const char* name = "BMCSoftwareIdentity";
  static constexpr const char* operation = "getBMCMoniker";
  static constexpr const char* identityParameter = " monikerBMCIdentity=";
  static constexpr const char* description = "BMC Firmware";
  static constexpr const char* almost = "BMC firmware";
  static constexpr const char* noFirmware = "Could not find BMC firmware";
  static constexpr const char* noComputer = "Could not find Computer associated with BMC";
  static constexpr const char* otherComputer = "A BMC associated with this computer is not available.";
  static constexpr const char* wrongKind = "The specified firmware is not a BMC firmware";
  static constexpr const char* noSystem = "Could not find BMC Computer System";
  static constexpr const char* id = "224@f2";
  static constexpr const char* nodeText = "f2";
  static constexpr const char* otherKind = "192@f1";
};

struct BIOS {
  using Resolver = BIOSSoftwareIdentity;
  static Moniker firmwareOf(Resolver& resolver, Moniker& given) { return resolver.getBIOSMoniker(given); }
  static constexpr const char* name = "BIOSSoftwareIdentity";
  static constexpr const char* operation = "getBIOSMoniker";
  static constexpr const char* identityParameter = " monikerBIOSIdentity=";
  static constexpr const char* description = "BIOS";
  static constexpr const char* almost = "Bios";
  static constexpr const char* noFirmware = "Could not find BIOS firmware";
  static constexpr const char* noComputer = "Could not find Computer associated with BIOS";
  static constexpr const char* otherComputer = "A BIOS associated with this computer is not available.";
  static constexpr const char* wrongKind = "The specified firmware is not a BIOS firmware";
  static constexpr const char* noSystem = "Could not find BIOS Computer System";
  static constexpr const char* id = "192@f1";
  static constexpr const char* nodeText = "f1";
  static constexpr const char* otherKind = "224@f2";
};

template <typename Kind>
class FirmwareResolver : public MachineTest {
 protected:
  std::string firmwareOf(const Keys& keys) {
    Moniker given = moniker(keys);
    return textOf(Kind::firmwareOf(resolver, given));
  }
  std::string firmwareOf(const char* name) { return firmwareOf(Keys{{"Name", name}}); }
  std::string computerOf(const Keys& keys) {
    Moniker given = moniker(keys);
    return textOf(resolver.getComputerMoniker(given));
  }
  std::string computerOf(const std::string& id) { return computerOf(Keys{{"InstanceID", id}}); }
  standin::Node& firmware() { return this->node(Kind::nodeText); }
  const std::string found = std::string("InstanceID=") + Kind::id;
  /// What names the source file in an event.
  const std::string file = std::string(" Linux/") + Kind::name + ".cpp";

  typename Kind::Resolver resolver;
};

struct KindNames {
  template <typename Kind>
  static std::string GetName(int) {  // NOLINT(readability-identifier-naming): GoogleTest asks for it
    return Kind::name;
  }
};
using Kinds = testing::Types<BMC, BIOS>;
TYPED_TEST_SUITE(FirmwareResolver, Kinds, KindNames);

// ---- From a computer to its firmware.

TYPED_TEST(FirmwareResolver, FirmwareOfOtherKindsIsPassedOver) {
  EXPECT_EQ(this->firmwareOf("alpha"), this->found);
  // The same with the other kind first: the two nodes trade places.
  std::swap(this->node("f1"), this->node("f2"));
  EXPECT_EQ(this->firmwareOf("alpha"), this->found);
}

TYPED_TEST(FirmwareResolver, ADescriptionInAnotherLetterCaseOrWithMoreIsAnotherKind) {
  for (const std::string& description :
       {std::string(TypeParam::almost), std::string(TypeParam::description) + " 2",
        std::string("a ") + TypeParam::description}) {
    this->firmware().description = description;
    EXPECT_EQ(thrownBy<InstrumentationException>([&] { this->firmwareOf("alpha"); }), TypeParam::noFirmware);
    EXPECT_EQ(thrownBy<InstrumentationException>([&] { this->computerOf(TypeParam::id); }),
              TypeParam::wrongKind);
  }
}

TYPED_TEST(FirmwareResolver, TheFirstOfItsKindDecidesEvenIfALaterOneBelongsToTheComputer) {
  this->world.nodes.push_back({3, "fb", "c1", "c1", TypeParam::description, {}, {}});
  EXPECT_EQ(thrownBy<InstrumentationException>([&] { this->firmwareOf("beta"); }), TypeParam::otherComputer);
  EXPECT_EQ(countOf(this->world.calls, "selectNode(3)"), 1U);
}

TYPED_TEST(FirmwareResolver, NoFirmwareOfTheKindIsRefused) {
  this->firmware().description = "another";
  EXPECT_EQ(thrownBy<InstrumentationException>([&] { this->firmwareOf("alpha"); }), TypeParam::noFirmware);
}

TYPED_TEST(FirmwareResolver, NoFirmwareAtAllIsRefused) {
  std::erase_if(this->world.nodes, [](const standin::Node& candidate) { return candidate.type == 3; });
  EXPECT_EQ(thrownBy<InstrumentationException>([&] { this->firmwareOf("alpha"); }), "no node of that type")
      << "what the framework throws passes";
  this->world.missingTypeThrows = false;
  EXPECT_EQ(thrownBy<InstrumentationException>([&] { this->firmwareOf("alpha"); }), TypeParam::noFirmware);
}

TYPED_TEST(FirmwareResolver, NoComputerAboveTheFirmwareIsRefused) {
  this->node("c0").sensorType = 41;
  EXPECT_EQ(thrownBy<InstrumentationException>([&] { this->firmwareOf("alpha"); }), TypeParam::noComputer);
}

TYPED_TEST(FirmwareResolver, AnUnnamedComputerIsRefused) {
  this->node("c0").texts.clear();
  EXPECT_EQ(thrownBy<InstrumentationException>([&] { this->firmwareOf("alpha"); }),
            "Name Property on computer not available.");
}

TYPED_TEST(FirmwareResolver, NamesAreComparedByLengthAndBytes) {
  for (const char* name : {"Alpha", "alph", "alphabet", "", "beta"}) {
    EXPECT_EQ(thrownBy<InstrumentationException>([&] { this->firmwareOf(name); }), TypeParam::otherComputer)
        << name;
  }
}

TYPED_TEST(FirmwareResolver, AComputerMonikerWithoutNameIsRefused) {
  for (const Keys& keys : {Keys{}, Keys{{"name", "alpha"}}, Keys{{"InstanceID", "alpha"}}}) {
    EXPECT_EQ(thrownBy<FrameworkException>([&] { this->firmwareOf(keys); }),
              "Could not find 'Name' key in Moniker");
  }
  EXPECT_EQ(this->firmwareOf(Keys{{"CreationClassName", "x"}, {"Name", "alpha"}, {"Name", "beta"}}),
            this->found);
}

TYPED_TEST(FirmwareResolver, TheInstanceIdTakesTheParentTextForAHexadecimalNumber) {
  standin::Node& firmware = this->firmware();
  firmware.text = "xyz";
  firmware.parent = "1a";
  EXPECT_EQ(this->firmwareOf("alpha"), "InstanceID=26@xyz");
  this->node("1b").text = "zz";
  firmware.parent = "zz";
  EXPECT_EQ(this->firmwareOf("alpha"), "InstanceID=0@xyz");
}

TYPED_TEST(FirmwareResolver, TheFirstOperationTakesTheseCalls) {
  std::swap(this->node("f2"), this->world.nodes[2]);  // the management controller's firmware first
  std::vector<std::string> calls = this->callsOf([&] { this->firmwareOf("alpha"); });
  EXPECT_EQ(calls[0], "selectNode(3)");
  EXPECT_EQ(calls[1], "operator bool") << "before a description is read";
  std::erase(calls, "operator bool");
  std::erase(calls, "getNodeDescription");
  std::erase(calls, "operator++");
  const std::string text = TypeParam::nodeText;
  const bool isBmc = text == "f2";
  std::vector<std::string> expected = {"selectNode(3)", "getPathToNode", "getPathToParentNode"};
  if (isBmc) {
    expected.insert(expected.end(), {"selectNode(\"/e0\")", "getSensorType", "getPathToParentNode"});
  }
  expected.insert(expected.end(), {"selectNode(\"/c0\")", "getSensorType", "getProperty(108,string)",
                                   isBmc ? "convertPathToString(\"/e0\")" : "convertPathToString(\"/c0\")",
                                   "convertPathToString(\"/" + text + "\")"});
  EXPECT_EQ(calls, expected);
}

// ---- From firmware to its computer.

TYPED_TEST(FirmwareResolver, FirmwareResolvesToTheComputerAboveIt) {
  EXPECT_EQ(this->computerOf(TypeParam::id), "Name=alpha");
}

TYPED_TEST(FirmwareResolver, SoftwareOfAnotherSensorTypeIsNoFirmware) {
  EXPECT_EQ(thrownBy<InstrumentationException>([&] { this->computerOf(driver); }),
            "The specified software is not a firmware");
  this->firmware().sensorType = 2;
  EXPECT_EQ(thrownBy<InstrumentationException>([&] { this->computerOf(TypeParam::id); }),
            "The specified software is not a firmware");
}

TYPED_TEST(FirmwareResolver, FirmwareOfTheOtherKindIsRefused) {
  for (const std::string& other : {std::string(TypeParam::otherKind), nicFirmware}) {
    EXPECT_EQ(thrownBy<InstrumentationException>([&] { this->computerOf(other); }), TypeParam::wrongKind);
  }
}

TYPED_TEST(FirmwareResolver, APathThatNamesNoNodeIsNoFirmware) {
  for (const char* id : {"192@nothing", "192@", "192", ""}) {
    EXPECT_EQ(thrownBy<InstrumentationException>([&] { this->computerOf(id); }),
              "The specified software is not a firmware")
        << id;
  }
}

TYPED_TEST(FirmwareResolver, TheClimbStartsFromTheNumberOfTheInstanceId) {
  this->firmware().text = "xyz";
  EXPECT_EQ(this->computerOf("26@xyz"), "Name=alpha");
  EXPECT_THAT(this->world.calls, Contains("selectNode(\"/1a\")"));
  EXPECT_EQ(this->computerOf("193@xyz"), "Name=beta") << "not from the firmware's own parent";
  EXPECT_EQ(thrownBy<InstrumentationException>([&] { this->computerOf("7@xyz"); }), TypeParam::noSystem)
      << "a number of no node";
}

TYPED_TEST(FirmwareResolver, NoComputerAboveTheParentIsRefused) {
  this->node("c0").sensorType = 41;
  EXPECT_EQ(thrownBy<InstrumentationException>([&] { this->computerOf(TypeParam::id); }),
            TypeParam::noSystem);
}

TYPED_TEST(FirmwareResolver, AnUnnamedComputerAboveTheParentIsRefused) {
  this->node("c0").texts.clear();
  EXPECT_EQ(thrownBy<InstrumentationException>([&] { this->computerOf(TypeParam::id); }),
            "Name Property on computer not available.");
}

TYPED_TEST(FirmwareResolver, AnIdentityMonikerWithoutInstanceIdIsRefused) {
  for (const Keys& keys : {Keys{}, Keys{{"InstanceId", "192@f1"}}, Keys{{"Name", "192@f1"}}}) {
    EXPECT_EQ(thrownBy<FrameworkException>([&] { this->computerOf(keys); }),
              "Could not find 'InstanceId' key in Moniker");
  }
}

TYPED_TEST(FirmwareResolver, NoTestOfTheCursorPrecedesTheSensorType) {
  const std::vector<std::string> calls = this->callsOf([&] { this->computerOf(TypeParam::id); });
  ASSERT_GE(calls.size(), 6U);
  const std::string path = std::string("/") + TypeParam::nodeText;
  EXPECT_EQ(calls[1], "selectNode(\"" + path + "\")");
  EXPECT_EQ(calls[2], "getSensorType");
  EXPECT_EQ(calls[3], "getNodeDescription");
  EXPECT_THAT(calls[4], testing::StartsWith("convertStringToPath"));
  EXPECT_THAT(calls[5], testing::StartsWith("selectNode"));
  EXPECT_EQ(calls[6], "operator bool") << "before the climb it is tested";
}

TYPED_TEST(FirmwareResolver, TheParentNumberIsWrittenBackInLowerCaseHexadecimal) {
  this->computerOf(std::string("224@") + TypeParam::nodeText);
  EXPECT_THAT(this->world.calls, Contains("convertStringToPath(\"e0\")"));
}

// ---- What it says of itself.

TYPED_TEST(FirmwareResolver, TracesItsLifeAsMethods) {
  this->world.log.clear();
  { const typename TypeParam::Resolver other; }
  const std::string name = TypeParam::name;
  EXPECT_THAT(logTexts(this->world, 4000),
              ElementsAre("METHOD: " + name + "() was invoked in" + this->file + " [Line: N]",
                          "METHOD: ~" + name + "() was invoked in" + this->file + " [Line: N]"));
  EXPECT_EQ(this->world.log.front().category, "Corvane.SoftwareInventoryProvider");
}

TYPED_TEST(FirmwareResolver, TracesWhatItWasGivenAndWhatItFound) {
  const std::string place = "() in" + this->file + " [Line: N],Parameters List: ";
  const std::string at = " at line N in" + this->file;
  this->world.log.clear();
  this->firmwareOf("alpha");
  std::vector<std::string> texts = logTexts(this->world, 4000);
  EXPECT_EQ(texts.front(),
            "ENTERING: " + std::string(TypeParam::operation) + place + " monikerComputer=Name=alpha");
  EXPECT_EQ(texts.back(),
            "EXITING: " + std::string(TypeParam::operation) + place + " monikerComputer=Name=alpha");
  EXPECT_THAT(texts, Contains("VARIABLE: 'InstanceID' has Value '" + std::string(TypeParam::id) + "'" + at));
  EXPECT_EQ(texts, logTexts(this->world, 4000, true));
  this->world.log.clear();
  this->computerOf(TypeParam::id);
  texts = logTexts(this->world, 4000);
  const std::string list = place + TypeParam::identityParameter + "InstanceID=" + TypeParam::id;
  EXPECT_EQ(texts.front(), "ENTERING: getComputerMoniker" + list);
  EXPECT_EQ(texts.back(), "EXITING: getComputerMoniker" + list);
  EXPECT_THAT(texts, Contains("VARIABLE: 'valueField' has Value 'alpha'" + at));
  EXPECT_EQ(texts, logTexts(this->world, 4000, true));
}

TYPED_TEST(FirmwareResolver, ExceptionsOfOtherTypesPass) {
  for (const bool back : {false, true}) {
    this->world.forget();
    this->world.failAt = 1;
    this->world.fault = standin::Fault::ThrowOther;
    EXPECT_EQ(thrownBy<std::runtime_error>(
                  [&] { back ? this->computerOf(TypeParam::id) : this->firmwareOf("alpha"); }),
              "another failure");
  }
}

}  // namespace
