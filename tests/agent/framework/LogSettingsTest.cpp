// What the texts of the environment mean to the logger.
#include <agent/framework/LogSettings.h>
#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace {

using agent::LogSettings;
using agent::LogTarget;
using ::testing::AllOf;
using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::IsEmpty;
using Kind = LogTarget::Kind;

TEST(LogSettings, unsetAndEmptyAreTheDefaults) {
  for (const char* text : {static_cast<const char*>(nullptr), ""}) {
    const LogSettings settings = LogSettings::fromTexts(text, text, text);
    EXPECT_EQ(settings.log, (LogTarget{Kind::Syslog, ""}));
    EXPECT_EQ(settings.trace, (LogTarget{Kind::None, ""}));
    EXPECT_EQ(settings.level, 3000);
    EXPECT_THAT(settings.complaints, IsEmpty());
  }
}

TEST(LogSettings, destinations) {
  const LogSettings first = LogSettings::fromTexts("stderr", "syslog", nullptr);
  EXPECT_EQ(first.log, (LogTarget{Kind::StandardError, ""}));
  EXPECT_EQ(first.trace, (LogTarget{Kind::Syslog, ""}));
  const LogSettings second = LogSettings::fromTexts("syslog", "stderr", nullptr);
  EXPECT_EQ(second.log, (LogTarget{Kind::Syslog, ""}));
  EXPECT_EQ(second.trace, (LogTarget{Kind::StandardError, ""}));
  const LogSettings third = LogSettings::fromTexts("file:/var/log/a:b", "file:relative", nullptr);
  EXPECT_EQ(third.log, (LogTarget{Kind::File, "/var/log/a:b"}));
  EXPECT_EQ(third.trace, (LogTarget{Kind::File, "relative"}));
  EXPECT_EQ(LogSettings::fromTexts(nullptr, "none", nullptr).trace, (LogTarget{Kind::None, ""}));
  EXPECT_THAT(LogSettings::fromTexts("stderr", "none", "error").complaints, IsEmpty());
}

TEST(LogSettings, levels) {
  const auto level = [](const char* text) { return LogSettings::fromTexts(nullptr, nullptr, text).level; };
  EXPECT_EQ(level("off"), agent::levelOff);
  EXPECT_EQ(level("error"), 3000);
  EXPECT_EQ(level("trace"), 4000);
  EXPECT_EQ(level("0"), 0);
  EXPECT_EQ(level("3500"), 3500);
  EXPECT_EQ(level("4294967295"), 4294967295);
}

TEST(LogSettings, malformedDestinationsLeaveTheDefaultAndAComplaint) {
  for (const char* text : {"file:", "file", "none", "STDERR", "stderr ", "/var/log/x"}) {
    const LogSettings settings = LogSettings::fromTexts(text, nullptr, nullptr);
    EXPECT_EQ(settings.log, (LogTarget{Kind::Syslog, ""})) << text;
    EXPECT_THAT(settings.complaints, ElementsAre(AllOf(HasSubstr("ORU_LOG is"), HasSubstr(text))));
  }
  for (const char* text : {"file:", "None", "off"}) {
    const LogSettings settings = LogSettings::fromTexts(nullptr, text, nullptr);
    EXPECT_EQ(settings.trace, (LogTarget{Kind::None, ""})) << text;
    EXPECT_THAT(settings.complaints, ElementsAre(AllOf(HasSubstr("ORU_TRACE is"), HasSubstr(text))));
  }
}

TEST(LogSettings, malformedLevelsLeaveTheDefaultAndAComplaint) {
  for (const char* text : {"debug", "ERROR", "-1", "3000x", " 3000", "0x10", "4294967296", "3e3"}) {
    const LogSettings settings = LogSettings::fromTexts(nullptr, nullptr, text);
    EXPECT_EQ(settings.level, 3000) << text;
    EXPECT_THAT(settings.complaints, ElementsAre(AllOf(HasSubstr("ORU_LOG_LEVEL is"), HasSubstr(text))));
  }
}

TEST(LogSettings, eachMalformedValueHasItsComplaint) {
  EXPECT_EQ(LogSettings::fromTexts("a", "b", "c").complaints.size(), 3U);
}

}  // namespace
