// A framework library whose logger has no level test: the provider loads, and formats always.
#include <gmock/gmock.h>

#include "ProviderAccess.h"

namespace {

using WithoutLevelTest = ProviderTest;

TEST_F(WithoutLevelTest, EveryEventIsWritten) {
  world.logOn = false;
  world.traceOn = false;
  EXPECT_EQ(enumInstances(path()).rc, CMPI_RC_OK);
  EXPECT_FALSE(texts(4000).empty());
  EXPECT_EQ(texts(4000), texts(4000, true));
}

}  // namespace
