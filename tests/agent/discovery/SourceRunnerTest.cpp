// Sources side by side, and what becomes of one that hangs.
#include "Captures.h"

#include <agent/discovery/SourceRunner.h>

#include <gtest/gtest.h>

#include <atomic>
#include <condition_variable>
#include <csignal>
#include <future>
#include <mutex>
#include <stdexcept>
#include <thread>

namespace agent::discovery::test {
namespace {

using namespace std::chrono_literals;

/// A door that hanging calls wait at, until the test opens it; then the test waits for them to have gone
/// through.
class Door {
 public:
  void pass() {
    std::unique_lock lock(mutex_);
    ++waiting_;
    changed_.notify_all();
    changed_.wait(lock, [this] { return open_; });
    --waiting_;
    changed_.notify_all();
  }
  void awaitOne() {
    std::unique_lock lock(mutex_);
    changed_.wait(lock, [this] { return waiting_ > 0; });
  }
  void open() {
    std::unique_lock lock(mutex_);
    open_ = true;
    changed_.notify_all();
    changed_.wait(lock, [this] { return waiting_ == 0; });
  }

 private:
  std::mutex mutex_;
  std::condition_variable changed_;
  int waiting_ = 0;
  bool open_ = false;
};

class HangingEthtool : public Ethtool {
 public:
  explicit HangingEthtool(std::shared_ptr<Door> door) : door_(std::move(door)) {}
  Answer driverInfo(const std::string& /*interfaceName*/) override {
    door_->pass();
    return {0, driverInfoBytes("late", "late")};
  }
  Answer permanentAddress(const std::string& /*interfaceName*/) override {
    door_->pass();
    return {0, "late"};
  }

 private:
  std::shared_ptr<Door> door_;
};

class HangingModules : public ModuleDatabase {
 public:
  explicit HangingModules(std::shared_ptr<Door> door) : door_(std::move(door)) {}
  Answer version(const std::string& /*module*/) override {
    door_->pass();
    return {0, "late"};
  }

