#include <Linux/InstanceId.h>
#include <gtest/gtest.h>

#include <sstream>
#include <string>

namespace {

using Oru::SoftwareInventoryProfileProvider::InstanceIdMaker;
using Oru::SoftwareInventoryProfileProvider::parentPathText;
using Oru::SoftwareInventoryProfileProvider::parseInstanceId;

std::string makeInstanceId(const std::string& parentText, const std::string& nodeText) {
  std::string instanceId = "what was there before is replaced";
  InstanceIdMaker().make(parentText, nodeText, instanceId);
  return instanceId;
}

TEST(InstanceId, ChildrenInARowAreMadeAsEachAlone) {
  InstanceIdMaker maker;
  std::string instanceId;
  for (const char* parent : {"", "1a", "1a", "", "xyz", "ff", "1a"}) {
    maker.make(parent, "f", instanceId);
    EXPECT_EQ(instanceId, makeInstanceId(parent, "f"));
  }
}

TEST(InstanceId, IsTheParentsNumberInDecimalAndTheNodesText) {
  EXPECT_EQ(makeInstanceId("1a", "xyz"), "26@xyz");
  EXPECT_EQ(makeInstanceId("FFFFFFFFFFFFFFFF", "f"), "18446744073709551615@f");
  EXPECT_EQ(makeInstanceId("0001a", "01"), "26@01");
}

TEST(InstanceId, TextsOfEveryLengthGoTogether) {
  // In every order of lengths, because the text that an InstanceID replaces may be longer or shorter.
  const std::string digits = "fedcba9876543210";
  InstanceIdMaker maker;
  std::string instanceId;
  for (std::size_t i = 0; i < std::size_t{17} * 18; ++i) {
    const std::string parent = digits.substr(0, i * 5 % 17);
    const std::string node = std::string("0123456789abcdefg").substr(0, i * 7 % 18);
    std::uint64_t number = 0;
    std::istringstream(parent) >> std::hex >> number;
    maker.make(parent, node, instanceId);
    EXPECT_EQ(instanceId, std::to_string(number) + "@" + node);
    EXPECT_EQ(instanceId.c_str()[instanceId.size()], '\0');
  }
}

TEST(InstanceId, AParentTextWithoutHexadecimalDigitsCountsAsZero) {
  EXPECT_EQ(makeInstanceId("", "f"), "0@f");
  EXPECT_EQ(makeInstanceId("xyz", "f"), "0@f");
  EXPECT_EQ(makeInstanceId("1ag", "f"), "26@f") << "reading stops at the first other character";
}

TEST(InstanceId, IsReadBack) {
  EXPECT_EQ(parseInstanceId("26@xyz").parent, 26U);
  EXPECT_EQ(parseInstanceId("26@xyz").pathText, "xyz");
  EXPECT_EQ(parseInstanceId(" 26 @ xyz more").pathText, "xyz");
  EXPECT_EQ(parseInstanceId("26#xyz").pathText, "xyz") << "any one character separates";
}

TEST(InstanceId, AfterAFailureNothingMoreIsRead) {
  EXPECT_EQ(parseInstanceId("12@").pathText, "");
  EXPECT_EQ(parseInstanceId("12").pathText, "");
  EXPECT_EQ(parseInstanceId("@xyz").pathText, "");
  EXPECT_EQ(parseInstanceId("99999999999999999999@xyz").parent, ~std::uint64_t{0});
  EXPECT_EQ(parseInstanceId("99999999999999999999@xyz").pathText, "");
}

TEST(InstanceId, ItsNumberIsTheParentsPathText) {
  EXPECT_EQ(parentPathText("26@xyz"), "1a");
  EXPECT_EQ(parentPathText("26"), "1a");
  EXPECT_EQ(parentPathText("other"), "0");
  EXPECT_EQ(parentPathText(""), "0");
  EXPECT_EQ(parentPathText("-1"), "ffffffffffffffff");
}

}  // namespace
