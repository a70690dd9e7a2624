#include <Oru/Moniker.h>

#include <gtest/gtest.h>

#include <iomanip>
#include <sstream>
#include <string>

namespace {

using Oru::Moniker;

std::string text(Moniker moniker) {
  std::string all;
  for (unsigned int i = 0; moniker.selectKey(i); ++i) {
    std::string name;
    std::string value;
    if (moniker.getName(name) && moniker.getValue(value)) {
      all += name + '=' + value + ';';
    }
  }
  return all;
}

TEST(Moniker, IsEmptyAtFirst) {
  Moniker moniker;
  EXPECT_EQ(moniker.getKeyCount(), 0U);
  EXPECT_FALSE(moniker.selectKey(0));
  std::string untouched = "as it was";
  EXPECT_FALSE(moniker.getName(untouched));
  EXPECT_FALSE(moniker.getValue(untouched));
  EXPECT_EQ(untouched, "as it was");
}

TEST(Moniker, KeepsKeysInOrderAndTwice) {
  Moniker moniker;
  moniker.addKey("Name", "atlas");
  moniker.addKey("DeviceID", "0000:3b:00.0/1");
  moniker.addKey("Name", "");
  EXPECT_EQ(moniker.getKeyCount(), 3U);
  EXPECT_EQ(text(moniker), "Name=atlas;DeviceID=0000:3b:00.0/1;Name=;");
}

TEST(Moniker, KeepsItsSelectionWhereThereIsNoSuchKey) {
  Moniker moniker;
  moniker.addKey("a", "1");
  moniker.addKey("b", "2");
  std::string name;
  EXPECT_FALSE(moniker.getName(name)) << "adding selects nothing";
  ASSERT_TRUE(moniker.selectKey(1));
  EXPECT_FALSE(moniker.selectKey(2));
  EXPECT_FALSE(moniker.selectKey(0xffffffffU));
  ASSERT_TRUE(moniker.getName(name));
  EXPECT_EQ(name, "b");
  moniker.addKey("c", "3");
  ASSERT_TRUE(moniker.getName(name));
  EXPECT_EQ(name, "b");
}

TEST(Moniker, CopiesKeysAndSelectionAndIsIndependentThen) {
  Moniker moniker;
  moniker.addKey("a", "1");
  moniker.addKey("b", "2");
  ASSERT_TRUE(moniker.selectKey(1));
  const Moniker copy(moniker);
  moniker.addKey("c", "3");
  ASSERT_TRUE(moniker.selectKey(0));
  std::string value;
  ASSERT_TRUE(copy.getValue(value));
  EXPECT_EQ(value, "2");
  EXPECT_EQ(text(copy), "a=1;b=2;");
}

TEST(Moniker, IsAssigned) {
  Moniker moniker;
  moniker.addKey("a", "1");
  Moniker other;
  other.addKey("b", "2");
  other = moniker;
  EXPECT_EQ(text(other), "a=1;");
  const Moniker& same = other;
  other = same;
  EXPECT_EQ(text(other), "a=1;");
}

TEST(Moniker, TextsArePrintedWithoutWidthAndFill) {
  std::ostringstream stream;
  stream << std::setw(9) << std::setfill('*');
  Oru::operator<<(stream, std::string("a\0b", 3));
  EXPECT_EQ(stream.str(), std::string("a\0b", 3));
}

}  // namespace
