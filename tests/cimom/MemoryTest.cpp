#include "LiveBytes.h"
#include "Operations.h"

#include <algorithm>

namespace {

using memory_test::liveBytes;

/// Longer texts, such as names of classes with more digits.
constexpr std::size_t tolerance = 1024;

class Memory : public operations_test::Operations {
 protected:
  /// By how much the program's memory grew at most, seen at each object of an enumeration of the class.
  std::size_t growth(std::string_view className, std::size_t expected) {
    std::size_t most = 0;
    std::size_t seen = 0;
    const std::size_t before = liveBytes();
    const auto sink = [&](const cimom::Instance& instance) {
      most = std::max(most, liveBytes());
      seen += cimom::text(instance.find("Name")->data).value_or("").starts_with("object ") ? 1 : 0;
      return true;
    };
    EXPECT_EQ(manager_.enumerateInstances("root/test", className, std::nullopt, sink).status.code,
              CMPI_RC_OK);
    EXPECT_EQ(seen, expected);
    return most - before;
  }

  std::size_t growthOfNames(std::string_view className) {
    std::size_t most = 0;
    const std::size_t before = liveBytes();
    const auto sink = [&](const cimom::ObjectPath&) {
      most = std::max(most, liveBytes());
      return true;
    };
    EXPECT_EQ(manager_.enumerateInstanceNames("root/test", className, sink).status.code, CMPI_RC_OK);
    return most - before;
  }

  void SetUp() override {
    // The provider is loaded, and whatever is made once is made.
    growth("TEST_Plain100", 100);
    growth("TEST_Walking100", 100);
  }
};

TEST_F(Memory, doesNotGrowWithTheAnswerOfAProviderThatKeepsNothing) {
  const std::size_t atHundred = growth("TEST_Plain100", 100);
  EXPECT_LT(growth("TEST_Plain10000", 10'000), atHundred + tolerance);
  EXPECT_LT(growth("TEST_Plain100000", 100'000), atHundred + tolerance);
  EXPECT_LT(growthOfNames("TEST_Plain10000"), growthOfNames("TEST_Plain100") + tolerance);
}

// The standard's lifetime, and the proof that the measure sees memory grow.
TEST_F(Memory, growsWithTheAnswerOfAnyOtherProvider) {
  EXPECT_GT(growth("TEST_Lasting10000", 10'000), growth("TEST_Lasting100", 100) + 10'000UL * 100);
}

// What an upcall was answered with is there until the request ends. What is read of it does not add up.
TEST_F(Memory, doesNotGrowWithTheReadingOfAnUpcallsAnswer) {
  EXPECT_LT(growth("TEST_Walking10000", 10'000), growth("TEST_Walking100", 100) + tolerance);
}

// The answers of a provider that asks others again for each object do add up: they live as long as its
// request.
TEST_F(Memory, growsWithTheNumberOfUpcalls) {
  const std::size_t grown = growth("TEST_Asking10000", 10'000) - growth("TEST_Asking100", 100);
  RecordProperty("bytesOfAnUpcall", static_cast<int>(grown / 9900));
  EXPECT_GT(grown, 9900UL * 100);
  EXPECT_LT(grown, 9900UL * 2000);
}

}  // namespace
