// list, names and get, as a process over inventories of known content.
#include "Process.h"

#include <cli/Text.h>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>

#include <rapidjson/document.h>

namespace {

using cli_test::linesOf;
using cli_test::Result;
using cli_test::run;
using cli_test::runOnTerminal;
using cli_test::swinv;
using cli_test::testFile;
using testing::AllOf;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::Not;
using testing::SizeIs;
using testing::StartsWith;

const std::string small = testFile("tests/cli/small.json");
const std::string server = testFile("examples/server.json");
const std::string noSoftware = testFile("tests/cli/no-software.json");

void expectDone(const Result& result) {
  EXPECT_EQ(result.exitCode, 0);
  EXPECT_EQ(result.standardError, "");
}

TEST(ListCommand, TableHasALineForEachElement) {
  const Result result =
      swinv({"list", "--inventory", small, "--property", "InstanceID,VersionString,ReleaseDate"});
  expectDone(result);
  EXPECT_EQ(result.standardOutput,
            "InstanceID  VersionString  ReleaseDate\n"
            "1@2a        2.4.1          2010-12-31\n"
            "26@abc\n"
            "1@d         5.1\n");
}

TEST(ListCommand, TableShowsTheTellingProperties) {
  const Result result = swinv({"list", "--inventory", small});
  expectDone(result);
  const auto lines = linesOf(result.standardOutput);
  ASSERT_THAT(lines, SizeIs(4));
  EXPECT_THAT(lines[0], StartsWith("InstanceID  Description"));
  EXPECT_THAT(lines[0], HasSubstr("VersionString  Manufacturer  ReleaseDate  Classifications"));
  EXPECT_THAT(lines[1], AllOf(HasSubstr("Möbius, Inc."), HasSubstr("2010-12-31"), HasSubstr("BIOS/FCode")));
  EXPECT_THAT(lines[2], AllOf(HasSubstr("wide"), HasSubstr("Firmware")));
  EXPECT_THAT(lines[3], AllOf(HasSubstr("velmor25 driver"), HasSubstr("Driver")));
}

TEST(ListCommand, TableFitsTheTerminal) {
  for (const unsigned short width : std::initializer_list<unsigned short>{30, 60, 80, 132}) {
    const Result result = runOnTerminal({{"list", "--inventory", server}}, width);
    expectDone(result);
    EXPECT_GE(linesOf(result.standardOutput).size(), 10U);
    for (const std::string& line : linesOf(result.standardOutput)) {
      EXPECT_LE(cli::displayWidth(line.substr(0, line.find('\r'))), width) << line;
    }
  }
}

TEST(ListCommand, TableFollowsColumnsWithoutATerminal) {
  const Result result = run({{"list", "--inventory", small}, {{"COLUMNS", "70"}}});
  expectDone(result);
  EXPECT_THAT(result.standardOutput, HasSubstr("…"));
  for (const std::string& line : linesOf(result.standardOutput)) {
    EXPECT_LE(cli::displayWidth(line), 70U) << line;
  }
  EXPECT_THAT(swinv({"list", "--inventory", small}).standardOutput, Not(HasSubstr("…")));
}

TEST(ListCommand, ATerminalOfAnotherLocaleGetsAscii) {
  const Result result = runOnTerminal({{"list", "--inventory", small}, {{"LC_ALL", "C"}}}, 100);
  EXPECT_TRUE(std::all_of(result.standardOutput.begin(), result.standardOutput.end(),
                          [](char c) { return static_cast<unsigned char>(c) < 0x80; }));
  EXPECT_THAT(result.standardOutput, HasSubstr("M?bius"));
}

TEST(ListCommand, JsonIsOneListInTheOrderOfTheMof) {
  const Result result = swinv({"list", "--inventory", small, "--format", "json"});
  expectDone(result);
  EXPECT_EQ(result.standardOutput, R"([
  {
    "InstanceID": "1@2a",
    "Description": "BIOS",
    "InstallDate": "20101231000000.000000+000",
    "MajorVersion": 2,
    "MinorVersion": 4,
    "VersionString": "2.4.1",
    "Manufacturer": "Möbius, Inc.",
    "Classifications": [11],
    "ClassificationDescriptions": ["BIOS/FCode"],
    "ReleaseDate": "20101231000000.000000+000",
    "BuildID": "B7"
  },
  {
    "InstanceID": "26@abc",
    "Description": "Boot code with a description that is longer than any terminal of these tests is wide",
    "Name": "Boot \"code\"",
    "Classifications": [10],
    "ClassificationDescriptions": ["Firmware"]
  },
  {
    "InstanceID": "1@d",
    "Description": "velmor25 driver",
    "VersionString": "5.1",
    "Classifications": [2],
    "ClassificationDescriptions": ["Driver"]
  }
]
)");
}

