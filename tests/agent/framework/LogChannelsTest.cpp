// The logger's channels: what a line looks like, where it goes, and what happens where it cannot go there.
#include "LogCapture.h"

#include <agent/framework/LogChannels.h>
#include <fcntl.h>
#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <syslog.h>
#include <unistd.h>

#include <set>
#include <string>
#include <thread>
#include <vector>

namespace {

using agent::LogChannels;
using agent::LogEvent;
using agent::LogSettings;
using agent::LogTarget;
using ::testing::AllOf;
using ::testing::ElementsAre;
using ::testing::EndsWith;
using ::testing::HasSubstr;
using ::testing::IsEmpty;
using ::testing::MatchesRegex;
using ::testing::SizeIs;
using ::testing::internal::CaptureStderr;
using ::testing::internal::GetCapturedStderr;
using ZelLog::ZelChannel;
using Kind = LogTarget::Kind;

constexpr int errorPriority = LOG_DAEMON | LOG_ERR;
constexpr int tracePriority = LOG_DAEMON | LOG_DEBUG;

LogSettings toFile(const std::string& path, std::int64_t level = agent::traceLevel) {
  LogSettings settings;
  settings.log = {Kind::File, path};
  settings.level = level;
  return settings;
}

LogEvent event(std::string_view text, int level = agent::errorLevel) {
  return {"operator bool", "CMPISoftwareIdentity.cpp", 88, "Corvane.Test", level, text};
}

class LogChannelsTest : public ::testing::Test {
 protected:
  void SetUp() override { tests::syslogMessages().clear(); }
  tests::TemporaryFile file;
};

TEST_F(LogChannelsTest, aLineOfAFileNamesTimeLevelCategoryAndPlace) {
  LogChannels channels(toFile(file.path()));
  channels.write(ZelChannel::Log, event("first"));
  channels.write(ZelChannel::Log, event("second", agent::traceLevel));
  channels.write(ZelChannel::Log, event("third", 3500));
  const std::string time = "[0-9]{4}-[0-9]{2}-[0-9]{2}T[0-9]{2}:[0-9]{2}:[0-9]{2}[.][0-9]{3}[-+][0-9:]+ ";
  const std::string place = " Corvane.Test operator bool [(]CMPISoftwareIdentity.cpp:88[)]: ";
  EXPECT_THAT(file.lines(), ElementsAre(MatchesRegex(time + "error" + place + "first"),
                                        MatchesRegex(time + "trace" + place + "second"),
                                        MatchesRegex(time + "3500" + place + "third")));
}

TEST_F(LogChannelsTest, linesAreAppendedToWhatAFileHas) {
  LogChannels(toFile(file.path())).write(ZelChannel::Log, event("first"));
  LogChannels(toFile(file.path())).write(ZelChannel::Log, event("second"));
  EXPECT_THAT(file.lines(), ElementsAre(EndsWith("first"), EndsWith("second")));
}

TEST_F(LogChannelsTest, controlCharactersBreakNoLine) {
  LogChannels channels(toFile(file.path()));
  channels.write(ZelChannel::Log, event(std::string_view("a\nb\rc\td\x1b[31m\x7f\0e", 15)));
  channels.write(ZelChannel::Log, event("next\xc2\x85line csi\xc2\x9b kept: \xc3\xa4 \xc2\xa0 \xc2"));
  LogEvent hostile = event("text");
  hostile.function = "f\n";
  hostile.file = "g\n";
  hostile.category = "c\n";
  channels.write(ZelChannel::Log, hostile);
  EXPECT_THAT(file.lines(), ElementsAre(EndsWith(": a\\nb\\x0dc\\x09d\\x1b[31m\\x7f\\x00e"),
                                        EndsWith("next\\x85line csi\\x9b kept: \xc3\xa4 \xc2\xa0 \xc2"),
                                        EndsWith(" c\\n f\\n (g\\n:88): text")));
}

TEST_F(LogChannelsTest, nullPlacesPrintAsNull) {
  LogChannels channels(toFile(file.path()));
  channels.write(ZelChannel::Log, {nullptr, nullptr, 0, "", agent::errorLevel, ""});
  EXPECT_THAT(file.lines(), ElementsAre(EndsWith("error  (null) ((null):0): ")));
}

TEST_F(LogChannelsTest, levelsAboveTheThresholdAreDropped) {
  LogChannels channels(toFile(file.path(), agent::errorLevel));
  EXPECT_EQ(channels.threshold(ZelChannel::Log), 3000);
  channels.write(ZelChannel::Log, event("at", 3000));
  channels.write(ZelChannel::Log, event("above", 3001));
  EXPECT_THAT(file.lines(), ElementsAre(EndsWith("at")));
}

TEST_F(LogChannelsTest, offWritesNothingAtAll) {
  LogSettings settings = toFile(file.path(), agent::levelOff);
  settings.trace = settings.log;
  settings.complaints = {"complaint"};
  LogChannels channels(settings);
  channels.write(ZelChannel::Log, event("text", 0));
  channels.write(ZelChannel::Log, event("text", std::numeric_limits<int>::min()));
  channels.write(ZelChannel::Trace, event("text"));
  EXPECT_EQ(channels.threshold(ZelChannel::Log), agent::levelOff);
  EXPECT_THAT(file.lines(), IsEmpty());
}

TEST_F(LogChannelsTest, channelsGoTheirOwnWays) {
  tests::TemporaryFile traces;
  LogSettings settings = toFile(file.path());
  LogChannels withoutTrace(settings);
  EXPECT_EQ(withoutTrace.threshold(ZelChannel::Trace), agent::levelOff);
  withoutTrace.write(ZelChannel::Trace, event("nowhere"));
  settings.trace = {Kind::File, traces.path()};
  LogChannels channels(settings);
  channels.write(ZelChannel::Log, event("to log"));
  channels.write(ZelChannel::Trace, event("to trace"));
  EXPECT_THAT(file.lines(), ElementsAre(EndsWith("to log")));
  EXPECT_THAT(traces.lines(), ElementsAre(EndsWith("to trace")));
}

TEST_F(LogChannelsTest, channelsMayShareAFile) {
  LogSettings settings = toFile(file.path());
  settings.trace = settings.log;
  LogChannels channels(settings);
  channels.write(ZelChannel::Log, event("to log"));
  channels.write(ZelChannel::Trace, event("to trace"));
  EXPECT_THAT(file.lines(), ElementsAre(EndsWith("to log"), EndsWith("to trace")));
}

TEST_F(LogChannelsTest, standardError) {
  LogSettings settings;
  settings.log = {Kind::StandardError, ""};
  CaptureStderr();
  LogChannels(settings).write(ZelChannel::Log, event("text"));
  EXPECT_THAT(tests::linesOf(GetCapturedStderr()),
              ElementsAre(EndsWith("(CMPISoftwareIdentity.cpp:88): text")));
}

TEST_F(LogChannelsTest, syslogGetsPriorityAndTextWithoutTime) {
  LogSettings settings;
  settings.level = agent::traceLevel;
  LogChannels channels(settings);
  channels.write(ZelChannel::Log, event("100% of it"));
  channels.write(ZelChannel::Log, event("routine", agent::traceLevel));
  const std::string place = " Corvane.Test operator bool (CMPISoftwareIdentity.cpp:88): ";
  EXPECT_THAT(tests::syslogMessages(),
              ElementsAre(std::to_string(errorPriority) + " error" + place + "100% of it",
                          std::to_string(tracePriority) + " trace" + place + "routine"));
}

TEST_F(LogChannelsTest, complaintsAreLoggedOnce) {
  LogChannels channels([this] {
    LogSettings settings = toFile(file.path(), agent::errorLevel);
    settings.complaints = {"ORU_LOG_LEVEL is \"x\""};
    return settings;
  }());
  channels.write(ZelChannel::Log, event("text"));
  EXPECT_THAT(file.lines(), ElementsAre(EndsWith("ORU_LOG_LEVEL is \"x\""), EndsWith("text")));
}

// Destinations that fail.

TEST_F(LogChannelsTest, aFileThatCannotBeOpenedIsReplacedByStandardErrorWithOneMessage) {
  const std::string path = file.path() + "/nowhere/log";
  CaptureStderr();
  LogChannels channels(toFile(path));
  channels.write(ZelChannel::Log, event("first"));
  channels.write(ZelChannel::Log, event("second"));
  EXPECT_THAT(tests::linesOf(GetCapturedStderr()),
              ElementsAre(AllOf(HasSubstr("error Oru.ZelLogger "), HasSubstr(path),
                                HasSubstr("Not a directory"), HasSubstr("standard error")),
                          EndsWith("first"), EndsWith("second")));
}

TEST_F(LogChannelsTest, aFileThatFillsUpIsReplacedAndTheLineIsNotLost) {
  CaptureStderr();
  LogChannels channels(toFile("/dev/full"));
  channels.write(ZelChannel::Log, event("first"));
  channels.write(ZelChannel::Log, event("second"));
  EXPECT_THAT(tests::linesOf(GetCapturedStderr()),
              ElementsAre(AllOf(HasSubstr("/dev/full"), HasSubstr("No space left")), EndsWith("first"),
                          EndsWith("second")));
}

TEST_F(LogChannelsTest, withoutStandardErrorItIsSyslog) {
  const int kept = ::fcntl(STDERR_FILENO, F_DUPFD_CLOEXEC, 3);
  ASSERT_GE(kept, 0);
  ::close(STDERR_FILENO);
  const int full = ::open("/dev/full", O_WRONLY | O_CLOEXEC);
  ::dup2(full, STDERR_FILENO);
  {
    LogChannels channels(toFile("/dev/full"));
    channels.write(ZelChannel::Log, event("first"));
    channels.write(ZelChannel::Log, event("second"));
  }
  if (full != STDERR_FILENO) {
    ::close(full);
  }
  ::dup2(kept, STDERR_FILENO);
  ::close(kept);
  // That the file failed was to be said on standard error, so syslog hears of both.
  EXPECT_THAT(tests::syslogMessages(),
              ElementsAre(HasSubstr("to standard error: No space left"),
                          HasSubstr("to /dev/full: No space left"), EndsWith("first"), EndsWith("second")));
}

TEST_F(LogChannelsTest, aFullPipeIsNotWaitedFor) {
  int ends[2] = {-1, -1};
  ASSERT_EQ(::pipe2(ends, O_NONBLOCK | O_CLOEXEC), 0);
  while (::write(ends[1], "x", 1) == 1) {
  }
  const int kept = ::fcntl(STDERR_FILENO, F_DUPFD_CLOEXEC, 3);
  ::dup2(ends[1], STDERR_FILENO);
  LogSettings settings;
  settings.log = {Kind::StandardError, ""};
  LogChannels(settings).write(ZelChannel::Log, event("dropped"));
  ::dup2(kept, STDERR_FILENO);
  ::close(kept);
  ::close(ends[0]);
  ::close(ends[1]);
  EXPECT_THAT(tests::syslogMessages(), IsEmpty());
}

// Threads.

TEST_F(LogChannelsTest, threadsKeepEachOthersLinesWhole) {
  constexpr int threadCount = 4;
  constexpr int linesPerThread = 500;
  LogSettings settings = toFile(file.path());
  settings.trace = settings.log;
  {
    LogChannels channels(settings);
    std::vector<std::thread> threads;
    threads.reserve(threadCount);
    for (int number = 0; number < threadCount; ++number) {
      threads.emplace_back([&channels, number] {
        for (int line = 0; line < linesPerThread; ++line) {
          const std::string text = "<" + std::to_string(number) + ":" + std::to_string(line) + ">";
          channels.write(line % 2 == 0 ? ZelChannel::Log : ZelChannel::Trace, event(text));
        }
      });
    }
    for (std::thread& thread : threads) {
      thread.join();
    }
  }
  std::set<std::string> texts;
  for (const std::string& line : file.lines()) {
    ASSERT_THAT(line, MatchesRegex(".* error Corvane.Test .*: <[0-9]+:[0-9]+>"));
    texts.insert(line.substr(line.find('<')));
  }
  EXPECT_THAT(texts, SizeIs(threadCount * linesPerThread));
}

}  // namespace
