#include "Asked.h"

#include <atomic>
#include <thread>

namespace {

using dispatch_test::Dispatch;

class Threads : public Dispatch {};

// Each of two requests waits in the provider until the other is there too.
TEST_F(Threads, requestsRunAtTheSameTime) {
  std::thread other([this] { EXPECT_EQ(instances("TEST_Meeting").objects.front(), "TEST_Meeting met 2"); });
  EXPECT_EQ(instances("TEST_Meeting").objects.front(), "TEST_Meeting met 2");
  other.join();
}

TEST_F(Threads, allMayBeTheFirstToNeedAProvider) {
  constexpr int threadCount = 8;
  constexpr int rounds = 40;
  std::atomic<int> wrong = 0;
  std::vector<std::thread> threads;
  for (int index = 0; index < threadCount; ++index) {
    threads.emplace_back([this, &wrong] {
      for (int round = 0; round < rounds; ++round) {
        const bool right = instances("TEST_Thing").outcome.delivered == 4 &&
                           names("TEST_Thing").outcome.delivered == 4 &&
                           get("TEST_Thing.Name=\"a\"").outcome.delivered == 1 &&
                           get("TEST_Thing.Name=\"two\"").outcome.status.code == CMPI_RC_ERR_NOT_FOUND &&
                           instances("TEST_Asking").outcome.delivered == 3 &&
                           instances("TEST_Untidy").outcome.delivered == 1 &&
                           instances("TEST_Missing").outcome.status.code == CMPI_RC_ERR_FAILED;
        wrong += right ? 0 : 1;
      }
    });
  }
  for (std::thread& thread : threads)
    thread.join();
  EXPECT_EQ(wrong, 0);
}

}  // namespace