TEST(ListCommand, JsonKeepsTheOrderOfTheMofWhateverIsAskedFor) {
  const Result result = swinv({"list", "--inventory", small, "--format", "json", "--property",
                               "versionstring", "--property", "InstanceID"});
  expectDone(result);
  rapidjson::Document document;
  document.Parse(result.standardOutput.c_str());
  ASSERT_TRUE(document.IsArray());
  ASSERT_EQ(document.Size(), 3U);
  ASSERT_EQ(document[0].MemberCount(), 2U);
  EXPECT_STREQ(document[0].MemberBegin()->name.GetString(), "InstanceID");
  EXPECT_STREQ(document[0].MemberBegin()[1].name.GetString(), "VersionString");
  EXPECT_EQ(document[1].MemberCount(), 1U);
}

TEST(ListCommand, CsvHasTheColumnsThatWereAskedFor) {
  const Result result = swinv({"list", "--inventory", small, "--format", "csv", "--property",
                               "Manufacturer,InstanceID,Name,ReleaseDate,Classifications"});
  expectDone(result);
  EXPECT_EQ(result.standardOutput,
            "Manufacturer,InstanceID,Name,ReleaseDate,Classifications\r\n"
            "\"Möbius, Inc.\",1@2a,,20101231000000.000000+000,11\r\n"
            ",26@abc,\"Boot \"\"code\"\"\",,10\r\n"
            ",1@d,,,2\r\n");
}

TEST(ListCommand, CsvColumnsAreTheSameOnEveryMachine) {
  const auto header = [](const std::string& inventory) {
    const Result result = swinv({"list", "--inventory", inventory, "--format", "csv"});
    return result.standardOutput.substr(0, result.standardOutput.find('\r'));
  };
  EXPECT_EQ(header(small), header(server));
  EXPECT_EQ(header(small), header(noSoftware));
  EXPECT_THAT(header(small), AllOf(StartsWith("InstanceID,"), HasSubstr(",BuildID")));
}

TEST(ListCommand, ASuperclassListsItsSubclasses) {
  const Result result =
      swinv({"list", "CIM_SoftwareIdentity", "--inventory", small, "--property", "InstanceID"});
  expectDone(result);
  EXPECT_EQ(result.standardOutput, "InstanceID\n1@2a\n26@abc\n1@d\n");
}

TEST(ListCommand, ClassNamesIgnoreCase) {
  EXPECT_EQ(swinv({"list", "kelvo_softwareidentity", "--inventory", small}).standardOutput,
            swinv({"list", "--inventory", small}).standardOutput);
}

TEST(ListCommand, ThePlaceOfTheMachineComesFromTheEnvironmentWhereNoOptionNamesOne) {
  const std::string expected = swinv({"list", "--inventory", small}).standardOutput;
  EXPECT_EQ(run({{"list"}, {{"ORU_INVENTORY", small}}}).standardOutput, expected);
  EXPECT_EQ(run({{"list", "--inventory", small}, {{"ORU_INVENTORY", server}}}).standardOutput, expected);
  EXPECT_EQ(run({{"list", "--inventory", small}, {{"ORU_SYSTEM_ROOT", "/nowhere"}}}).standardOutput,
            expected);
}

TEST(ListCommand, AProviderThatStopsEarlyIsToldOfInOneLine) {
  const Result result = swinv({"list", "--inventory", noSoftware});
  EXPECT_EQ(result.exitCode, 0);
  EXPECT_EQ(result.standardOutput, "");
  EXPECT_THAT(linesOf(result.standardError),
              ElementsAre(AllOf(HasSubstr("stopped early"), HasSubstr("--log-level error"))));
  EXPECT_EQ(swinv({"list", "--inventory", noSoftware, "--format", "json"}).standardOutput, "[]\n");
}

TEST(ListCommand, TheLogSaysWhyTheProviderStopped) {
  const Result result = swinv({"list", "--inventory", noSoftware, "--log-level", "error"});
  EXPECT_EQ(result.exitCode, 0);
  EXPECT_THAT(result.standardError, HasSubstr("Could Not Find Any of the Software Identity Nodes"));
}

