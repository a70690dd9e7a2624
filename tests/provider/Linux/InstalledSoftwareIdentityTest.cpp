// Which software a computer has, and which computer software is installed on, against the recording stand-in.
#include <Linux/InstalledSoftwareIdentity.h>
#include <Oru/Exceptions.h>
#include <gmock/gmock.h>

#include "../AssociationWorld.h"

namespace {

using namespace associations;  // NOLINT(google-build-using-namespace): the tests' own vocabulary
using Oru::FrameworkException;
using Oru::InstrumentationException;
using Oru::Moniker;
using Oru::SoftwareInventoryProfileProvider::InstalledSoftwareIdentity;
using testing::ElementsAre;
using testing::IsEmpty;
using testing::StartsWith;

class InstalledResolver : public MachineTest {
 protected:
  std::string softwareOf(const Keys& keys) {
    Moniker given = moniker(keys);
    return textOf(resolver.getSoftwareIdentityMoniker(given));
  }
  std::string softwareOf(const std::string& name) { return softwareOf(Keys{{"Name", name}}); }
  std::string systemOf(const Keys& keys) {
    Moniker given = moniker(keys);
    return textOf(resolver.getSystemMoniker(given));
  }
  std::string systemOf(const std::string& instanceId) { return systemOf(Keys{{"InstanceID", instanceId}}); }

