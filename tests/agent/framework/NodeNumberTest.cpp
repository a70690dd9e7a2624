// Numbers of nodes: what they are made of, and that they stay what they are.
#include <agent/framework/NodeTree.h>

#include <gtest/gtest.h>

#include <array>
#include <cstdio>
#include <random>
#include <string>
#include <vector>

namespace agent {
namespace {

using namespace Oru::NodeLexicon;

/// FNV-1a and the SplitMix64 finaliser written down a second time, by their published definitions (bytes one
/// by one, multiplication by the 64-bit FNV prime 1099511628211), so that the numbers below do not rest on
/// the code they test.
NodeNumber numberByDefinition(int type, const std::string& position, const std::vector<int>& suffix = {}) {
  std::vector<int> bytes{type % 256, type / 256 % 256, type / 65536 % 256, type / 16777216};
  for (const char character : position) {
    bytes.push_back(static_cast<unsigned char>(character));
  }
  bytes.insert(bytes.end(), suffix.begin(), suffix.end());
  std::uint64_t hash = 14695981039346656037U;
  for (const int byte : bytes) {
    hash ^= static_cast<std::uint64_t>(byte);
    hash *= 1099511628211U;
  }
  hash = (hash ^ (hash / (1ULL << 30U))) * 13787848793156543929U;
  hash = (hash ^ (hash / (1ULL << 27U))) * 10723151780598845931U;
  hash = hash ^ (hash / (1ULL << 31U));
  return (hash ^ (hash / (1ULL << 60U))) % (1ULL << 60U);
}

TEST(NodeNumber, FollowsItsPublishedDefinition) {
  for (const int type : {2, 3, 12, 40, 43, 44, 49, 0, 255, 256, 1000, 2147483647}) {
    for (const char* position :
         {"", "bios", "0000:3b:00.0", "0000:3b:00.0/1", "driver:e1000", "Gr\xC3\xBC\xC3\x9F"}) {
      EXPECT_EQ(numberFor(type, position), numberByDefinition(type, position)) << type << ' ' << position;
    }
  }
  EXPECT_EQ(numberFor(FirmwareNode, "x", 2), numberByDefinition(FirmwareNode, "x", {0, 2, 0, 0, 0}));
  EXPECT_EQ(numberFor(FirmwareNode, "x", 70000),
            numberByDefinition(FirmwareNode, "x", {0, 0x70, 0x11, 1, 0}));
}

// InstanceIDs of every machine are made of these: a change here breaks what clients have stored. The values
// were computed by a Python script of the definition, not by this library.
TEST(NodeNumber, StaysTheSameForEver) {
  EXPECT_EQ(pathText(numberFor(FirmwareNode, "bios")), "a1f98e803e58ca6");
  EXPECT_EQ(pathText(numberFor(FirmwareNode, "bmc")), "b3512e37f41e292");
  EXPECT_EQ(pathText(numberFor(NetworkDeviceNode, "0000:3b:00.0")), "135000c11501d23");
  EXPECT_EQ(pathText(numberFor(NetworkPortNode, "0000:3b:00.0/1")), "48783f91712ec3b");
  EXPECT_EQ(pathText(numberFor(DriverNode, "driver:e1000")), "260253a337ea015");
  EXPECT_EQ(pathText(numberFor(FirmwareNode, "bios", 2)), "339d8c6e45def21");
}

TEST(NodeNumber, OfTheComputerIsOne) {
  EXPECT_EQ(numberFor(ComputerSystemNode, "computer"), 1U);
  EXPECT_NE(numberFor(ComputerSystemNode, "computer", 2), 1U);
  EXPECT_NE(numberFor(ComputerSystemNode, "computer2"), 1U);
  EXPECT_NE(numberFor(FirmwareNode, "computer"), 1U);
}

TEST(NodeNumber, HasAtMostFifteenDigitsAndIsNeverZeroOrOne) {
  for (int i = 0; i < 100'000; ++i) {
    const NodeNumber number = numberFor(DriverNode, "module" + std::to_string(i));
    ASSERT_GT(number, computerNumber);
    ASSERT_LE(pathText(number).size(), 15U);
  }
}

TEST(PathText, IsLowerCaseHexadecimalWithoutLeadingZeros) {
  EXPECT_EQ(pathText(0), "0");
  EXPECT_EQ(pathText(1), "1");
  EXPECT_EQ(pathText(0xf), "f");
  EXPECT_EQ(pathText(0x10), "10");
  EXPECT_EQ(pathText(0xABCDEF0123456789U), "abcdef0123456789");
  EXPECT_EQ(pathText(overflowNumber), "ffffffffffffffff");
}

TEST(PathText, AgreesWithTheCLibraryAndReadsBack) {
  std::mt19937_64 random(20240611);
  for (int i = 0; i < 100'000; ++i) {
    const NodeNumber number = random() >> (random() % 64);
    std::array<char, 32> expected{};
    static_cast<void>(
        std::snprintf(expected.data(), expected.size(), "%llx", static_cast<unsigned long long>(number)));
    ASSERT_EQ(pathText(number), expected.data());
    ASSERT_EQ(numberFromText(expected.data()), number);
  }
}

TEST(NumberFromText, TakesDigitsOfEitherCaseWithLeadingZeros) {
  EXPECT_EQ(numberFromText("1A"), 0x1aU);
  EXPECT_EQ(numberFromText("00000000000000000000001a"), 0x1aU);
  EXPECT_EQ(numberFromText("000"), 0U);
  EXPECT_EQ(numberFromText("ffffffffffffffff"), overflowNumber);
}

TEST(NumberFromText, RefusesWhatIsNotWhollyHexadecimalOrTooBig) {
  for (const char* text : {"", " 1a", "1a ", "+1", "-1", "0x1a", "xyz", "1g", "10000000000000000", "1\n"}) {
    EXPECT_EQ(numberFromText(text), std::nullopt) << text;
  }
  EXPECT_EQ(numberFromText(std::string_view("1\0", 2)), std::nullopt);
}

}  // namespace
}  // namespace agent
