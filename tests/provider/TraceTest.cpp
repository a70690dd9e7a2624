// The texts, helper by helper.
#include <Trace.h>
#include <gmock/gmock.h>

#include <thread>

#include "standin/StandIn.h"

namespace {

using namespace Oru::SoftwareInventoryProfileProvider;  // NOLINT(google-build-using-namespace)
using testing::StrEq;

TEST(Trace, TextsOfEachKind) {
  EXPECT_THAT(trace("f", "a.cpp", 7, ENTERING), StrEq("ENTERING: f() in a.cpp [Line: 7]"));
  EXPECT_THAT(trace("f", "a.cpp", 7, EXITING), StrEq("EXITING: f() in a.cpp [Line: 7]"));
  EXPECT_THAT(trace("f", "a.cpp", 7, METHOD), StrEq("METHOD: f() was invoked in a.cpp [Line: 7]"));
  EXPECT_THAT(trace("text", "a.cpp", 7, MESSAGE), StrEq("MESSAGE [File: a.cpp, Line: 7]: text"));
}

TEST(Trace, TextsOfEachKindWithParameters) {
  EXPECT_THAT(tracepara("f", "a.cpp", 7, " p=1", ENTERING),
              StrEq("ENTERING: f() in a.cpp [Line: 7],Parameters List:  p=1"));
  EXPECT_THAT(tracepara("f", "a.cpp", 7, " p=1", EXITING),
              StrEq("EXITING: f() in a.cpp [Line: 7],Parameters List:  p=1"));
  EXPECT_THAT(tracepara("f", "a.cpp", 7, " p=1", METHOD),
              StrEq("METHOD: f() was invoked in a.cpp [Line: 7],Parameters List:  p=1"));
  EXPECT_THAT(tracepara("text", "a.cpp", 7, " p=1", MESSAGE),
              StrEq("MESSAGE [File: a.cpp, Line: 7]: text,Parameters List:  p=1"));
}

TEST(Trace, AMessageTypeOutOfRangeFormatsAsEntering) {
  for (const int type : {4, 77, -1}) {
    EXPECT_THAT(trace("f", "a.cpp", 7, static_cast<MessageType>(type)),
                StrEq("ENTERING: f() in a.cpp [Line: 7]"));
    EXPECT_THAT(tracepara("f", "a.cpp", 7, "p", static_cast<MessageType>(type)),
                StrEq("ENTERING: f() in a.cpp [Line: 7],Parameters List: p"));
  }
}

TEST(Trace, VariablesOfBothKinds) {
  EXPECT_THAT(trace("name", "a.cpp", 7, std::string("value")),
              StrEq("VARIABLE: 'name' has Value 'value' at line 7 in a.cpp"));
  EXPECT_THAT(traceInteger("id", "a.cpp", 7, -5), StrEq("VARIABLE: 'id' has Value '-5' at line 7 in a.cpp"));
}

TEST(Trace, NullTextsPrintAsTheCLibraryPrintsThem) {
  const char* null = nullptr;
  const std::string expected = "(null)";
  EXPECT_THAT(trace("v", "a.cpp", 7, null),
              StrEq(std::string("VARIABLE: 'v' has Value '") + expected + "' at line 7 in a.cpp"));
  EXPECT_THAT(trace(null, null, 7, ENTERING), StrEq("ENTERING: (null)() in (null) [Line: 7]"));
  EXPECT_THAT(tracepara("f", "a.cpp", 7, null, METHOD),
              StrEq("METHOD: f() was invoked in a.cpp [Line: 7],Parameters List: (null)"));
}

TEST(Trace, AVariableEventTakesANullText) {
  standin::world().forget();
  const std::string logger(traceCategory);
  traceVariable(logger, "resultClass", static_cast<const char*>(nullptr));
  ASSERT_EQ(standin::world().log.size(), 2U);
  EXPECT_THAT(standin::world().log[0].text,
              testing::StartsWith("VARIABLE: 'resultClass' has Value '(null)' at line "));
  EXPECT_EQ(standin::world().log[1].text, standin::world().log[0].text);
}

TEST(Trace, LongTextsAreCutAt511) {
  const std::string name(600, 'n');
  const std::string text = trace(name.c_str(), "a.cpp", 7, ENTERING);
  EXPECT_EQ(text.size(), 511U);
  EXPECT_EQ(text, ("ENTERING: " + name).substr(0, 511));
  EXPECT_THAT(trace("f", "a.cpp", 7, EXITING), StrEq("EXITING: f() in a.cpp [Line: 7]"))
      << "nothing of the longer text is left";
}

TEST(Trace, ATraceAndATraceparaAreAliveTogether) {
  const char* first = trace("f", "a.cpp", 7, ENTERING);
  const char* second = tracepara("g", "b.cpp", 8, "p", EXITING);
  EXPECT_THAT(first, StrEq("ENTERING: f() in a.cpp [Line: 7]"));
  EXPECT_THAT(second, StrEq("EXITING: g() in b.cpp [Line: 8],Parameters List: p"));
}

TEST(Trace, BuffersAreStatic) {
  EXPECT_EQ(trace("f", "a", 1, ENTERING), trace("g", "b", 2, METHOD));
}

TEST(Trace, EachThreadHasBuffersOfItsOwn) {
  const char* mine = trace("f", "a.cpp", 7, ENTERING);
  std::thread([&] { EXPECT_NE(trace("g", "b.cpp", 8, ENTERING), mine); }).join();
  EXPECT_THAT(mine, StrEq("ENTERING: f() in a.cpp [Line: 7]"));
}

TEST(Trace, TheSeparatorHas78Characters) {
  EXPECT_EQ(std::string(traceSeparator), std::string(78, '='));
}

TEST(Trace, AMonikerPrintsAsItsPairs) {
  Oru::Moniker moniker;
  EXPECT_EQ(monikerText(moniker), "");
  moniker.addKey("Name", "host");
  moniker.addKey("DeviceID", "d");
  moniker.selectKey(0);
  EXPECT_EQ(monikerText(moniker), "Name=host,DeviceID=d");
  std::string name;
  EXPECT_TRUE(moniker.getName(name));
  EXPECT_EQ(name, "Name") << "the selection stays where it was";
}

}  // namespace