 private:
  std::shared_ptr<Door> door_;
};

FoundNode nodeAt(const std::string& position) {
  FoundNode node;
  node.position = position;
  return node;
}

SystemRoot anyRoot() {
  return SystemRoot("/nowhere");
}

TEST(SourceRunner, ResultsStandInTheOrderOfTheSources) {
  std::vector<Source> sources;
  sources.reserve(5);
  for (int i = 0; i < 5; ++i) {
    sources.push_back({"s", [i](SourceContext& context) {
                         std::this_thread::sleep_for(std::chrono::milliseconds(5 * (5 - i)));
                         context.result().nodes.push_back(nodeAt(std::to_string(i)));
                       }});
  }
  const auto results = runSources(sources, anyRoot(), 60s);
  ASSERT_EQ(results.size(), 5U);
  for (std::size_t i = 0; i < results.size(); ++i) {
    ASSERT_EQ(results[i].nodes.size(), 1U);
    EXPECT_EQ(results[i].nodes[0].position, std::to_string(i));
  }
}

TEST(SourceRunner, SourcesRunAtTheSameTime) {
  std::promise<void> spoken;
  std::shared_future<void> heard = spoken.get_future().share();
  std::atomic<bool> met = false;
  const std::vector<Source> sources = {
      {"waits", [heard, &met](SourceContext&) { met = heard.wait_for(60s) == std::future_status::ready; }},
      {"speaks", [&spoken](SourceContext&) { spoken.set_value(); }},
  };
  runSources(sources, anyRoot(), 120s);
  EXPECT_TRUE(met);
}

TEST(SourceRunner, AHangingSourceIsReportedWithWhatItPublishedBefore) {
  const auto door = std::make_shared<Door>();
  const std::vector<Source> sources = {
      {"hangs",
       [door](SourceContext& context) {
         context.result().nodes.push_back(nodeAt("before"));
         context.publish();
         context.result().nodes.push_back(nodeAt("after"));
         context.doing("knocking at the door");
         door->pass();
         context.publish();
       }},
      {"works", [](SourceContext& context) { context.result().nodes.push_back(nodeAt("fine")); }},
  };
  auto waiting = std::async(std::launch::async, [&] { return runSources(sources, anyRoot(), 300ms); });
  door->awaitOne();
  const auto results = waiting.get();
  ASSERT_EQ(results[0].nodes.size(), 1U);
  EXPECT_EQ(results[0].nodes[0].position, "before");
  const SourceReport expected{"hangs", "knocking at the door", SourceReport::Reason::TimedOut,
                              "no answer within 300 ms"};
  EXPECT_EQ(results[0].reports, std::vector<SourceReport>{expected});
  EXPECT_EQ(results[1].nodes.size(), 1U);
  EXPECT_TRUE(results[1].reports.empty());
  door->open();
}

TEST(SourceRunner, ADeadlineBeyondTheClockIsNone) {
  const std::vector<Source> sources = {
      {"works", [](SourceContext& context) { context.result().nodes.push_back(nodeAt("fine")); }}};
  EXPECT_EQ(runSources(sources, anyRoot(), std::chrono::milliseconds::max())[0].nodes.size(), 1U);
}

TEST(SourceRunner, AThrowingSourceIsReportedAndKeepsWhatItFound) {
  const std::vector<Source> sources = {{"throws", [](SourceContext& context) {
                                          context.result().nodes.push_back(nodeAt("found"));
                                          throw std::runtime_error("out of luck");
                                        }}};
  const auto results = runSources(sources, anyRoot(), 60s);
  EXPECT_EQ(results[0].nodes.size(), 1U);
  const SourceReport expected{"throws", "", SourceReport::Reason::Unreadable, "out of luck"};
  EXPECT_EQ(results[0].reports, std::vector<SourceReport>{expected});
}

TEST(SourceRunner, ThreadsOfSourcesTakeNoSignals) {
  std::atomic<bool> blocked = false;
  runSources({{"asks",
               [&blocked](SourceContext&) {
                 sigset_t mask;
                 sigemptyset(&mask);
                 pthread_sigmask(SIG_SETMASK, nullptr, &mask);
                 blocked = sigismember(&mask, SIGTERM) == 1 && sigismember(&mask, SIGCHLD) == 1;
               }}},
             anyRoot(), 60s);
  EXPECT_TRUE(blocked);
  sigset_t own;
  sigemptyset(&own);
  pthread_sigmask(SIG_SETMASK, nullptr, &own);
  EXPECT_EQ(sigismember(&own, SIGTERM), 0) << "and the caller's thread takes them as before";
}

TEST(SourceRunner, ErrorsHaveTheReasonsOfReports) {
  EXPECT_EQ(reasonOf(ENOENT), SourceReport::Reason::Absent);
  EXPECT_EQ(reasonOf(ENODEV), SourceReport::Reason::Absent);
  EXPECT_EQ(reasonOf(EACCES), SourceReport::Reason::NoPermission);
  EXPECT_EQ(reasonOf(EPERM), SourceReport::Reason::NoPermission);
  EXPECT_EQ(reasonOf(ETIMEDOUT), SourceReport::Reason::TimedOut);
  EXPECT_EQ(reasonOf(EIO), SourceReport::Reason::Unreadable);
}

/// What a discovery finds while the door is shut.
NodeTree discoverAtShutDoor(const Machine& machine, const std::shared_ptr<Door>& door,
                            std::shared_ptr<Ethtool> ethtool, std::shared_ptr<ModuleDatabase> modules) {
  DiscoveryOptions options;
  options.root = machine.root();
  options.deadline = 2s;  // the other sources need milliseconds
  options.ethtool = std::move(ethtool);
  options.modules = std::move(modules);
  auto waiting = std::async(std::launch::async, [&] { return discover(options); });
  door->awaitOne();
  return waiting.get();
}

TEST(HangingSource, ADriverThatHangsLeavesDevicesPortsAndAllElse) {
  const Machine machine(server);
  const auto door = std::make_shared<Door>();
  const NodeTree tree =
      discoverAtShutDoor(machine, door, std::make_shared<HangingEthtool>(door),
                         std::make_shared<FakeModules>(std::map<std::string, ModuleDatabase::Answer>{}));
  EXPECT_EQ(tree.ofType(Oru::NodeLexicon::NetworkPortNode).size(), 5U);
  EXPECT_EQ(tree.ofType(Oru::NodeLexicon::DriverNode).size(), 4U);
  EXPECT_NE(described(tree, "BIOS"), NodeTree::none);
  EXPECT_EQ(described(tree, "Network Firmware"), NodeTree::none);
  const auto report = reportOn(tree, "network", "ethtool driver info of eno1");
  ASSERT_TRUE(report);
  EXPECT_EQ(report->reason, SourceReport::Reason::TimedOut);
  EXPECT_EQ(report->detail, "no answer within 2000 ms");
  door->open();
}

TEST(HangingSource, ModuleFilesThatHangLeaveTheDriversWithWhatSysfsTells) {
  const Machine machine(server);
  const auto door = std::make_shared<Door>();
  const NodeTree tree =
      discoverAtShutDoor(machine, door, serverEthtool(), std::make_shared<HangingModules>(door));
  EXPECT_EQ(tree.ofType(Oru::NodeLexicon::DriverNode).size(), 4U);
  EXPECT_EQ(tree.text(described(tree, "gig driver"), Oru::NodeLexicon::DriverVersionProperty), "5.6.0-k");
  EXPECT_FALSE(tree.text(described(tree, "pcieport driver"), Oru::NodeLexicon::DriverVersionProperty));
  const auto report = reportOn(tree, "drivers", "module information of cdc_ether");
  ASSERT_TRUE(report);
  EXPECT_EQ(report->reason, SourceReport::Reason::TimedOut);
  door->open();
}

/// A source that never ends, in a process that does.
void endWithAHangingSource() {
  const auto door = std::make_shared<Door>();
  runSources({{"hangs", [door](SourceContext&) { door->pass(); }}}, anyRoot(), 10ms);
  std::exit(7);  // NOLINT(concurrency-mt-unsafe): the way a process ends, static objects and all
}

TEST(HangingSourceDeathTest, DoesNotHoldUpTheEndOfTheProcess) {
  GTEST_FLAG_SET(death_test_style, "threadsafe");
  EXPECT_EXIT(endWithAHangingSource(), testing::ExitedWithCode(7), "");
}

}  // namespace
}  // namespace agent::discovery::test
