#include "Fixture.h"

#include <stdexcept>

namespace cimom {
namespace {

TEST(ClassTable, FindsNamesWhateverTheirCase) {
  const ClassTable table(testModel());
  for (const char* name : {"Test_Thing", "test_thing", "TEST_THING"}) {
    ASSERT_NE(table.find(name), nullptr) << name;
    EXPECT_EQ(table.find(name)->name(), "Test_Thing");
    EXPECT_EQ(table.find(name)->find("rEAL64")->name, "Real64");
  }
  EXPECT_EQ(table.find("Test_Thin"), nullptr);
  EXPECT_EQ(table.find(""), nullptr);
  EXPECT_EQ(table.find("Test_Thing")->find("Real65"), nullptr);
}

// The hash looks at eight bytes at either end: names that differ only between must still be told apart.
TEST(ClassTable, TellsNamesApartThatDifferInTheMiddle) {
  ListedModel model;
  ClassDeclaration declared{"C", "", {}};
  for (char middle = 'a'; middle <= 'z'; ++middle) {
    declared.properties.push_back({std::string("CommonFront") + middle + "CommonBack", CMPI_uint8});
  }
  model.classes.push_back(declared);
  const ClassTable table(model);
  for (const PropertyDeclaration& property : declared.properties) {
    ASSERT_NE(table.find("c")->find(property.name), nullptr);
    EXPECT_EQ(table.find("c")->find(property.name)->name, property.name);
  }
}

// Setting one bit folds letters, and "@" with "`" as well: a comparison must follow.
TEST(ClassTable, FoldsLettersAlone) {
  ListedModel model;
  model.classes.push_back({"A@", "", {}});
  const ClassTable table(model);
  EXPECT_NE(table.find("a@"), nullptr);
  EXPECT_EQ(table.find("a`"), nullptr);
}

TEST(ClassTable, KnowsAncestry) {
  const ClassTable table(testModel());
  EXPECT_TRUE(table.isA("test_thing", "TEST_BASE"));
  EXPECT_TRUE(table.isA("Test_Thing", "test_thing"));
  EXPECT_FALSE(table.isA("Test_Base", "Test_Thing"));
  EXPECT_FALSE(table.isA("Test_Link", "Test_Base"));
  EXPECT_FALSE(table.isA("Unknown", "Test_Base"));
  EXPECT_FALSE(table.isA("Test_Base", "Unknown"));
  EXPECT_TRUE(table.isA("Unknown", "UNKNOWN"));
}

TEST(ClassTable, KnowsKeysInOrder) {
  const ClassTable table(testModel());
  const ClassInfo& link = *table.find("Test_Link");
  ASSERT_EQ(link.keys().size(), 2U);
  EXPECT_EQ(link.properties()[link.keys()[0]].name, "Left");
  EXPECT_EQ(link.properties()[link.keys()[1]].name, "Right");
  EXPECT_EQ(table.find("Test_Thing")->superClass(), table.find("Test_Base"));
}

TEST(ClassTable, IsEmptyForAnEmptyModel) {
  EXPECT_EQ(ClassTable(ListedModel()).find("Any"), nullptr);
}

TEST(ClassTable, RefusesAMissingSuperclass) {
  ListedModel model;
  model.classes.push_back({"Below", "Missing", {}});
  EXPECT_THROW(ClassTable table(model), std::invalid_argument);
}

TEST(ClassTable, RefusesAncestryInACircle) {
  ListedModel model;
  model.classes.push_back({"A", "B", {}});
  model.classes.push_back({"B", "A", {}});
  EXPECT_THROW(ClassTable table(model), std::invalid_argument);
}

}  // namespace
}  // namespace cimom
