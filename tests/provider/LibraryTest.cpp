// The provider as a file: what it exports, what it needs, and that it can be unmapped and loaded again.
#include <cmpi/cmpift.h>
#include <dlfcn.h>
#include <gmock/gmock.h>
#include <tests/support/ElfFile.h>

#include <fstream>
#include <string>
#include <vector>

namespace {

using testing::UnorderedElementsAre;

using tests::ElfFile;

TEST(ProviderLibrary, ExportsTheTwoFactoriesAlone) {
  EXPECT_THAT(ElfFile(PROVIDER_LIBRARY).exportedSymbols(),
              UnorderedElementsAre("SoftwareInventoryProvider_Create_InstanceMI",
                                   "SoftwareInventoryProvider_Create_AssociationMI"));
}

TEST(ProviderLibrary, NeedsTheFrameworkAndTheStandardLibraryAlone) {
  std::vector<std::string> needed;
  for (const std::string& name : ElfFile(PROVIDER_LIBRARY).neededLibraries()) {
    // The runtimes of a sanitized build are not the library's own.
    if (!(SANITIZED && (name.rfind("libasan", 0) == 0 || name.rfind("libubsan", 0) == 0 ||
                        name.rfind("libtsan", 0) == 0 || name == "libm.so.6"))) {
      needed.push_back(name);
    }
  }
  EXPECT_THAT(needed, testing::IsSupersetOf({"liboru.so", "libstdc++.so.6", "libc.so.6"}));
  EXPECT_THAT(needed, testing::IsSubsetOf({"liboru.so", "libstdc++.so.6", "libgcc_s.so.1", "libc.so.6",
                                           "ld-linux-x86-64.so.2"}));
}

bool isMapped(const std::string& name) {
  std::ifstream maps("/proc/self/maps");
  for (std::string line; std::getline(maps, line);) {
    if (line.find(name) != std::string::npos) {
      return true;
    }
  }
  return false;
}

TEST(ProviderLibrary, IsUnmappedAndLoadedAgain) {
  for (int round = 0; round < 3; ++round) {
    void* library = dlopen(PROVIDER_LIBRARY, RTLD_NOW | RTLD_LOCAL);
    ASSERT_NE(library, nullptr) << dlerror();
    ASSERT_TRUE(isMapped("libSoftwareInventoryProvider.so"));
    using Factory = CMPIInstanceMI* (*)(const CMPIBroker*, const CMPIContext*, CMPIStatus*);
    const auto factory =
        reinterpret_cast<Factory>(dlsym(library, "SoftwareInventoryProvider_Create_InstanceMI"));
    ASSERT_NE(factory, nullptr);
    CMPIBroker broker{};
    CMPIInstanceMI* mi = factory(&broker, nullptr, nullptr);
    ASSERT_EQ(factory(&broker, nullptr, nullptr), mi);
    // A null path is of no class; the request runs through trace and framework all the same.
    EXPECT_EQ(mi->ft->enumerateInstanceNames(mi, nullptr, nullptr, nullptr).rc, CMPI_RC_ERR_INVALID_CLASS);
    EXPECT_EQ(mi->ft->cleanup(mi, nullptr, 1).rc, CMPI_RC_OK);
    ASSERT_EQ(dlclose(library), 0);
    EXPECT_FALSE(isMapped("libSoftwareInventoryProvider.so"));
    EXPECT_TRUE(isMapped("liboru.so")) << "the framework stays mapped";
  }
}

}  // namespace
