// The framework has no tree: its inventory file is not there. That is a failure, not a machine without
// elements.
#include <gmock/gmock.h>

#include "Requests.h"

namespace {

using testing::HasSubstr;
using testing::IsEmpty;
using NoTree = Requests;

TEST_F(NoTree, IsAFailureThatNamesTheFile) {
  for (const char* className : {computers, controllers, ports}) {
    for (const Answer& answer : {enumerateNames(className), enumerate(className)}) {
      EXPECT_EQ(answer.status, CMPI_RC_ERR_FAILED);
      EXPECT_THAT(answer.message, HasSubstr("missing.json"));
      EXPECT_THAT(answer.paths, IsEmpty());
      EXPECT_THAT(answer.instances, IsEmpty());
      EXPECT_EQ(answer.done, 0);
    }
  }
}

TEST_F(NoTree, IsNoReasonToSayThatAnElementIsNotFound) {
  const Answer answer = get(computers, {{"CreationClassName", "KELVO_ComputerSystem"}, {"Name", "atlas"}});
  EXPECT_EQ(answer.status, CMPI_RC_ERR_FAILED);
  EXPECT_THAT(answer.message, HasSubstr("missing.json"));
}

}  // namespace
