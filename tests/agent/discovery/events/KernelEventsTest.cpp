// When the kernel's news are a reason to look again. The time is the double's own: nothing here sleeps.
#include <agent/discovery/events/KernelEvents.h>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <cerrno>
#include <chrono>
#include <cstddef>
#include <deque>
#include <future>
#include <memory>
#include <optional>
#include <string>
#include <system_error>
#include <utility>
#include <vector>

namespace agent::discovery {
namespace {

using namespace std::chrono_literals;
using std::chrono::milliseconds;
using ::testing::HasSubstr;

const std::string moduleAdded("add@/module/e1000e\0SUBSYSTEM=module\0", 36);
const std::string containerAdded("add@/devices/virtual/net/veth1\0SUBSYSTEM=net\0", 45);

/// A kernel that sends what a test wrote down, each at its time. Where nothing more comes, it stops.
class ScriptedKernel : public KernelChannel {
 public:
  struct Sent {
    milliseconds at{};
    KernelNews news;
  };

  void open() override {
    if (openError != 0) {
      throw std::system_error(openError, std::generic_category(), "the socket");
    }
    openedAt = time;
  }
  bool wait() override {
    ++waits;
    if (waitError != 0) {
      throw std::system_error(waitError, std::generic_category(), "poll");
    }
    if (sent.empty()) {
      return false;
    }
    time = std::max(time, sent.front().at);
    return time < stopAt;
  }
  bool pause(milliseconds length) override {
    time += length;
    return time < stopAt;
  }
  std::optional<KernelNews> take() override {
    ++takes;
    if (sent.empty() || sent.front().at > time) {
      return std::nullopt;
    }
    KernelNews news = std::move(sent.front().news);
    sent.pop_front();
    return news;
  }
  [[nodiscard]] Time now() const override { return Time(time); }
  void stop() noexcept override { stopAt = milliseconds(0); }

  void sends(milliseconds at, const std::string& bytes) {
    sent.push_back({at, {KernelNews::Kind::Object, bytes}});
  }
  void sends(milliseconds at, KernelNews::Kind kind) { sent.push_back({at, {kind}}); }

  milliseconds time = 0ms;
  milliseconds stopAt = 24h;
  std::optional<milliseconds> openedAt;
  std::deque<Sent> sent;
  int openError = 0;
  int waitError = 0;
  int waits = 0;
  int takes = 0;
};

class KernelEventsTest : public ::testing::Test {
 protected:
  /// The times of all changes, when each look takes `look`; the one at the opening is left out.
  std::vector<milliseconds> changes(milliseconds look = 10ms) {
    EXPECT_TRUE(events.waitForChange());
    std::vector<milliseconds> times;
    kernel.time += look;
    while (events.waitForChange()) {
      times.push_back(kernel.time);
      kernel.time += look;
    }
    return times;
  }

