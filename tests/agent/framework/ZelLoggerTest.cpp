// The logger by the environment of a fresh process: each case runs in a child of this one, which never logs.
#include "LogCapture.h"

#include <ZelLog/ZelLogger.h>
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cstdlib>
#include <functional>
#include <string>
#include <thread>
#include <utility>
#include <vector>

namespace {

using ::testing::ElementsAre;
using ::testing::EndsWith;
using ::testing::HasSubstr;
using ::testing::IsEmpty;
using ::testing::SizeIs;
using ZelLog::ZelChannel;
using ZelLog::ZelLogger;

using Environment = std::vector<std::pair<const char*, std::string>>;

const std::string category = "Corvane.Test";

void log(int level, const std::string& text) {
  ZelLogger::logLevelMessage("function", "File.cpp", 7, category, level, nullptr, 0, 0, text);
}
void trace(int level, const std::string& text) {
  ZelLogger::traceLevelMessage("function", "File.cpp", 7, category, level, nullptr, 0, 0, text);
}

/// Runs `check` in a child with this environment; it must answer true.
void expectInChild(const Environment& environment, const std::function<bool()>& check,
                   const char* onStandardError = "") {
  EXPECT_EXIT(
      {
        for (const char* name : {"ORU_LOG", "ORU_TRACE", "ORU_LOG_LEVEL"}) {
          ::unsetenv(name);
        }
        for (const auto& [name, value] : environment) {
          ::setenv(name, value.c_str(), 1);
        }
        ::_exit(check() ? 0 : 1);
      },
      ::testing::ExitedWithCode(0), onStandardError);
}

bool isOn(ZelChannel channel, int level) {
  return ZelLogger::isLevelOn(channel, level);
}

TEST(ZelLogger, byDefaultErrorsAreOnForTheLogAlone) {
  expectInChild({}, [] {
    return isOn(ZelChannel::Log, 3000) && !isOn(ZelChannel::Log, 3001) && !isOn(ZelChannel::Log, 4000) &&
           !isOn(ZelChannel::Trace, 3000) && !isOn(ZelChannel::Trace, 0);
  });
}

TEST(ZelLogger, byDefaultErrorsGoToSyslog) {
  expectInChild({}, [] {
    log(4000, "routine");
    log(3000, "error");
    trace(3000, "traced");
    const auto& messages = tests::syslogMessages();
    return messages.size() == 1 && messages[0].ends_with("error Corvane.Test function (File.cpp:7): error");
  });
}

TEST(ZelLogger, traceLevelTurnsEverythingOn) {
  expectInChild({{"ORU_LOG_LEVEL", "trace"}, {"ORU_TRACE", "stderr"}}, [] {
    return isOn(ZelChannel::Log, 4000) && isOn(ZelChannel::Trace, 4000) && !isOn(ZelChannel::Log, 4001);
  });
}

TEST(ZelLogger, offTurnsEverythingOff) {
  expectInChild({{"ORU_LOG_LEVEL", "off"}, {"ORU_LOG", "stderr"}, {"ORU_TRACE", "stderr"}}, [] {
    log(0, "text");
    trace(0, "text");
    return !isOn(ZelChannel::Log, 0) && !isOn(ZelChannel::Trace, 0) && tests::syslogMessages().empty();
  });
}

TEST(ZelLogger, aNumberIsAThreshold) {
  expectInChild({{"ORU_LOG_LEVEL", "3500"}},
                [] { return isOn(ZelChannel::Log, 3500) && !isOn(ZelChannel::Log, 3501); });
}

TEST(ZelLogger, channelsGoWhereTheEnvironmentSays) {
  const tests::TemporaryFile logged;
  const tests::TemporaryFile traced;
  expectInChild({{"ORU_LOG_LEVEL", "trace"},
                 {"ORU_LOG", "file:" + logged.path()},
                 {"ORU_TRACE", "file:" + traced.path()}},
                [] {
                  log(4000, "to the log");
                  trace(3000, "to the trace");
                  return true;
                });
  EXPECT_THAT(logged.lines(), ElementsAre(EndsWith("trace Corvane.Test function (File.cpp:7): to the log")));
  EXPECT_THAT(traced.lines(),
              ElementsAre(EndsWith("error Corvane.Test function (File.cpp:7): to the trace")));
}

TEST(ZelLogger, theEnvironmentIsReadAtTheFirstUseAndNotAgain) {
  const tests::TemporaryFile file;
  expectInChild({{"ORU_LOG", "stderr"}}, [&file] {
    ::setenv("ORU_LOG", ("file:" + file.path()).c_str(), 1);
    log(3000, "first");
    ::setenv("ORU_LOG", "stderr", 1);
    ::setenv("ORU_LOG_LEVEL", "off", 1);
    log(3000, "second");
    return true;
  });
  EXPECT_THAT(file.lines(), ElementsAre(EndsWith("first"), EndsWith("second")));
}

TEST(ZelLogger, malformedValuesAreSaidOnce) {
  const tests::TemporaryFile file;
  expectInChild(
      {{"ORU_LOG", "file:" + file.path()}, {"ORU_TRACE", "printer"}, {"ORU_LOG_LEVEL", "loud"}}, [] {
        log(3000, "first");
        log(3000, "second");
        return isOn(ZelChannel::Log, 3000) && !isOn(ZelChannel::Log, 4000) && !isOn(ZelChannel::Trace, 3000);
      });
  EXPECT_THAT(file.lines(),
              ElementsAre(HasSubstr("ORU_TRACE is \"printer\""), HasSubstr("ORU_LOG_LEVEL is \"loud\""),
                          EndsWith("first"), EndsWith("second")));
}

TEST(ZelLogger, anUnwritableFileIsReplacedByStandardError) {
  expectInChild(
      {{"ORU_LOG", "file:/proc/nowhere/log"}},
      [] {
        log(3000, "still said");
        return true;
      },
      "Cannot write the log to /proc/nowhere/log: No such file(.|\n)*still said");
}

TEST(ZelLogger, askingForALevelWritesNothing) {
  const tests::TemporaryFile file;
  expectInChild({{"ORU_LOG", "file:" + file.path()}}, [] { return isOn(ZelChannel::Log, 3000); });
  EXPECT_THAT(file.lines(), IsEmpty());
}

TEST(ZelLogger, threadsMayAllBeFirst) {
  constexpr int threadCount = 4;
  constexpr int linesPerThread = 200;
  const tests::TemporaryFile file;
  expectInChild(
      {{"ORU_LOG_LEVEL", "trace"}, {"ORU_LOG", "file:" + file.path()}, {"ORU_TRACE", "file:" + file.path()}},
      [] {
        std::vector<std::thread> threads;
        threads.reserve(threadCount);
        for (int number = 0; number < threadCount; ++number) {
          threads.emplace_back([] {
            for (int line = 0; line < linesPerThread; ++line) {
              if (isOn(ZelChannel::Log, 4000)) {
                log(4000, "text");
              }
              trace(4000, "text");
            }
          });
        }
        for (std::thread& thread : threads) {
          thread.join();
        }
        return true;
      });
  EXPECT_THAT(file.lines(), SizeIs(2 * threadCount * linesPerThread));
}

}  // namespace