TEST(ListCommand, NothingIsLoggedUnlessAskedFor) {
  expectDone(run({{"list", "--inventory", small}, {{"ORU_LOG", "stderr"}, {"ORU_LOG_LEVEL", "trace"}}}));
  expectDone(swinv({"list", "--inventory", small, "--log-level", "off"}));
  const Result traced = swinv({"list", "--inventory", small, "--log-level", "trace"});
  EXPECT_THAT(traced.standardError, HasSubstr("ENTERING: SoftwareInventory_EnumInstances()"));
  EXPECT_EQ(traced.standardOutput, swinv({"list", "--inventory", small}).standardOutput);
}

TEST(ListCommand, TheLiveMachineAnswers) {
  const Result result = swinv({"list", "--format", "json"});
  EXPECT_EQ(result.exitCode, 0);
  rapidjson::Document document;
  document.Parse(result.standardOutput.c_str());
  ASSERT_TRUE(document.IsArray());
  if (document.Empty()) {
    EXPECT_THAT(linesOf(result.standardError), ElementsAre(HasSubstr("stopped early")));
  } else {
    EXPECT_EQ(result.standardError, "");
    for (const auto& object : document.GetArray()) {
      EXPECT_TRUE(object.IsObject() && object.HasMember("InstanceID") && object.HasMember("Description"));
    }
  }
}

TEST(NamesCommand, OnePathALine) {
  const Result result = swinv({"names", "--inventory", small});
  expectDone(result);
  const auto lines = linesOf(result.standardOutput);
  ASSERT_THAT(lines, SizeIs(3));
  EXPECT_THAT(lines[0], testing::EndsWith("root/cimv2:KELVO_SoftwareIdentity.InstanceID=\"1@2a\""));
  EXPECT_THAT(lines[1], testing::EndsWith("InstanceID=\"26@abc\""));
  EXPECT_THAT(lines[2], testing::EndsWith("InstanceID=\"1@d\""));
}

TEST(NamesCommand, EachPathGetsItsInstance) {
  const Result names = swinv({"names", "--inventory", server});
  const Result list = swinv({"list", "--inventory", server, "--property", "InstanceID"});
  const auto ids = linesOf(list.standardOutput);
  const auto paths = linesOf(names.standardOutput);
  ASSERT_EQ(ids.size(), paths.size() + 1);
  for (std::size_t i = 0; i < paths.size(); ++i) {
    const Result got = swinv({"get", paths[i], "--inventory", server, "--property", "InstanceID"});
    expectDone(got);
    EXPECT_EQ(got.standardOutput, "InstanceID  " + ids[i + 1] + "\n");
  }
}

TEST(NamesCommand, JsonHasPathAndKeys) {
  const Result result = swinv({"names", "--inventory", small, "--format", "json"});
  expectDone(result);
  rapidjson::Document document;
  document.Parse(result.standardOutput.c_str());
  ASSERT_TRUE(document.IsArray());
  ASSERT_EQ(document.Size(), 3U);
  EXPECT_THAT(document[1]["@path"].GetString(), HasSubstr("InstanceID=\"26@abc\""));
  EXPECT_STREQ(document[1]["InstanceID"].GetString(), "26@abc");
}

TEST(GetCommand, ShowsEveryPropertyThatHasAValue) {
  const Result result = swinv({"get", "1@2a", "--inventory", small});
  expectDone(result);
  EXPECT_EQ(result.standardOutput,
            "InstanceID                  1@2a\n"
            "Description                 BIOS\n"
            "InstallDate                 2010-12-31\n"
            "MajorVersion                2\n"
            "MinorVersion                4\n"
            "VersionString               2.4.1\n"
            "Manufacturer                Möbius, Inc.\n"
            "Classifications             BIOS/FCode\n"
            "ClassificationDescriptions  BIOS/FCode\n"
            "ReleaseDate                 2010-12-31\n"
            "BuildID                     B7\n");
}

TEST(GetCommand, WrapsLongValuesOnATerminal) {
  const Result result = runOnTerminal({{"get", "26@abc", "--inventory", small}}, 60);
  expectDone(result);
  EXPECT_THAT(result.standardOutput, AllOf(HasSubstr("longer"), HasSubstr("wide"), Not(HasSubstr("…"))));
  for (const std::string& line : linesOf(result.standardOutput)) {
    EXPECT_LE(cli::displayWidth(line.substr(0, line.find('\r'))), 60U) << line;
  }
}

TEST(GetCommand, JsonIsAListOfOne) {
  const Result result =
      swinv({"get", "1@d", "--inventory", small, "--format", "json", "--property", "VersionString"});
  expectDone(result);
  EXPECT_THAT(result.standardOutput, AllOf(StartsWith("[\n"), HasSubstr("\"VersionString\": \"5.1\"")));
}

}  // namespace
