#include "Asked.h"

#include <cimom/ProviderCall.h>

namespace {

using dispatch_test::Answer;
using dispatch_test::Dispatch;
using testing::ElementsAre;

class Upcalls : public Dispatch {};

// The asking provider hands a key to the enumeration of another class; the answers show it.
TEST_F(Upcalls, reachOtherProvidersWithTheirKeys) {
  const Answer answer = instances("TEST_Asking");
  EXPECT_EQ(answer.outcome.status.code, CMPI_RC_OK) << answer.outcome.status.description;
  EXPECT_TRUE(answer.outcome.done);
  EXPECT_THAT(answer.objects,
              ElementsAre("TEST_Asking echo of 'from ' 0", "TEST_Asking one 1", "TEST_Asking names 1"));
}

// Each level hands on what the level below found; the deepest was refused and says why.
TEST_F(Upcalls, areBoundedInDepth) {
  const Answer answer = instances("TEST_Deep");
  EXPECT_EQ(answer.outcome.status.code, CMPI_RC_OK);
  const auto deepest = static_cast<std::size_t>(cimom::Nesting::deepest - 1);
  EXPECT_THAT(answer.objects,
              ElementsAre("TEST_Deep " + std::string(deepest, 'x') + " " + std::to_string(deepest),
                          "TEST_Deep providers ask each other more than 16 calls deep 1000"));
  EXPECT_EQ(instances("TEST_SubThing").outcome.delivered, 1U);
}

}  // namespace
