// A machine without any software element (machines/nothing.json).
#include <gmock/gmock.h>

#include "RealRequests.h"

namespace {

using RealNothing = RealRequests;

TEST_F(RealNothing, IsOkWithoutDoneMarkerAndLogged) {
  testing::internal::CaptureStderr();
  const Answer answer = enumerate();
  EXPECT_EQ(answer.status, CMPI_RC_OK);
  EXPECT_THAT(answer.names, testing::IsEmpty());
  EXPECT_EQ(answer.done, 0);
  EXPECT_THAT(testing::internal::GetCapturedStderr(),
              testing::HasSubstr("Could Not Find Any of the Software Identity Nodes"));
}

}  // namespace
