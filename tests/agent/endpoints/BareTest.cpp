// Over machines/bare.json: a computer with neither controller nor port.
#include <gmock/gmock.h>

#include "Requests.h"

namespace {

using testing::ElementsAre;
using testing::IsEmpty;
using BareMachine = Requests;

TEST_F(BareMachine, HasItsComputerAlone) {
  EXPECT_THAT(
      enumerateNames(computers).paths,
      ElementsAre("root/cimv2:KELVO_ComputerSystem.CreationClassName=KELVO_ComputerSystem,Name=bare"));
}

TEST_F(BareMachine, AnswersForWhatItLacksWithAnEmptyList) {
  for (const char* className : {controllers, ports}) {
    const Answer names = enumerateNames(className);
    EXPECT_EQ(names.status, CMPI_RC_OK) << names.message;
    EXPECT_EQ(names.done, 1);
    EXPECT_THAT(names.paths, IsEmpty());
    const Answer instances = enumerate(className);
    EXPECT_EQ(instances.status, CMPI_RC_OK) << instances.message;
    EXPECT_EQ(instances.done, 1);
    EXPECT_THAT(instances.instances, IsEmpty());
  }
}

TEST_F(BareMachine, HasNoControllerOfItsName) {
  EXPECT_EQ(get(controllers, {{"CreationClassName", "KELVO_SPComputerSystem"}, {"Name", "bare"}}).status,
            CMPI_RC_ERR_NOT_FOUND);
}

}  // namespace
