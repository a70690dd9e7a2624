#include "Fixture.h"

#include <pthread.h>
#include <atomic>
#include <cerrno>
#include <chrono>
#include <ctime>

namespace cimom {
namespace {

class OperatingSystemTest : public BrokerTest {
 protected:
  const CMPIBrokerExtFT& xft_ = *mb_->xft;
};

TEST_F(OperatingSystemTest, LibraryNamesAreTheSystems) {
  EXPECT_STREQ(xft_.resolveFileName("Some"), "libSome.so");
  EXPECT_EQ(xft_.resolveFileName(nullptr), nullptr);
  const RequestScope outside(nullptr);
  EXPECT_STREQ(xft_.resolveFileName("Other"), "libOther.so");
}

TEST_F(OperatingSystemTest, ThreadsRunAndEnd) {
  int argument = 5;
  void* const thread = xft_.newThread([](void* given) { return given; }, &argument, 0);
  ASSERT_NE(thread, nullptr);
  void* result = nullptr;
  EXPECT_EQ(xft_.joinThread(thread, &result), 0);
  EXPECT_EQ(result, &argument);
  EXPECT_EQ(xft_.newThread(nullptr, nullptr, 0), nullptr);
}

TEST_F(OperatingSystemTest, ThreadsCanLeaveEarly) {
  static const CMPIBrokerExtFT* table = nullptr;
  table = &xft_;
  void* const thread = xft_.newThread(
      [](void* given) -> void* {
        table->exitThread(given);
        return nullptr;
      },
      &table, 0);
  void* result = nullptr;
  EXPECT_EQ(xft_.joinThread(thread, &result), 0);
  EXPECT_EQ(result, &table);
}

TEST_F(OperatingSystemTest, ThreadsCanBeDetachedAndCancelled) {
  static std::atomic<bool> ran = false;
  EXPECT_NE(xft_.newThread(
                [](void*) -> void* {
                  ran = true;
                  return nullptr;
                },
                nullptr, 1),
            nullptr);
  while (!ran) {
    xft_.threadSleep(1);
  }
  // Cancelled where it has nothing on its stack: address sanitizers do not follow the way out of more.
  void* const sleeper = xft_.newThread(
      [](void*) -> void* {
        while (true) {
          pthread_testcancel();
        }
      },
      nullptr, 0);
  EXPECT_EQ(xft_.cancelThread(sleeper), 0);
  EXPECT_EQ(xft_.joinThread(sleeper, nullptr), 0);
}

TEST_F(OperatingSystemTest, SleepsAsLongAsAsked) {
  const auto before = std::chrono::steady_clock::now();
  EXPECT_EQ(xft_.threadSleep(20), 0);
  EXPECT_GE(std::chrono::steady_clock::now() - before, std::chrono::milliseconds(20));
}

TEST_F(OperatingSystemTest, RunsOnceWhatIsToRunOnce) {
  static int runs = 0;
  static int once = 0;
  for (int round = 0; round < 3; ++round) {
    EXPECT_EQ(xft_.threadOnce(&once, [] { ++runs; }), 0);
  }
  EXPECT_EQ(runs, 1);
  EXPECT_EQ(xft_.threadOnce(nullptr, nullptr), EINVAL);
}

TEST_F(OperatingSystemTest, ThreadsHaveValuesOfTheirOwn) {
  unsigned long key = 0;
  ASSERT_EQ(xft_.createThreadKey(&key, nullptr), 0);
  EXPECT_EQ(xft_.getThreadSpecific(key), nullptr);
  EXPECT_EQ(xft_.setThreadSpecific(key, &key), 0);
  EXPECT_EQ(xft_.getThreadSpecific(key), &key);
  EXPECT_EQ(xft_.destroyThreadKey(key), 0);
  EXPECT_EQ(xft_.createThreadKey(nullptr, nullptr), EINVAL);
}

struct Meeting {
  const CMPIBrokerExtFT* xft;
  void* mutex;
  void* condition;
  int count;
};

TEST_F(OperatingSystemTest, ConditionsWakeWhoWaits) {
  Meeting meeting{&xft_, xft_.newMutex(0), xft_.newCondition(0), 0};
  void* const thread = xft_.newThread(
      [](void* given) -> void* {
        auto& shared = *static_cast<Meeting*>(given);
        shared.xft->lockMutex(shared.mutex);
        shared.count = 1;
        shared.xft->signalCondition(shared.condition);
        shared.xft->unlockMutex(shared.mutex);
        return nullptr;
      },
      &meeting, 0);
  xft_.lockMutex(meeting.mutex);
  while (meeting.count == 0) {
    EXPECT_EQ(xft_.condWait(meeting.condition, meeting.mutex), 0);
  }
  timespec soon{};
  clock_gettime(CLOCK_REALTIME, &soon);
  EXPECT_EQ(xft_.timedCondWait(meeting.condition, meeting.mutex, &soon), ETIMEDOUT);
  xft_.unlockMutex(meeting.mutex);
  EXPECT_EQ(xft_.joinThread(thread, nullptr), 0);
  xft_.destroyCondition(meeting.condition);
  xft_.destroyMutex(meeting.mutex);
}

TEST_F(OperatingSystemTest, NullsAreHarmless) {
  xft_.lockMutex(nullptr);
  xft_.unlockMutex(nullptr);
  xft_.destroyMutex(nullptr);
  xft_.destroyCondition(nullptr);
  EXPECT_EQ(xft_.condWait(nullptr, nullptr), EINVAL);
  EXPECT_EQ(xft_.timedCondWait(nullptr, nullptr, nullptr), EINVAL);
  EXPECT_EQ(xft_.signalCondition(nullptr), EINVAL);
}

}  // namespace
}  // namespace cimom
