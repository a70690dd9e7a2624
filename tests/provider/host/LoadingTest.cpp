// Libraries as object managers load, use and unload them: each class's factories called once, all symbols
// bound at once and shared, cleaned up and unmapped while the process and its threads go on, and loaded
// again.
#include <gmock/gmock.h>
#include <tests/support/ElfFile.h>

#include <dlfcn.h>

#include <condition_variable>
#include <functional>
#include <mutex>
#include <thread>

#include "HostTest.h"

namespace {

constexpr const char* inventoryLibrary = "libSoftwareInventoryProvider.so";
constexpr const char* endpointLibrary = "libKelvoEndpointProvider.so";

class HostLoading : public HostTest {};

/// A thread of a pool: it does what it is given and stays.
class PoolThread {
 public:
  PoolThread() : thread_([this] { run(); }) {}
  ~PoolThread() {
    give({});
    thread_.join();
  }
  PoolThread(const PoolThread&) = delete;
  PoolThread& operator=(const PoolThread&) = delete;

  void operator()(std::function<void()> work) { give(std::move(work)); }

 private:
  void give(std::function<void()> work) {
    std::unique_lock lock(mutex_);
    isEnd_ = !work;
    work_ = std::move(work);
    isGiven_ = true;
    changed_.notify_all();
    changed_.wait(lock, [this] { return !isGiven_; });
  }
  void run() {
    for (std::unique_lock lock(mutex_);;) {
      changed_.wait(lock, [this] { return isGiven_; });
      if (!isEnd_) {
        work_();
      }
      isGiven_ = false;
      changed_.notify_all();
      if (isEnd_) {
        return;
      }
    }
  }

  std::mutex mutex_;
  std::condition_variable changed_;
  std::function<void()> work_;
  bool isGiven_ = false;
  bool isEnd_ = false;
  std::thread thread_;
};

TEST_F(HostLoading, EachClassHasAnInterfaceThatWorks) {
  EXPECT_EQ(providers.instances.size(), 8U);
  EXPECT_EQ(providers.associations.size(), 4U);
  for (const auto& [className, mi] : providers.instances) {
    EXPECT_EQ(providers.enumerateNames(path(className.c_str())).status, CMPI_RC_OK) << className;
  }
}

// One class may become idle, and its interface be cleaned up, while another is in use.
TEST_F(HostLoading, OneClassIsCleanedUpWithoutTheOthers) {
  for (const char* className : {host::computers, host::bios}) {
    CMPIInstanceMI* const mi = providers.instances.at(className);
    EXPECT_EQ(mi->ft->cleanup(mi, nullptr, 0).rc, CMPI_RC_OK);
    providers.instances.erase(className);
  }
  EXPECT_EQ(providers.enumerateNames(path(host::ports)).objects.size(), 3U);
  EXPECT_EQ(providers.enumerateNames(path(host::controllers)).objects.size(), 1U);
  EXPECT_EQ(providers.enumerateNames(path(host::software)).status, CMPI_RC_OK);
}

TEST_F(HostLoading, SymbolsAreSharedAndAreTheFactoriesAlone) {
  // By the program's handle: a look-up by default would tie the libraries to the program for good.
  void* const program = dlopen(nullptr, RTLD_NOW);
  for (const char* factory :
       {"SoftwareInventoryProvider_Create_InstanceMI", "SoftwareInventoryProvider_Create_AssociationMI",
        "KelvoEndpointProvider_Create_InstanceMI"}) {
    EXPECT_NE(dlsym(program, factory), nullptr) << factory;
  }
  dlclose(program);
  EXPECT_THAT(tests::ElfFile(std::string(LIBRARY_FOLDER) + "/" + endpointLibrary).exportedSymbols(),
              testing::UnorderedElementsAre("KelvoEndpointProvider_Create_InstanceMI"));
}

TEST_F(HostLoading, AnIdleLibraryIsUnmappedAndLoadedAgain) {
  const std::vector<std::string> before = everything();
  providers.unload();
  for (int round = 0; round < 3; ++round) {
    EXPECT_FALSE(host::isMapped(inventoryLibrary));
    EXPECT_FALSE(host::isMapped(endpointLibrary));
    EXPECT_TRUE(host::isMapped("liboru.so")) << "the framework stays";
    host::Host again(cmpi.broker());
    EXPECT_TRUE(host::isMapped(inventoryLibrary));
    EXPECT_TRUE(host::isMapped(endpointLibrary));
    again.serveUpcalls(cmpi);
    EXPECT_EQ(again.names(softwareOf("26@f3"), host::network).objects.size(), 1U);
    EXPECT_EQ(again.enumerate(path(host::software)).objects.size(), 9U);
  }
}

// Threads of a pool outlive the libraries whose functions they ran.
TEST_F(HostLoading, ThreadsThatStayKeepNoLibraryMapped) {
  PoolThread first;
  PoolThread second;
  std::vector<std::string> answers;
  first([&] { answers = everything(); });
  second([&] { EXPECT_EQ(everything(), answers); });
  providers.unload();
  EXPECT_FALSE(host::isMapped(inventoryLibrary));
  EXPECT_FALSE(host::isMapped(endpointLibrary));
  first([&] {
    host::Host again(cmpi.broker());
    again.serveUpcalls(cmpi);
    EXPECT_EQ(again.enumerate(path(host::software)).objects.size(), 9U);
  });
  EXPECT_FALSE(host::isMapped(inventoryLibrary));
}

}  // namespace
