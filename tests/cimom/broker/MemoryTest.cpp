#include "Fixture.h"

#include <cstdint>
#include <cstring>
#include <limits>

namespace cimom {
namespace {

class MemoryTest : public BrokerTest {
 protected:
  const CMPIBrokerMemFT& mft_ = *mb_->mft;
};

TEST_F(MemoryTest, GivesMemoryThatCanGrow) {
  auto* memory = static_cast<char*>(mft_.cmpiMalloc(mb_, 4));
  std::memcpy(memory, "abc", 4);
  memory = static_cast<char*>(mft_.cmpiRealloc(mb_, memory, 10000));
  EXPECT_STREQ(memory, "abc");
  std::memset(memory, 'x', 10000);
  memory = static_cast<char*>(mft_.cmpiRealloc(mb_, memory, 2));
  EXPECT_EQ(std::string_view(memory, 2), "xx");
  EXPECT_NE(mft_.cmpiRealloc(mb_, nullptr, 1), nullptr);
  EXPECT_NE(mft_.cmpiMalloc(mb_, 0), nullptr);
  mft_.cmpiFree(mb_, memory);
}

TEST_F(MemoryTest, ClearsWhatIsAskedFor) {
  (void)std::memset(mft_.cmpiMalloc(mb_, 64), 'x', 64);
  request_.recycle();
  const auto* const memory = static_cast<const char*>(mft_.cmpiCalloc(mb_, 8, 8));
  EXPECT_EQ(std::string_view(memory, 64), std::string(64, '\0'));
  EXPECT_NE(mft_.cmpiCalloc(mb_, 8, 0), nullptr);
}

TEST_F(MemoryTest, RefusesTheImpossible) {
  EXPECT_EQ(mft_.cmpiMalloc(mb_, std::numeric_limits<std::size_t>::max()), nullptr);
  EXPECT_EQ(mft_.cmpiCalloc(mb_, std::numeric_limits<std::size_t>::max() / 2, 3), nullptr);
}

TEST_F(MemoryTest, CopiesText) {
  const char text[] = "text";
  char* const copy = mft_.cmpiStrDup(mb_, text);
  EXPECT_STREQ(copy, "text");
  EXPECT_NE(copy, text);
}

TEST_F(MemoryTest, AMarkTakesBackWhatFollowedIt) {
  const std::size_t before = request_.arena().footprint();
  for (int round = 0; round < 1000; ++round) {
    CMPIStatus status{CMPI_RC_ERROR, nullptr};
    CMPIGcStat* const mark = mft_.mark(mb_, &status);
    EXPECT_EQ(status.rc, CMPI_RC_OK);
    (void)newString("some text after the mark");
    EXPECT_EQ(mft_.release(mb_, mark).rc, CMPI_RC_OK);
  }
  EXPECT_EQ(request_.arena().footprint(), before);
}

TEST_F(MemoryTest, MarksNest) {
  const CMPIString* const outside = newString("outside");
  CMPIGcStat* const outer = mft_.mark(mb_, nullptr);
  const CMPIString* const between = newString("between");
  CMPIGcStat* const inner = mft_.mark(mb_, nullptr);
  (void)newString("inside");
  EXPECT_EQ(mft_.release(mb_, inner).rc, CMPI_RC_OK);
  EXPECT_EQ(textOf(between), "between");
  CMPIGcStat* const again = mft_.mark(mb_, nullptr);
  EXPECT_EQ(mft_.release(mb_, outer).rc, CMPI_RC_OK);
  EXPECT_EQ(mft_.release(mb_, again).rc, CMPI_RC_ERR_INVALID_HANDLE);
  EXPECT_EQ(textOf(outside), "outside");
}

TEST_F(MemoryTest, NothingIsRecycledWhileAMarkIsSet) {
  const CMPIString* const before = newString("before");
  CMPIGcStat* const mark = mft_.mark(mb_, nullptr);
  const CMPIString* const after = newString("after");
  request_.recycle();
  EXPECT_EQ(textOf(before) + textOf(after), "beforeafter");
  mft_.release(mb_, mark);
}

}  // namespace
}  // namespace cimom
