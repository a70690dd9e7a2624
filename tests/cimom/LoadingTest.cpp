#include "Asked.h"

#include <cstdlib>
#include <fstream>
#include <iterator>
#include <memory>
#include <stdexcept>

namespace {

using cimom::Configuration;
using cimom::ObjectManager;
using cimom::Outcome;
using dispatch_test::configuration;
using dispatch_test::Dispatch;
using dispatch_test::Lines;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;

bool isMapped(const std::string& library = "libDispatchTestProvider.so") {
  std::ifstream maps("/proc/self/maps");
  const std::string text{std::istreambuf_iterator<char>(maps), std::istreambuf_iterator<char>()};
  return text.find(library) != std::string::npos;
}

Outcome ask(ObjectManager& manager, std::string_view className) {
  return manager.enumerateInstances("root/test", className, std::nullopt,
                                    [](const cimom::Instance&) { return true; });
}

class Loading : public Dispatch {
 protected:
  void expectFailed(std::string_view className, const std::string& reason) {
    const Outcome outcome = ask(manager_, className);
    EXPECT_EQ(outcome.status.code, CMPI_RC_ERR_FAILED);
    EXPECT_THAT(outcome.status.description, HasSubstr(reason));
    EXPECT_FALSE(outcome.done);
  }
};

TEST_F(Loading, saysWhichLibraryIsMissing) {
  expectFailed("TEST_Missing", "libNoSuchLibrary.so");
}

TEST_F(Loading, saysWhichFactoryIsMissing) {
  expectFailed("TEST_NoFactory", "libDispatchTestProvider.so has no factory Unknown_Create_InstanceMI");
}

TEST_F(Loading, saysThatAFactoryMadeNothing) {
  expectFailed("TEST_NullFactory", "made nothing");
}

TEST_F(Loading, saysWhyAFactoryFailed) {
  expectFailed("TEST_FailingFactory", "Failing_Create_InstanceMI");
  expectFailed("TEST_FailingFactory", "status 2: not today");
}

TEST(LoadingAnew, worksAfterUnloading) {
  Lines log;
  for (int round = 0; round < 3; ++round) {
    EXPECT_FALSE(isMapped());
    ObjectManager manager(configuration(log));
    EXPECT_FALSE(isMapped());
    EXPECT_EQ(ask(manager, "TEST_SubThing").delivered, 1U);
    EXPECT_TRUE(isMapped());
  }
  EXPECT_FALSE(isMapped());
  EXPECT_THAT(log.all(), IsEmpty());
}

TEST(LoadingAnew, isTwoManagersInOneProcess) {
  Lines log;
  auto first = std::make_unique<ObjectManager>(configuration(log));
  EXPECT_EQ(ask(*first, "TEST_SubThing").delivered, 1U);
  first.reset();
  ObjectManager second(configuration(log));
  EXPECT_EQ(ask(second, "TEST_SubThing").delivered, 1U);
}

TEST(CleanUp, isCalledAtTheEndAndItsFailureSaid) {
  Lines log;
  {
    ObjectManager manager(configuration(log));
    EXPECT_EQ(ask(manager, "TEST_Untidy").delivered, 1U);
    EXPECT_THAT(log.all(), IsEmpty());
  }
  EXPECT_THAT(log.all(), ElementsAre("cleanup of provider Untidy failed with status 1: crumbs left"));
  EXPECT_FALSE(isMapped());
}

TEST(CleanUp, mayForbidUnloading) {
  Lines log;
  {
    ObjectManager manager(configuration(log));
    EXPECT_EQ(ask(manager, "TEST_Staying").delivered, 1U);
  }
  EXPECT_TRUE(isMapped("libStayingTestProvider.so"));
}

/// What the provider reads as the C library's time zone, in hours, where it is loaded with this setting.
int zoneSeenWith(const char* setting) {
  setenv("TZ", setting, 1);  // NOLINT(concurrency-mt-unsafe): the process has one thread
  Lines log;
  ObjectManager manager(configuration(log));
  std::uint32_t west = 0;
  manager.enumerateInstances("root/test", "TEST_Zone", std::nullopt,
                             [&west](const cimom::Instance& instance) {
                               west = instance.find("Number")->data.value.uint32;
                               return true;
                             });
  return static_cast<int>(west / 3600);
}

// In a process of its own: the zone is set up once.
TEST(TimeZone, isSetBeforeAProviderIsLoaded) {
  GTEST_FLAG_SET(death_test_style, "threadsafe");
  EXPECT_EXIT(std::exit(zoneSeenWith("FAR5")), testing::ExitedWithCode(5),
              "");  // NOLINT(concurrency-mt-unsafe)
}

class Configured : public testing::Test {
 protected:
  std::string complaint() {
    try {
      const ObjectManager manager(configuration_);
    } catch (const std::runtime_error& error) {
      return error.what();
    }
    return {};
  }

  Lines log_;
  Configuration configuration_ = configuration(log_);
};

TEST_F(Configured, refusesRegistrationsOfUnknownClasses) {
  configuration_.providers = cimom::parseRegistrations(
      "\n[TEST_None]\nprovider: A\nlocation: A\ntype: instance\nnamespace: root/test\n", "a.reg");
  EXPECT_EQ(complaint(), "a.reg:2: registered class TEST_None is not in the schema");
}

TEST_F(Configured, refusesASecondRegistrationInANamespace) {
  const auto more = cimom::parseRegistrations(
      "[test_thing]\nprovider: A\nlocation: A\ntype: instance\nnamespace: Root/Test\n", "b.reg");
  configuration_.providers.insert(configuration_.providers.end(), more.begin(), more.end());
  EXPECT_EQ(complaint(), "b.reg:1: class test_thing is registered twice in Root/Test");
}

TEST_F(Configured, refusesASchemaThatDoesNotCompile) {
  configuration_.schema.emplace_back(DISPATCH_REGISTRATION);
  EXPECT_THAT(complaint(), HasSubstr("dispatch.reg:1: "));
}

}  // namespace
