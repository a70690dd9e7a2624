#include "Fixture.h"

namespace {

using protocol_test::between;
using protocol_test::className;
using protocol_test::flag;
using protocol_test::Given;
using protocol_test::properties;
using protocol_test::Protocol;
using protocol_test::texts;
using testing::AllOf;
using testing::Contains;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::Not;
using testing::SizeIs;

class ClassOperations : public Protocol {
 protected:
  static Given named(std::string_view name) { return {"ClassName", className(name)}; }
  static std::vector<std::string> classesIn(const std::string& body) {
    return between(body, "<CLASS NAME=\"", "\"");
  }
  static std::vector<std::string> classNamesIn(const std::string& body) {
    return between(body, "<CLASSNAME NAME=\"", "\"");
  }
};

TEST_F(ClassOperations, getOneClass) {
  const std::string body = ask("GetClass", {named("test_ITEM")});
  EXPECT_THAT(classesIn(body), ElementsAre("TEST_Item"));
  EXPECT_THAT(body, HasSubstr("SUPERCLASS=\"TEST_Element\""));
  EXPECT_THAT(body, HasSubstr("<METHOD NAME=\"Reset\""));
}

// LocalOnly and IncludeQualifiers are true where they are not given, IncludeClassOrigin is false.
TEST_F(ClassOperations, getOneClassWithTheDefaults) {
  const std::string body = ask("GetClass", {named("TEST_Item")});
  EXPECT_THAT(properties(body), ElementsAre("Name", "Number", "Text", "Tags"));
  EXPECT_THAT(body, HasSubstr("<PROPERTY.ARRAY NAME=\"Tags\""));
  EXPECT_THAT(body, HasSubstr("What is counted"));
  EXPECT_THAT(body, Not(HasSubstr("CLASSORIGIN")));
}

TEST_F(ClassOperations, getInheritedFeatures) {
  const std::string body = ask("GetClass", {named("TEST_SubItem"), flag("LocalOnly", false)});
  EXPECT_THAT(properties(body), ElementsAre("Caption", "Name", "Number", "Text", "Tags", "Extra"));
  EXPECT_THAT(body, HasSubstr("<METHOD NAME=\"Reset\""));
  EXPECT_THAT(properties(ask("GetClass", {named("TEST_SubItem")})), ElementsAre("Text", "Extra"));
  EXPECT_THAT(properties(ask("GetClass", {named("TEST_DeepItem")})), IsEmpty());
}

TEST_F(ClassOperations, leaveQualifiersOut) {
  EXPECT_THAT(ask("GetClass", {named("TEST_Item"), flag("IncludeQualifiers", false)}),
              Not(HasSubstr("QUALIFIER")));
  EXPECT_THAT(ask("EnumerateClasses", {flag("IncludeQualifiers", false)}), Not(HasSubstr("QUALIFIER")));
}

TEST_F(ClassOperations, tellTheOriginOfFeatures) {
  const std::string body =
      ask("GetClass", {named("TEST_SubItem"), flag("LocalOnly", false), flag("IncludeClassOrigin", true)});
  EXPECT_THAT(between(body, "CLASSORIGIN=\"", "\""),
              AllOf(Contains("TEST_Element"), Contains("TEST_Item"), Contains("TEST_SubItem")));
}

TEST_F(ClassOperations, takeAPropertyList) {
  const Given wanted{"PropertyList", texts({"NUMBER", "number", "Nothing"})};
  EXPECT_THAT(properties(ask("GetClass", {named("TEST_Item"), wanted})), ElementsAre("Number"));
  const std::string none = ask("GetClass", {named("TEST_Item"), {"PropertyList", "<VALUE.ARRAY/>"}});
  EXPECT_THAT(properties(none), IsEmpty());
  EXPECT_THAT(properties(ask("GetClass", {named("TEST_Item"), {"PropertyList", ""}})), SizeIs(4));
}

TEST_F(ClassOperations, saySoWhereThereIsNoSuchClass) {
  EXPECT_THAT(expectError(6, "GetClass", {named("TEST_None")}), HasSubstr("TEST_None"));
  expectError(5, "EnumerateClasses", {named("TEST_None")});
  expectError(5, "EnumerateClassNames", {named("TEST_None")});
}

TEST_F(ClassOperations, enumerateTheTop) {
  EXPECT_THAT(classNamesIn(ask("EnumerateClassNames")),
              AllOf(Contains("TEST_Element"), Contains("TEST_Peer"), Not(Contains("TEST_Item"))));
  EXPECT_THAT(classesIn(ask("EnumerateClasses")),
              AllOf(Contains("TEST_Element"), Contains("TEST_Peer"), Not(Contains("TEST_Item"))));
}

TEST_F(ClassOperations, enumerateEverything) {
  const std::vector<std::string> all =
      classNamesIn(ask("EnumerateClassNames", {flag("DeepInheritance", true)}));
  EXPECT_THAT(all, AllOf(Contains("TEST_Element"), Contains("TEST_DeepItem"), Contains("TEST_Holds")));
  EXPECT_EQ(classesIn(ask("EnumerateClasses", {flag("DeepInheritance", true)})), all);
}

TEST_F(ClassOperations, enumerateBelowAClass) {
  const Given deep = flag("DeepInheritance", true);
  EXPECT_THAT(classNamesIn(ask("EnumerateClassNames", {named("TEST_Item")})), ElementsAre("TEST_SubItem"));
  EXPECT_THAT(classNamesIn(ask("EnumerateClassNames", {named("TEST_Item"), deep})),
              ElementsAre("TEST_SubItem", "TEST_DeepItem"));
  EXPECT_THAT(classesIn(ask("EnumerateClasses", {named("TEST_Item")})), ElementsAre("TEST_SubItem"));
  EXPECT_THAT(classesIn(ask("EnumerateClasses", {named("TEST_Item"), deep})),
              ElementsAre("TEST_SubItem", "TEST_DeepItem"));
  EXPECT_THAT(classNamesIn(ask("EnumerateClassNames", {named("TEST_Unserved")})), IsEmpty());
}

TEST_F(ClassOperations, enumerateLocalOrInheritedFeatures) {
  EXPECT_THAT(properties(ask("EnumerateClasses", {named("TEST_Item")})), ElementsAre("Text", "Extra"));
  EXPECT_THAT(properties(ask("EnumerateClasses", {named("TEST_Item"), flag("LocalOnly", false)})),
              ElementsAre("Caption", "Name", "Number", "Text", "Tags", "Extra"));
}

}  // namespace
