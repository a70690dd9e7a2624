// A machine with no firmware node but a type-2 node (machines/type-two.json).
#include <gmock/gmock.h>

#include "RealRequests.h"

namespace {

using RealTypeTwo = RealRequests;

TEST_F(RealTypeTwo, TheWalkStartsOnTheTypeTwoNodes) {
  const Answer answer = enumerate();
  EXPECT_THAT(answer.names, testing::ElementsAre("192@b1"));
  EXPECT_EQ(answer.property(0, "VersionString"), "1");
  EXPECT_EQ(answer.done, 1);
}

}  // namespace
