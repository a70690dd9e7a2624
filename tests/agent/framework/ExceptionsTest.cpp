#include <Oru/Exceptions.h>

#include <gtest/gtest.h>

#include <string>

namespace {

template <typename Exception>
class ExceptionsTest : public ::testing::Test {};

using Exceptions =
    ::testing::Types<Oru::InstrumentationException, Oru::FrameworkException, Oru::ProviderException>;
TYPED_TEST_SUITE(ExceptionsTest, Exceptions);

TYPED_TEST(ExceptionsTest, HoldsACopyOfItsMessage) {
  std::string message = "no such node";
  const TypeParam exception(message.c_str());
  message.assign(message.size(), 'x');
  EXPECT_STREQ(exception.what(), "no such node");
  EXPECT_STREQ(TypeParam(nullptr).what(), "");
}

TYPED_TEST(ExceptionsTest, IsCaughtByItsOwnTypeAndAsAStandardException) {
  EXPECT_THROW(throw TypeParam("x"), TypeParam);
  EXPECT_THROW(throw TypeParam("x"), std::exception);
}

TYPED_TEST(ExceptionsTest, IsCopiedAndAssigned) {
  TypeParam exception("first");
  const TypeParam copy(exception);
  exception = TypeParam("second");
  EXPECT_STREQ(copy.what(), "first");
  EXPECT_STREQ(exception.what(), "second");
}

}  // namespace
