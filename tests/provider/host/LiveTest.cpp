// The live machine, discovered by a request on a thread with a stack of 256 KiB.
#include <gtest/gtest.h>

#include <cstdlib>

#include "Host.h"
#include "SmallStack.h"

namespace {

TEST(HostOnTheLiveMachine, DiscoversItOnASmallStack) {
  unsetenv("ORU_INVENTORY");
  unsetenv("ORU_SYSTEM_ROOT");
  setenv("ORU_LOG_LEVEL", "off", 1);
  tests::HostileCmpi cmpi;
  const host::Host providers(cmpi.broker());
  providers.serveUpcalls(cmpi);
  const SmallStackThread thread([&] {
    const host::Answer computers = providers.enumerate(host::makePath(cmpi, host::computers));
    EXPECT_EQ(computers.status, CMPI_RC_OK);
    EXPECT_EQ(computers.objects.size(), 1U) << "every machine is a computer";
    for (const char* className : {host::software, host::installed, host::network, host::bmc, host::bios,
                                  host::controllers, host::ports}) {
      EXPECT_EQ(providers.enumerate(host::makePath(cmpi, className)).status, CMPI_RC_OK) << className;
    }
  });
}

}  // namespace