  InstalledSoftwareIdentity resolver;
};

// ---- From a computer to its software.

TEST_F(InstalledResolver, ANameInLowerCaseIsNoNameKey) {
  EXPECT_EQ(thrownBy<FrameworkException>([&] {
              softwareOf(Keys{{"name", "alpha"}});
            }),
            "Could not find 'Name' component in Moniker");
}

TEST_F(InstalledResolver, AMonikerWithoutKeysHasNoName) {
  EXPECT_EQ(thrownBy<FrameworkException>([&] { softwareOf(Keys{}); }),
            "Could not find 'Name' component in Moniker");
}

TEST_F(InstalledResolver, OfTwoNameKeysTheFirstCounts) {
  EXPECT_EQ(softwareOf(Keys{{"Name", "beta"}, {"Name", "alpha"}}), "InstanceID=193");
}

TEST_F(InstalledResolver, TheNameKeyIsFoundBehindOthers) {
  EXPECT_EQ(softwareOf(Keys{{"CreationClassName", "KELVO_ComputerSystem"}, {"Name", "beta"}}),
            "InstanceID=193");
}

TEST_F(InstalledResolver, TheWalkPassesOtherComputersToTheNamedOne) {
  EXPECT_EQ(softwareOf("alpha"), "InstanceID=192");
  EXPECT_EQ(softwareOf("beta"), "InstanceID=193");
}

TEST_F(InstalledResolver, ANameOfNoComputerEndsAfterTheLast) {
  EXPECT_EQ(thrownBy<InstrumentationException>([&] { softwareOf("gamma"); }),
            "Concerned Computer Could Not Be Found.");
  EXPECT_EQ(countOf(world.calls, "operator++"), 2U);
}

TEST_F(InstalledResolver, NamesAreComparedByLengthAndBytes) {
  for (const char* name : {"Alpha", "alph", "alphabet", ""}) {
    EXPECT_THROW(softwareOf(name), InstrumentationException) << name;
  }
}

TEST_F(InstalledResolver, AnUnnamedComputerCountsAsTheMatch) {
  node("c0").texts.clear();
  EXPECT_EQ(softwareOf("beta"), "InstanceID=192") << "even for the name of a later computer";
  EXPECT_EQ(softwareOf("gamma"), "InstanceID=192");
}

TEST_F(InstalledResolver, AnUnnamedComputerIsReachedOnlyIfNoneBeforeItMatches) {
  node("c1").texts.clear();
  EXPECT_EQ(softwareOf("alpha"), "InstanceID=192");
  EXPECT_EQ(softwareOf("gamma"), "InstanceID=193");
}

TEST_F(InstalledResolver, TheNodeNumberIsThePathTextReadAsHexadecimal) {
  world.nodes = {{40, "1a", "", "1a", "Computer System", {{108, "alpha"}}, {}}};
  EXPECT_EQ(softwareOf("alpha"), "InstanceID=26");
  world.nodes = {{40, "zz", "", "zz", "Computer System", {{108, "alpha"}}, {}}};
  EXPECT_EQ(softwareOf("alpha"), "InstanceID=0");
  world.nodes = {{40, "1azz", "", "1azz", "Computer System", {{108, "alpha"}}, {}}};
  EXPECT_EQ(softwareOf("alpha"), "InstanceID=26") << "reading stops at the first other character";
}

TEST_F(InstalledResolver, NoTestOfTheCursorPrecedesTheFirstName) {
  EXPECT_THAT(callsOf([&] { softwareOf("beta"); }),
              ElementsAre("selectNode(40)", "getProperty(108,string)",               //
                          "operator++", "operator bool", "getProperty(108,string)",  //
                          "getPathToNode", "convertPathToString(\"/c1\")"));
}

TEST_F(InstalledResolver, WithoutAnyComputerTheCursorOnNoNodeCountsAsTheMatch) {
  std::erase_if(world.nodes, [](const standin::Node& candidate) { return candidate.type == 40; });
  EXPECT_EQ(thrownBy<InstrumentationException>([&] { softwareOf("alpha"); }), "no node of that type")
      << "what the framework throws passes";
  world.missingTypeThrows = false;
  EXPECT_EQ(softwareOf("alpha"), "InstanceID=0");
}

// ---- From software to its computer.

TEST_F(InstalledResolver, AnIdentityWithoutInstanceIdIsRefused) {
  for (const Keys& keys : {Keys{}, Keys{{"InstanceId", "192@f1"}}, Keys{{"Name", "192@f1"}}}) {
    EXPECT_EQ(thrownBy<FrameworkException>([&] { systemOf(keys); }),
              "Could not find 'InstanceId' component in Moniker");
  }
}

TEST_F(InstalledResolver, AnInstanceIdResolvesThroughItsPathTextAlone) {
  node("d1").text = "xyz";
  EXPECT_EQ(systemOf("26@xyz"), "Name=alpha");
  EXPECT_THAT(world.calls, testing::Contains("selectNode(\"/xyz\")"));
  EXPECT_EQ(systemOf("999@xyz"), "Name=alpha") << "the number is read and dropped";
}

TEST_F(InstalledResolver, BlanksAroundTheSeparatorAreSkipped) {
  node("d1").text = "xyz";
  EXPECT_EQ(systemOf("26 @ xyz"), "Name=alpha");
}

TEST_F(InstalledResolver, AnySeparatorIsTaken) {
  EXPECT_EQ(systemOf("193#d2"), "Name=beta");
}

TEST_F(InstalledResolver, SoftwareLevelsBelowItsComputerResolvesToIt) {
  EXPECT_EQ(systemOf(bios), "Name=alpha");
  EXPECT_EQ(systemOf(bmc), "Name=alpha") << "two levels";
  node("e0").parent = "1b";
  EXPECT_EQ(systemOf(bmc), "Name=alpha") << "three";
  EXPECT_EQ(systemOf(betaDriver), "Name=beta");
}

TEST_F(InstalledResolver, ANodeThatIsItselfAComputerResolvesToItself) {
  node("d2").sensorType = 40;
  node("d2").texts = {{108, "itself"}};
  EXPECT_EQ(systemOf("193@d2"), "Name=itself");
}

TEST_F(InstalledResolver, TheSensorTypeDecidesWhatIsAComputer) {
  node("c0").sensorType = 41;
  node("c0").parent = "c1";
  EXPECT_EQ(systemOf(bios), "Name=beta");
}

TEST_F(InstalledResolver, APathThatNamesNoNodeIsRefused) {
  for (const char* id : {"192@nothing", "192@", "192", ""}) {
    EXPECT_EQ(thrownBy<InstrumentationException>([&] { systemOf(id); }),
              "Instrumentation node not available.")
        << id;
  }
}

TEST_F(InstalledResolver, AComputerWithoutANameIsRefused) {
  node("c0").texts.clear();
  EXPECT_EQ(thrownBy<InstrumentationException>([&] { systemOf(bios); }),
            "Name Property on computer not available.");
}

TEST_F(InstalledResolver, AClimbThatMeetsNoComputerEndsAtTheRoot) {
  node("c0").sensorType = 41;
  EXPECT_EQ(thrownBy<InstrumentationException>([&] { systemOf(bmc); }),
            "Instrumentation node not available.");
}

TEST_F(InstalledResolver, TheCursorIsTestedBeforeTheClimb) {
  std::vector<std::string> calls = callsOf([&] { systemOf(bios); });
  ASSERT_GE(calls.size(), 3U);
  EXPECT_THAT(std::vector<std::string>(calls.begin(), calls.begin() + 3),
              ElementsAre("convertStringToPath(\"f1\")", "selectNode(\"/f1\")", "operator bool"));
  std::erase(calls, "operator bool");
  EXPECT_THAT(calls, ElementsAre("convertStringToPath(\"f1\")", "selectNode(\"/f1\")", "getSensorType",
                                 "getPathToParentNode", "selectNode(\"/c0\")", "getSensorType",
                                 "getProperty(108,string)"));
}

TEST_F(InstalledResolver, ArgumentsKeepTheirKeys) {
  Moniker given = moniker({{"First", "1"}, {"Name", "alpha"}});
  resolver.getSoftwareIdentityMoniker(given);
  EXPECT_EQ(textOf(given), "First=1,Name=alpha");
}

// ---- What it says of itself.

TEST_F(InstalledResolver, TracesItsLifeAsMethods) {
  world.log.clear();
  { const InstalledSoftwareIdentity other; }
  EXPECT_THAT(
      logTexts(world, 4000),
      ElementsAre(
          "METHOD: InstalledSoftwareIdentity() was invoked in Linux/InstalledSoftwareIdentity.cpp [Line: N]",
          "METHOD: ~InstalledSoftwareIdentity() was invoked in Linux/InstalledSoftwareIdentity.cpp [Line: "
          "N]"));
  EXPECT_EQ(world.log.front().category, "Corvane.SoftwareInventoryProvider");
}

TEST_F(InstalledResolver, TracesWhatItWasGivenAndWhatItFound) {
  const std::string place = "() in Linux/InstalledSoftwareIdentity.cpp [Line: N],Parameters List: ";
  const std::string at = " at line N in Linux/InstalledSoftwareIdentity.cpp";
  world.log.clear();
  softwareOf("beta");
  std::vector<std::string> texts = logTexts(world, 4000);
  EXPECT_EQ(texts.front(), "ENTERING: getSoftwareIdentityMoniker" + place + " moniker=Name=beta");
  EXPECT_EQ(texts.back(), "EXITING: getSoftwareIdentityMoniker" + place + " moniker=Name=beta");
  EXPECT_THAT(texts, testing::IsSupersetOf({"VARIABLE: 'nameComputer' has Value 'beta'" + at,
                                            "VARIABLE: 'instanceId' has Value '193'" + at}));
  EXPECT_EQ(texts, logTexts(world, 4000, true));
  world.log.clear();
  systemOf(bios);
  texts = logTexts(world, 4000);
  EXPECT_EQ(texts.front(), "ENTERING: getSystemMoniker" + place + " identityMoniker=InstanceID=192@f1");
  EXPECT_EQ(texts.back(), "EXITING: getSystemMoniker" + place + " identityMoniker=InstanceID=192@f1");
  EXPECT_THAT(texts, testing::IsSupersetOf({"VARIABLE: 'instanceId' has Value '192@f1'" + at,
                                            "VARIABLE: 'nameComputer' has Value 'alpha'" + at}));
  EXPECT_EQ(texts, logTexts(world, 4000, true));
}

TEST_F(InstalledResolver, TracesNoExitAfterAnException) {
  world.log.clear();
  EXPECT_THROW(softwareOf("gamma"), InstrumentationException);
  EXPECT_THAT(logTexts(world, 4000), testing::Not(testing::Contains(StartsWith("EXITING"))));
  EXPECT_THAT(logTexts(world, 3000), IsEmpty()) << "who catches it, logs it";
}

}  // namespace
