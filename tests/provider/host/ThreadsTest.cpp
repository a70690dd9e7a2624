// Many calls at once on one interface, from threads with stacks of 256 KiB.
#include <gmock/gmock.h>
#include <tests/support/ThreadsCmpi.h>

#include <atomic>
#include <memory>

#include "HostTest.h"
#include "SmallStack.h"

namespace {

using host::Answer;

/// What one thread asks for.
std::vector<std::vector<std::string>> ask(const host::Host& providers, tests::HostileCmpi& own) {
  const auto at = [&own](const char* className, const host::Keys& keys = {}) {
    return host::makePath(own, className, keys);
  };
  std::vector<Answer> answers;
  for (const char* className : {host::software, host::installed, host::network, host::bmc, host::bios,
                                host::computers, host::controllers, host::ports}) {
    answers.push_back(providers.enumerate(at(className)));
    answers.push_back(providers.enumerateNames(at(className)));
  }
  answers.push_back(providers.get(at(host::software, {{"InstanceID", "192@f1"}})));
  answers.push_back(providers.names(at(host::software, {{"InstanceID", "26@f3"}}), host::network));
  answers.push_back(providers.associators(at(host::computers, {{"Name", "alpha"}}), host::bios));
  std::vector<std::vector<std::string>> texts;
  for (const Answer& answer : answers) {
    texts.push_back(answer.paths());
    texts.back().push_back(std::to_string(answer.status));
  }
  return texts;
}

class HostThreads : public testing::Test {
 protected:
  HostThreads() {
    host::useInventory(INVENTORY_FILE);
    providers = std::make_unique<host::Host>(broker.broker());
  }

  /// On the calling thread, with objects of its own.
  std::vector<std::vector<std::string>> askHere() {
    tests::HostileCmpi own;
    providers->serveUpcalls(own);
    tests::ThreadsCmpi::enter(own);
    return ask(*providers, own);
  }

  tests::ThreadsCmpi broker;
  std::unique_ptr<host::Host> providers;
};

// The first request of the process, which has the framework read the machine, is made there too.
TEST_F(HostThreads, WithSmallStacksAnswer) {
  std::vector<std::vector<std::string>> answers;
  {
    const SmallStackThread thread([&] { answers = askHere(); });
  }
  ASSERT_EQ(answers.size(), 19U);
  EXPECT_EQ(answers.front().size(), 10U) << "nine pieces of software, and the status";
  EXPECT_EQ(answers, askHere());
}

TEST_F(HostThreads, ManyAtOnceOnOneInterfaceGetTheSameAnswers) {
  constexpr int threadCount = 8;
  constexpr int rounds = 5;
  const std::vector<std::vector<std::string>> expected = askHere();
  std::atomic<int> wrong = 0;
  {
    std::vector<std::unique_ptr<SmallStackThread>> threads;
    for (int index = 0; index < threadCount; ++index) {
      threads.push_back(std::make_unique<SmallStackThread>([&] {
        for (int round = 0; round < rounds; ++round) {
          wrong += askHere() == expected ? 0 : 1;
        }
      }));
    }
  }
  EXPECT_EQ(wrong, 0);
}

}  // namespace
