// The computer system end against the recording stand-in: what it asks of the object manager, how often, and
// what it makes of the answers.
#include <CMPIComputerSystem.h>
#include <Oru/Exceptions.h>
#include <gmock/gmock.h>

#include "AssociationWorld.h"

namespace {

using namespace associations;  // NOLINT(google-build-using-namespace): the tests' own vocabulary
using Oru::ProviderException;
using Oru::SoftwareInventoryProfileProvider::CMPISIComputerSystem;
using testing::Contains;
using testing::ElementsAre;
using testing::IsEmpty;
using testing::Not;
using testing::StartsWith;

constexpr const char* noComputer = "Could not obtain an instance of Computer System";

class ComputerSystemEnd : public MachineTest {
 protected:
  ComputerSystemEnd() { serveComputers({"alpha", "beta", "gamma"}); }

  void serveComputers(const std::vector<std::string>& names) {
    serveInstances(world, "KELVO_ComputerSystem", "Name", names);
    answer().narrows = false;
  }

  standin::Served& answer() { return served("KELVO_ComputerSystem"); }

  std::vector<std::string> walkEnd() {
    return walk(end, [](CMPISIComputerSystem& at) { return at.getObjectPath(); });
  }

  CMPIContext context{};
  CMPISIComputerSystem end{&broker, &context, "KELVO_ComputerSystem"};
};

TEST_F(ComputerSystemEnd, WalkModeOverThreeInstancesYieldsThreeInOrder) {
  end.setObjectPath(path("KELVO_ComputerSystem"), false);
  EXPECT_THAT(walkEnd(), ElementsAre(computerText("alpha"), computerText("beta"), computerText("gamma")));
}

TEST_F(ComputerSystemEnd, IsTrueOnTheFirstCallWithoutAPrecedingStep) {
  end.setObjectPath(path("KELVO_ComputerSystem"), false);
  EXPECT_TRUE(static_cast<bool>(end));
  EXPECT_TRUE(static_cast<bool>(end)) << "and stays so: it stands on an instance";
}

TEST_F(ComputerSystemEnd, MatchModeWithANameInAnotherLetterCaseFindsNothing) {
  end.setObjectPath(computer("ALPHA"), true);
  EXPECT_FALSE(static_cast<bool>(end));
  EXPECT_EQ(end.getObjectPath(), nullptr);
  EXPECT_EQ(end.getCMPIInstance(nullptr), nullptr);
}

TEST_F(ComputerSystemEnd, MatchModeWithANameThatIsLongerOrShorterFindsNothing) {
  for (const char* name : {"alph", "alphabet", ""}) {
    CMPISIComputerSystem other(&broker, nullptr, "KELVO_ComputerSystem");
    other.setObjectPath(computer(name), true);
    EXPECT_FALSE(static_cast<bool>(other)) << name;
  }
}

TEST_F(ComputerSystemEnd, APropertyListHasNoEffectOnTheInstance) {
  answer().instances[0]->properties.emplace_back("Dedicated", "0");
  end.setObjectPath(path("KELVO_ComputerSystem"), false);
  const char* properties[] = {"Name", nullptr};
  CMPIInstance* const instance = end.getCMPIInstance(properties);
  EXPECT_EQ(instance, &answer().instances[0]->cmpi) << "the instance as it was delivered";
  EXPECT_EQ(propertyOf(instance, "Dedicated"), "0");
}

TEST_F(ComputerSystemEnd, AnEmptyClassThrowsInWalkModeAndIsAnEmptyCursorInMatchMode) {
  serveComputers({});
  EXPECT_EQ(thrownBy<ProviderException>([&] { end.setObjectPath(path("KELVO_ComputerSystem"), false); }),
            noComputer);
  EXPECT_FALSE(static_cast<bool>(end));
  CMPISIComputerSystem other(&broker, nullptr, "KELVO_ComputerSystem");
  other.setObjectPath(computer("alpha"), true);
  EXPECT_FALSE(static_cast<bool>(other));
}

TEST_F(ComputerSystemEnd, ARefusedEnumerationThrowsInBothModes) {
  answer().status = CMPI_RC_ERR_ACCESS_DENIED;
  for (const bool matchByName : {false, true}) {
    CMPISIComputerSystem other(&broker, nullptr, "KELVO_ComputerSystem");
    EXPECT_EQ(thrownBy<ProviderException>([&] { other.setObjectPath(computer("alpha"), matchByName); }),
              noComputer);
    EXPECT_EQ(other.getObjectPath(), nullptr);
  }
}

TEST_F(ComputerSystemEnd, AFirstElementThatCannotBeReadThrowsInWalkMode) {
  answer().failingElement = 1;
  EXPECT_EQ(thrownBy<ProviderException>([&] { end.setObjectPath(path("KELVO_ComputerSystem"), false); }),
            noComputer);
  EXPECT_EQ(end.getCMPIInstance(nullptr), nullptr);
}

TEST_F(ComputerSystemEnd, ANullEnumerationThatIsOkIsNoCrash) {
  answer().enumerationIsNull = true;
  EXPECT_EQ(thrownBy<ProviderException>([&] { end.setObjectPath(path("KELVO_ComputerSystem"), false); }),
            noComputer);
  CMPISIComputerSystem other(&broker, nullptr, "KELVO_ComputerSystem");
  try {
    other.setObjectPath(computer("alpha"), true);
  } catch (const ProviderException&) {
    // An answer that is none may count as a failed one.
  }
  EXPECT_FALSE(static_cast<bool>(other));
  EXPECT_EQ(other.getObjectPath(), nullptr);
}

TEST_F(ComputerSystemEnd, AnElementThatCannotBeReadEndsTheWalk) {
  answer().failingElement = 2;
  end.setObjectPath(path("KELVO_ComputerSystem"), false);
  EXPECT_TRUE(static_cast<bool>(end));
  ++end;
  EXPECT_FALSE(static_cast<bool>(end));
  EXPECT_EQ(end.getCMPIInstance(nullptr), nullptr);
}

TEST_F(ComputerSystemEnd, TheRequestGoesWithItsContextAndWithoutAPropertyList) {
  const CMPIObjectPath* const request = path("KELVO_ComputerSystem");
  end.setObjectPath(request, false);
  ASSERT_EQ(world.upcalls.size(), 1U);
  EXPECT_EQ(world.upcalls[0].broker, &broker);
  EXPECT_EQ(world.upcalls[0].context, &context);
  EXPECT_EQ(world.upcalls[0].path, request->hdl);
  EXPECT_EQ(world.upcalls[0].properties, nullptr);
}

TEST_F(ComputerSystemEnd, WalkModeAsksOnceWhetherThereIsAFirstAndThenNoMore) {
  EXPECT_THAT(callsOf([&] { end.setObjectPath(path("KELVO_ComputerSystem"), false); }),
              ElementsAre("enumerateInstances(KELVO_ComputerSystem)", "hasNext", "getNext"));
  EXPECT_THAT(callsOf([&] { EXPECT_TRUE(static_cast<bool>(end)); }), IsEmpty());
  EXPECT_THAT(callsOf([&] { ++end; }), ElementsAre("getNext"));
  EXPECT_THAT(callsOf([&] { EXPECT_TRUE(static_cast<bool>(end)); }), IsEmpty());
  EXPECT_THAT(callsOf([&] { EXPECT_EQ(textOf(end.getObjectPath()), computerText("beta")); }),
              ElementsAre("getObjectPath"));
  ++end;
  EXPECT_THAT(callsOf([&] { ++end; }), ElementsAre("getNext")) << "past the end it asks all the same";
  EXPECT_FALSE(static_cast<bool>(end));
}

TEST_F(ComputerSystemEnd, TheFirstOneThatWasNotAskedAboutIsStillTrueAfterAStep) {
  serveComputers({"alpha"});
  end.setObjectPath(path("KELVO_ComputerSystem"), false);
  ++end;
  EXPECT_TRUE(static_cast<bool>(end)) << "the first instance counts as pending until it is asked about";
  EXPECT_EQ(end.getObjectPath(), nullptr);
  EXPECT_FALSE(static_cast<bool>(end));
}

TEST_F(ComputerSystemEnd, AnyHasNextThatIsNotZeroIsAFirstElement) {
  answer().hasNextAnswers = {2};
  end.setObjectPath(path("KELVO_ComputerSystem"), false);
  EXPECT_TRUE(static_cast<bool>(end));
}

TEST_F(ComputerSystemEnd, MatchModeYieldsTheMatchOnce) {
  end.setObjectPath(computer("beta"), true);
  EXPECT_THAT(walkEnd(), ElementsAre(computerText("beta")));
}

TEST_F(ComputerSystemEnd, MatchModeDrainsTheEnumerationAndReadsNoNameAfterTheMatch) {
  const std::vector<std::string> calls = callsOf([&] { end.setObjectPath(computer("beta"), true); });
  EXPECT_THAT(calls, ElementsAre(StartsWith("enumerateInstances"), "getKeyProperty(Name)",  //
                                 "hasNext", "getNext", "getProperty(Name,false)",           //
                                 "hasNext", "getNext", "getProperty(Name,false)",           //
                                 "hasNext", "getNext",                                      //
                                 "hasNext"));
}

TEST_F(ComputerSystemEnd, MatchModeTakesTheFirstOfTwoWithTheSameName) {
  serveComputers({"alpha", "beta", "beta"});
  end.setObjectPath(computer("beta"), true);
  EXPECT_EQ(end.getCMPIInstance(nullptr), &answer().instances[1]->cmpi);
}

TEST_F(ComputerSystemEnd, MatchModePassesOverElementsThatCannotBeRead) {
  serveComputers({"beta", "beta", "alpha"});
  answer().failingElement = 1;
  end.setObjectPath(computer("beta"), true);
  EXPECT_EQ(end.getCMPIInstance(nullptr), &answer().instances[1]->cmpi);
  EXPECT_THAT(walkEnd(), ElementsAre(computerText("beta")));
}

TEST_F(ComputerSystemEnd, MatchModeAsksNothingMoreToSayThatItStandsOnTheMatch) {
  end.setObjectPath(computer("alpha"), true);
  EXPECT_THAT(callsOf([&] { EXPECT_TRUE(static_cast<bool>(end)); }), IsEmpty());
  EXPECT_THAT(callsOf([&] { ++end; }), ElementsAre("getNext"));
  EXPECT_FALSE(static_cast<bool>(end));
}

TEST_F(ComputerSystemEnd, BeforeAnyPathItIsEmptyAndAsksNothing) {
  EXPECT_THAT(callsOf([&] {
                EXPECT_FALSE(static_cast<bool>(end));
                ++end;
                EXPECT_EQ(end.getObjectPath(), nullptr);
                EXPECT_EQ(end.getCMPIInstance(nullptr), nullptr);
              }),
              IsEmpty());
}

TEST_F(ComputerSystemEnd, AnInstanceWithoutAHandleIsNoInstance) {
  answer().instances[1]->cmpi.hdl = nullptr;
  end.setObjectPath(path("KELVO_ComputerSystem"), false);
  EXPECT_TRUE(static_cast<bool>(end));
  ++end;
  EXPECT_FALSE(static_cast<bool>(end));
}

TEST_F(ComputerSystemEnd, APathWithABadStatusIsNull) {
  end.setObjectPath(path("KELVO_ComputerSystem"), false);
  world.forget();
  world.failAt = 1;
  EXPECT_EQ(end.getObjectPath(), nullptr);
  EXPECT_EQ(world.faultCall, "getObjectPath");
}

TEST_F(ComputerSystemEnd, TracesSetObjectPathAndGetCmpiInstanceAtTheErrorLevelWithTheirParameters) {
  const CMPIObjectPath* const request = path("KELVO_ComputerSystem");
  world.log.clear();
  end.setObjectPath(request, false);
  const char* properties[] = {"Name", nullptr};
  end.getCMPIInstance(properties);
  std::ostringstream list;
  std::ostringstream instanceList;
  list << " in CMPIComputerSystem.cpp [Line: N],Parameters List:  objectPath=" << request;
  instanceList << " in CMPIComputerSystem.cpp [Line: N],Parameters List:  properties="
               << static_cast<const void*>(properties);
  const std::vector<std::string> expected = {
      "ENTERING: setObjectPath()" + list.str(), "EXITING: setObjectPath()" + list.str(),
      "ENTERING: getCMPIInstance()" + instanceList.str(), "EXITING: getCMPIInstance()" + instanceList.str()};
  EXPECT_EQ(logTexts(world, 3000), expected);
  EXPECT_EQ(logTexts(world, 3000, true), expected);
}

TEST_F(ComputerSystemEnd, TracesAnExceptionsEntryWithoutItsExit) {
  answer().status = CMPI_RC_ERR_FAILED;
  world.log.clear();
  EXPECT_THROW(end.setObjectPath(path("KELVO_ComputerSystem"), false), ProviderException);
  EXPECT_THAT(logTexts(world, 3000), ElementsAre(StartsWith("ENTERING: setObjectPath()")));
}

TEST_F(ComputerSystemEnd, TracesItsLifeAsMethods) {
  world.log.clear();
  { const CMPISIComputerSystem other(&broker, nullptr, "KELVO_ComputerSystem"); }
  EXPECT_THAT(
      logTexts(world, 4000),
      ElementsAre("METHOD: CMPISIComputerSystem() was invoked in CMPIComputerSystem.cpp [Line: N]",
                  StartsWith("METHOD: ~CMPISIComputerSystem() was invoked in CMPIComputerSystem.cpp")));
  for (const standin::LogLine& line : world.log) {
    EXPECT_EQ(line.file, "CMPIComputerSystem.cpp");
    EXPECT_EQ(line.category, "Corvane.SoftwareInventoryProvider");
  }
}

TEST_F(ComputerSystemEnd, TracesWhetherItIsValidAndWhetherItIsInsideTheEnumeration) {
  const std::string inside =
      "VARIABLE: '\"Inside enumeration\"' has Value 'Inside enumeration' at line N in CMPIComputerSystem.cpp";
  const std::string yes = "VARIABLE: 'valid' has Value '1' at line N in CMPIComputerSystem.cpp";
  const std::string no = "VARIABLE: 'valid' has Value '0' at line N in CMPIComputerSystem.cpp";
  end.setObjectPath(path("KELVO_ComputerSystem"), false);
  world.log.clear();
  EXPECT_TRUE(static_cast<bool>(end));
  EXPECT_THAT(logTexts(world, 4000), Contains(yes));
  EXPECT_THAT(logTexts(world, 4000), Not(Contains(inside))) << "the first is pending";
  world.log.clear();
  EXPECT_TRUE(static_cast<bool>(end));
  EXPECT_THAT(logTexts(world, 4000), testing::IsSupersetOf({inside, yes}));
  ++end;
  ++end;
  ++end;
  world.log.clear();
  EXPECT_FALSE(static_cast<bool>(end));
  EXPECT_THAT(logTexts(world, 4000), Contains(no));
  EXPECT_THAT(logTexts(world, 4000), Not(Contains(inside)));
}

TEST_F(ComputerSystemEnd, TracesTheNameThatItMatches) {
  world.log.clear();
  end.setObjectPath(computer("beta"), true);
  EXPECT_THAT(logTexts(world, 4000),
              Contains("VARIABLE: 'key' has Value 'beta' at line N in CMPIComputerSystem.cpp"));
  EXPECT_EQ(logTexts(world, 4000), logTexts(world, 4000, true));
}

}  // namespace
