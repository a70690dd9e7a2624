// Workers and the timer.
#include <gtest/gtest.h>

#include <cimom/http/Timer.h>
#include <cimom/http/Workers.h>

#include <atomic>
#include <mutex>
#include <vector>

#include "TestServer.h"

namespace tests {
namespace {

using namespace std::chrono_literals;
using cimom::http::Clock;
using cimom::http::Timer;
using cimom::http::Workers;

TEST(Workers, DoEverythingBeforeTheyEnd) {
  std::atomic<int> done = 0;
  {
    Workers workers(1, 3);
    for (int task = 0; task < 100; ++task) {
      workers.submit([&] { ++done; });
    }
  }
  EXPECT_EQ(done, 100);
}

TEST(Workers, WaitUntilNothingIsDone) {
  Signal go;
  Workers workers(0, 1);
  EXPECT_TRUE(workers.waitUntilIdle(0ms));
  workers.submit([&] { EXPECT_TRUE(go.wait()); });
  EXPECT_FALSE(workers.waitUntilIdle(20ms));
  go.set();
  EXPECT_TRUE(workers.waitUntilIdle(patience));
}

TEST(Workers, ThatWaitAreReplaced) {
  Signal second;
  Workers workers(0, 1);
  workers.submit([&] {
    workers.park();
    EXPECT_TRUE(second.wait());
    workers.unpark();
  });
  workers.submit([&] { second.set(); });
  EXPECT_TRUE(workers.waitUntilIdle(patience));
}

TEST(Workers, ThatWaitLetQueuedWorkGoOn) {
  Signal queued;
  Signal second;
  Workers workers(0, 1);
  workers.submit([&] {
    EXPECT_TRUE(queued.wait());
    workers.park();
    EXPECT_TRUE(second.wait());
    workers.unpark();
  });
  workers.submit([&] { second.set(); });
  queued.set();
  EXPECT_TRUE(workers.waitUntilIdle(patience));
}

TEST(TimerThread, KeepsTheOrderOfTimes) {
  std::mutex mutex;
  std::vector<int> order;
  Signal last;
  Timer timer;
  const auto now = Clock::now();
  const auto note = [&](int number) {
    const std::lock_guard lock(mutex);
    order.push_back(number);
    if (order.size() == 3) {
      last.set();
    }
  };
  timer.at(now + 60ms, [&] { note(3); });
  timer.at(now + 20ms, [&] { note(1); });
  timer.at(now + 40ms, [&] { note(2); });
  EXPECT_TRUE(last.wait());
  EXPECT_EQ(order, (std::vector<int>{1, 2, 3}));
  EXPECT_GE(Clock::now() - now, 60ms);
}

TEST(TimerThread, IsNotLateForWhatComesBeforeOther) {
  Signal soon;
  Timer timer;
  timer.at(Clock::now() + 1h, [] { FAIL() << "much too early"; });
  timer.at(Clock::now() + 10ms, [&] { soon.set(); });
  EXPECT_TRUE(soon.wait());
}

TEST(TimerThread, DropsWhatIsLeft) {
  std::atomic<bool> done = false;
  Timer timer;
  timer.at(Clock::now() + 1h, [&] { done = true; });
  timer.stop();
  timer.at(Clock::now(), [&] { done = true; });
  EXPECT_FALSE(done);
}

}  // namespace
}  // namespace tests