  std::unique_ptr<ScriptedKernel> owned = std::make_unique<ScriptedKernel>();
  ScriptedKernel& kernel = *owned;
  KernelEvents events{std::move(owned)};
};

TEST_F(KernelEventsTest, ShortProgramsAskTheKernelNothing) {
  kernel.stopAt = KernelEvents::startDelay;
  EXPECT_FALSE(events.waitForChange());
  EXPECT_FALSE(kernel.openedAt.has_value());
}

TEST_F(KernelEventsTest, WhatCameBeforeTheyAreFollowedCountsAsAChange) {
  EXPECT_TRUE(events.waitForChange());
  EXPECT_EQ(kernel.openedAt, KernelEvents::startDelay);
  EXPECT_EQ(kernel.time, KernelEvents::startDelay)
      << "a change since the first tree shows within two seconds";
  EXPECT_EQ(kernel.waits, 0);
}

TEST_F(KernelEventsTest, SocketThatCannotBeOpenedIsAnErrorThatNamesIt) {
  kernel.openError = EPERM;
  try {
    events.waitForChange();
    FAIL() << "nothing can be followed";
  } catch (const std::system_error& error) {
    EXPECT_EQ(error.code().value(), EPERM);
    EXPECT_THAT(error.what(), HasSubstr("the socket"));
  }
}

TEST_F(KernelEventsTest, ErrorOfTheSocketIsTheirs) {
  EXPECT_TRUE(events.waitForChange());
  kernel.waitError = EBADF;
  EXPECT_THROW(events.waitForChange(), std::system_error);
}

TEST_F(KernelEventsTest, LateEventIsAChangeSoonAfter) {
  kernel.sends(1h, moduleAdded);
  EXPECT_EQ(changes(), std::vector<milliseconds>({1h + 200ms}));
}

TEST_F(KernelEventsTest, RenamedHostIsAChange) {
  kernel.sends(1h, KernelNews::Kind::HostName);
  EXPECT_EQ(changes().size(), 1U);
}

TEST_F(KernelEventsTest, LostMessagesAreAChange) {
  kernel.sends(1h, KernelNews::Kind::Lost);
  EXPECT_EQ(changes().size(), 1U);
}

TEST_F(KernelEventsTest, WhatIsOfNoConcernIsNone) {
  kernel.sends(1h, containerAdded);
  kernel.sends(2h, "no message at all");
  EXPECT_TRUE(changes().empty());
}

TEST_F(KernelEventsTest, BurstIsOneChangeOnceItIsQuiet) {
  for (milliseconds at = 1h; at < 1h + 500ms; at += 50ms) {
    kernel.sends(at, moduleAdded);
  }
  const std::vector<milliseconds> times = changes();
  ASSERT_EQ(times.size(), 1U);
  EXPECT_GE(times[0], 1h + 450ms + 150ms) << "not before it is over";
  EXPECT_LE(times[0], 1h + 1s);
}

TEST_F(KernelEventsTest, WhatIsOfNoConcernDoesNotKeepABurstOpen) {
  kernel.sends(1h, moduleAdded);
  for (milliseconds at = 1h + 10ms; at < 1h + 5s; at += 10ms) {
    kernel.sends(at, containerAdded);
  }
  EXPECT_EQ(changes(), std::vector<milliseconds>({1h + 200ms}));
}

TEST_F(KernelEventsTest, EndlessBurstIsAChangeAfterASecond) {
  for (milliseconds at = 1h; at < 1h + 10s; at += 10ms) {
    kernel.sends(at, moduleAdded);
  }
  const std::vector<milliseconds> times = changes();
  ASSERT_FALSE(times.empty());
  EXPECT_EQ(times[0], 1h + 1s);
}

TEST_F(KernelEventsTest, StormIsOneLookASecond) {
  for (milliseconds at = 1h; at < 1h + 60s; at += 1ms) {
    kernel.sends(at, moduleAdded);
    kernel.sends(at, moduleAdded);
  }
  constexpr milliseconds look = 300ms;
  const std::vector<milliseconds> times = changes(look);
  EXPECT_GE(times.size(), 40U);
  for (std::size_t i = 1; i < times.size(); ++i) {
    EXPECT_GE(times[i] - times[i - 1] - look, 1s);
  }
}

TEST_F(KernelEventsTest, StormCostsAFewWakesASecondAndABoundedNumberOfMessages) {
  for (milliseconds at = 1h; at < 1h + 10s; at += 1ms) {
    for (int i = 0; i < 10; ++i) {
      kernel.sends(at, containerAdded);
    }
  }
  constexpr int messages = 100'000;
  EXPECT_TRUE(changes().empty());
  EXPECT_LE(kernel.takes, messages + kernel.waits);
  // One for each full load; the first load and the last are not full, and one more finds the end.
  EXPECT_LE(kernel.waits, messages / KernelEvents::mostAtOnce + 3);
  EXPECT_GE(kernel.time, 1h + messages / KernelEvents::mostAtOnce * KernelEvents::quietTime);
}

TEST_F(KernelEventsTest, EventDuringALookIsAChangeASecondAfterIt) {
  kernel.sends(1h, moduleAdded);
  kernel.sends(1h + 250ms, moduleAdded);  // the look goes from 200 to 300 ms
  EXPECT_EQ(changes(100ms), std::vector<milliseconds>({1h + 200ms, 1h + 300ms + 1s}));
}

TEST_F(KernelEventsTest, EveryEventIsSeenByALookThatBeginsWithinTwoSeconds) {
  constexpr milliseconds look = 300ms;
  for (milliseconds second = 0ms; second < 3s; second += 70ms) {
    for (milliseconds third = second; third < 4s; third += 110ms) {
      auto scripted = std::make_unique<ScriptedKernel>();
      ScriptedKernel& its = *scripted;
      KernelEvents followed(std::move(scripted));
      std::vector<milliseconds> unseen{1h, 1h + second, 1h + third};
      for (const milliseconds at : unseen) {
        its.sends(at, moduleAdded);
      }
      while (followed.waitForChange()) {
        while (!unseen.empty() && unseen.front() <= its.time) {
          EXPECT_LE(its.time + look - unseen.front(), 2s) << second.count() << ' ' << third.count();
          unseen.erase(unseen.begin());
        }
        its.time += look;
      }
      EXPECT_TRUE(unseen.empty());
    }
  }
}

TEST_F(KernelEventsTest, StopEndsABurst) {
  kernel.sends(1h, moduleAdded);
  kernel.stopAt = 1h + 100ms;
  EXPECT_TRUE(changes().empty());
}

TEST(RunningKernel, StopEndsAPauseAndAllLaterOnes) {
  const std::unique_ptr<KernelChannel> kernel = kernelChannel();
  EXPECT_TRUE(kernel->pause(1ms));
  std::future<bool> paused = std::async(std::launch::async, [&kernel] { return kernel->pause(1h); });
  kernel->stop();
  EXPECT_FALSE(paused.get());
  EXPECT_FALSE(kernel->pause(1h));
}

TEST(RunningKernel, OpensWithoutRootOrSaysWhatItCouldNot) {
  const std::unique_ptr<KernelChannel> kernel = kernelChannel();
  try {
    kernel->open();
  } catch (const std::system_error& error) {
    EXPECT_THAT(error.what(),
                ::testing::AnyOf(HasSubstr("the socket"), HasSubstr("/proc/sys/kernel/hostname")));
    return;  // some containers allow neither
  }
  std::future<bool> waited = std::async(std::launch::async, [&kernel] {
    while (kernel->wait()) {  // this machine may change meanwhile
      while (kernel->take()) {
      }
    }
    return true;
  });
  kernel->stop();
  EXPECT_TRUE(waited.get());
}

}  // namespace
}  // namespace agent::discovery
