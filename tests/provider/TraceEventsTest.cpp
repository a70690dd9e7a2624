// What a request says of itself, on both channels.
#include <gmock/gmock.h>

#include "ProviderAccess.h"

namespace {

using testing::ElementsAre;
using testing::HasSubstr;
using testing::MatchesRegex;

using TraceEvents = ProviderTest;

const std::string separator(78, '=');

TEST_F(TraceEvents, TheBannerFramesAWorkingFunction) {
  enumInstances(path("Other"));
  EXPECT_THAT(texts(4000), ElementsAre(separator,
                                       MatchesRegex("ENTERING: SoftwareInventory_EnumInstances\\(\\) in "
                                                    "SoftwareInventoryProvider.cpp \\[Line: [0-9]+\\]"),
                                       MatchesRegex("VARIABLE: 'classId' has Value '255' at line [0-9]+ in "
                                                    "SoftwareInventoryProvider.cpp"),
                                       MatchesRegex("EXITING: SoftwareInventory_EnumInstances\\(\\) in "
                                                    "SoftwareInventoryProvider.cpp \\[Line: [0-9]+\\]"),
                                       separator));
  EXPECT_EQ(world.log.front().function, "markProviderEntry");
  EXPECT_EQ(world.log.front().file, "include/Trace.h");
  EXPECT_EQ(world.log.back().function, "markProviderExit");
  EXPECT_EQ(world.log[2].function, "SoftwareInventory_EnumInstances");
  EXPECT_EQ(world.log[2].file, "SoftwareInventoryProvider.cpp");
}

TEST_F(TraceEvents, EveryEventGoesToTheLogAndThenAlikeToTheTraceChannel) {
  getInstance(pathOf("192@d1"));
  ASSERT_FALSE(world.log.empty());
  ASSERT_EQ(world.log.size() % 2, 0U);
  for (std::size_t i = 0; i < world.log.size(); i += 2) {
    const standin::LogLine& log = world.log[i];
    const standin::LogLine& trace = world.log[i + 1];
    EXPECT_FALSE(log.trace);
    EXPECT_TRUE(trace.trace);
    EXPECT_EQ(log.text, trace.text);
    EXPECT_EQ(log.function, trace.function);
    EXPECT_EQ(log.file, trace.file);
    EXPECT_EQ(log.line, trace.line);
    EXPECT_EQ(log.level, 4000);
    EXPECT_EQ(trace.level, 4000);
    EXPECT_EQ(log.category, "Corvane.SoftwareInventoryProvider");
    EXPECT_EQ(trace.category, log.category);
    EXPECT_TRUE(log.reservedArgumentsEmpty && trace.reservedArgumentsEmpty);
  }
}

TEST_F(TraceEvents, FilesAreNamedRelativeToTheProvider) {
  enumInstances(path());
  for (const standin::LogLine& line : world.log) {
    EXPECT_THAT(line.file, testing::AnyOf("SoftwareInventoryProvider.cpp", "CMPISoftwareIdentity.cpp",
                                          "Linux/SoftwareIdentity.cpp", "include/Trace.h"));
  }
}

TEST_F(TraceEvents, EveryEntryHasItsExit) {
  enumInstances(path());
  std::vector<std::string> open;
  for (const std::string& text : texts(4000)) {
    const std::string function = text.substr(0, text.find("()"));
    if (text.rfind("ENTERING: ", 0) == 0) {
      open.push_back(function.substr(10));
    } else if (text.rfind("EXITING: ", 0) == 0) {
      ASSERT_FALSE(open.empty());
      EXPECT_EQ(open.back(), function.substr(9));
      open.pop_back();
    }
  }
  EXPECT_THAT(open, testing::IsEmpty());
}

TEST_F(TraceEvents, TheFilterSaysWhatItWasGiven) {
  enumInstanceNames(pathOf("26@f1"));
  EXPECT_THAT(texts(4000), testing::Contains(MatchesRegex(
                               "ENTERING: setFilter\\(\\) in Linux/SoftwareIdentity.cpp \\[Line: [0-9]+\\],"
                               "Parameters List:  filterType=0 reference=26@f1")));
  EXPECT_THAT(texts(4000),
              testing::Contains(MatchesRegex("MESSAGE \\[File: Linux/SoftwareIdentity.cpp, Line: "
                                             "[0-9]+\\]: Complete Path has been passed")));
  EXPECT_THAT(texts(4000),
              testing::Contains(MatchesRegex("VARIABLE: 'instanceID' has Value '26@f1' at line [0-9]+ "
                                             "in CMPISoftwareIdentity.cpp")));
}

TEST_F(TraceEvents, TheParentFilterSaysWhichKindItApplied) {
  enumInstanceNames(pathOf("26"));
  EXPECT_THAT(texts(4000), testing::Contains(HasSubstr("]: Parent Id has been passed.")));
  EXPECT_THAT(texts(4000), testing::Contains(HasSubstr("]: Applied Parent Path Filter")));
  world.forget();
  enumInstanceNames(pathOf("192"));
  EXPECT_THAT(texts(4000), testing::Contains(HasSubstr("]: Applied Computer Path Filter")));
}

TEST_F(TraceEvents, TheAdapterSaysItsPointers) {
  const CMPIObjectPath* request = path();
  enumInstanceNames(request);
  std::ostringstream expected;
  expected << " _broker=" << &broker << " _context=0 objectPath=" << request;
  EXPECT_THAT(texts(4000),
              testing::Contains(testing::AllOf(testing::StartsWith("ENTERING: CMPISoftwareIdentity()"),
                                               testing::EndsWith(expected.str()))));
}

TEST_F(TraceEvents, AFunctionLeftByAnExceptionHasNoExit) {
  world.nodes.clear();
  enumInstances(path());
  EXPECT_THAT(texts(4000), testing::Contains(testing::StartsWith("ENTERING: SoftwareIdentity()")));
  EXPECT_THAT(texts(4000),
              testing::Not(testing::Contains(testing::StartsWith("EXITING: SoftwareIdentity()"))));
}

TEST_F(TraceEvents, ALevelThatIsOffIsNotWritten) {
  world.logOn = false;
  enumInstances(path());
  EXPECT_THAT(texts(4000), testing::IsEmpty());
  EXPECT_FALSE(texts(4000, true).empty());
  world.forget();
  world.traceOn = false;
  world.nodes.clear();
  enumInstances(path());
  EXPECT_EQ(world.log.size(), 2U) << "errors stay on";
}

}  // namespace
