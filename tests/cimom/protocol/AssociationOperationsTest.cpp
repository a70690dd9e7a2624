#include "Fixture.h"

namespace {

using protocol_test::between;
using protocol_test::className;
using protocol_test::flag;
using protocol_test::Given;
using protocol_test::instanceName;
using protocol_test::names;
using protocol_test::properties;
using protocol_test::Protocol;
using protocol_test::text;
using protocol_test::texts;
using testing::Contains;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::Not;
using testing::SizeIs;
using testing::UnorderedElementsAre;

class AssociationOperations : public Protocol {
 protected:
  static Given from(std::string_view type, std::string_view name) {
    return {"ObjectName", instanceName(type, name)};
  }
  static Given from(std::string_view type) { return {"ObjectName", className(type)}; }
  static Given typed(const std::string& name, std::string_view type) { return {name, className(type)}; }

  std::vector<std::string> classPaths(const std::string& method, const std::vector<Given>& parameters) const {
    const std::string body = ask(method, parameters);
    EXPECT_EQ(between(body, "<OBJECTPATH>", "</OBJECTPATH>").size(),
              between(body, "<CLASSPATH>", "</").size());
    return between(body, "<CLASSNAME NAME=\"", "\"");
  }
};

TEST_F(AssociationOperations, followAnInstance) {
  const std::string body = ask("Associators", {from("TEST_Place", "here")});
  EXPECT_THAT(names(body), ElementsAre("TEST_Item a", "TEST_SubItem s"));
  EXPECT_THAT(between(body, "<VALUE.OBJECTWITHPATH>", "</VALUE.OBJECTWITHPATH>"), SizeIs(2));
  EXPECT_THAT(properties(body), Contains("Extra"));
  // Paths are whole: the host by which the client reached this server, and the namespace.
  EXPECT_THAT(body, HasSubstr("<HOST>server:5988</HOST>"));
  EXPECT_THAT(body, HasSubstr(R"(<NAMESPACE NAME="root"/><NAMESPACE NAME="test"/>)"));

  const std::string paths = ask("AssociatorNames", {from("TEST_Place", "here")});
  EXPECT_THAT(names(paths), ElementsAre("TEST_Item a", "TEST_SubItem s"));
  EXPECT_THAT(between(paths, "<OBJECTPATH><INSTANCEPATH>", "</INSTANCEPATH></OBJECTPATH>"), SizeIs(2));
}

TEST_F(AssociationOperations, followTheOtherDirection) {
  EXPECT_THAT(names(ask("AssociatorNames", {from("TEST_Item", "a")})), ElementsAre("TEST_Place here"));
  EXPECT_THAT(names(ask("Associators", {from("TEST_Item", "a")})), ElementsAre("TEST_Place here"));
}

TEST_F(AssociationOperations, narrow) {
  const Given place = from("TEST_Place", "here");
  for (const char* method : {"AssociatorNames", "Associators"}) {
    EXPECT_THAT(names(ask(method, {place, typed("AssocClass", "TEST_Dependency")})), SizeIs(2));
    EXPECT_THAT(names(ask(method, {place, typed("AssocClass", "TEST_Peer")})), IsEmpty());
    EXPECT_THAT(names(ask(method, {place, typed("ResultClass", "test_subitem")})),
                ElementsAre("TEST_SubItem s"));
    EXPECT_THAT(names(ask(method, {place, {"Role", text("ANTECEDENT")}})), SizeIs(2));
    EXPECT_THAT(names(ask(method, {place, {"Role", text("Dependent")}})), IsEmpty());
    EXPECT_THAT(names(ask(method, {place, {"ResultRole", text("Dependent")}})), SizeIs(2));
    EXPECT_THAT(names(ask(method, {place, {"ResultRole", text("Antecedent")}})), IsEmpty());
    expectError(4, method, {place, typed("AssocClass", "TEST_None")});
    expectError(4, method, {place, typed("ResultClass", "TEST_None")});
    expectError(4, method, {from("TEST_None", "x")});
  }
}

TEST_F(AssociationOperations, showWhatIsWanted) {
  const Given place = from("TEST_Place", "here");
  EXPECT_THAT(properties(ask("Associators", {place, {"PropertyList", texts({"Number"})}})),
              ElementsAre("Number", "Number"));
  EXPECT_THAT(ask("Associators", {place, flag("IncludeClassOrigin", true)}), HasSubstr("CLASSORIGIN"));
  EXPECT_THAT(ask("Associators", {place, flag("IncludeQualifiers", true)}), HasSubstr("What is counted"));
  EXPECT_THAT(properties(ask("References", {place, {"PropertyList", texts({"Note"})}})), ElementsAre("Note"));
}

TEST_F(AssociationOperations, findReferences) {
  const Given place = from("TEST_Place", "here");
  const std::string body = ask("References", {place});
  EXPECT_THAT(between(body, "<INSTANCE CLASSNAME=\"", "\""), ElementsAre("TEST_Holds"));
  EXPECT_THAT(body, HasSubstr("<PROPERTY.REFERENCE NAME=\"Antecedent\""));
  const std::string paths = ask("ReferenceNames", {place});
  EXPECT_THAT(between(paths, "<OBJECTPATH>", "</OBJECTPATH>"),
              ElementsAre(HasSubstr("CLASSNAME=\"TEST_Holds\"")));
  for (const char* method : {"References", "ReferenceNames"}) {
    EXPECT_THAT(ask(method, {place, typed("ResultClass", "TEST_Dependency")}), HasSubstr("\"TEST_Holds\""));
    EXPECT_THAT(ask(method, {place, typed("ResultClass", "TEST_Peer")}), Not(HasSubstr("\"TEST_Holds\"")));
    EXPECT_THAT(ask(method, {place, {"Role", text("Dependent")}}), Not(HasSubstr("\"TEST_Holds\"")));
    expectError(4, method, {place, typed("ResultClass", "TEST_None")});
  }
}

// A class's associations are those that the schema declares for it and for what it descends from.
TEST_F(AssociationOperations, followAClass) {
  EXPECT_THAT(classPaths("AssociatorNames", {from("TEST_Place")}),
              UnorderedElementsAre("TEST_Element", "TEST_Item"));
  EXPECT_THAT(classPaths("AssociatorNames", {from("TEST_SubItem")}),
              UnorderedElementsAre("TEST_Element", "TEST_Place", "TEST_Item"));
  EXPECT_THAT(classPaths("AssociatorNames", {from("TEST_Unserved")}), IsEmpty());
  const std::string body = ask("Associators", {from("TEST_Place"), typed("AssocClass", "TEST_Holds")});
  EXPECT_THAT(between(body, "<CLASS NAME=\"", "\""), ElementsAre("TEST_Item"));
  EXPECT_THAT(between(body, "<VALUE.OBJECTWITHPATH><CLASSPATH>", "</VALUE.OBJECTWITHPATH>"), SizeIs(1));
  EXPECT_THAT(properties(body), ElementsAre("Caption", "Name", "Number", "Text", "Tags"));
  EXPECT_THAT(body, Not(HasSubstr("QUALIFIER")));
}

TEST_F(AssociationOperations, narrowClasses) {
  const Given item = from("TEST_Item");
  EXPECT_THAT(classPaths("AssociatorNames", {item, typed("AssocClass", "TEST_Peer")}),
              ElementsAre("TEST_Item"));
  EXPECT_THAT(classPaths("AssociatorNames", {item, typed("ResultClass", "TEST_Place")}),
              ElementsAre("TEST_Place"));
  EXPECT_THAT(classPaths("AssociatorNames", {item, {"Role", text("one")}}), ElementsAre("TEST_Item"));
  EXPECT_THAT(classPaths("AssociatorNames", {item, {"ResultRole", text("Antecedent")}}),
              UnorderedElementsAre("TEST_Element", "TEST_Place"));
  EXPECT_THAT(classPaths("AssociatorNames", {item, {"Role", text("One")}, {"ResultRole", text("One")}}),
              IsEmpty());
  for (const char* method : {"AssociatorNames", "Associators", "ReferenceNames", "References"}) {
    expectError(4, method, {from("TEST_None")});
    expectError(4, method, {item, typed("ResultClass", "TEST_None")});
  }
  expectError(4, "AssociatorNames", {item, typed("AssocClass", "TEST_None")});
}

TEST_F(AssociationOperations, findReferencesOfAClass) {
  EXPECT_THAT(classPaths("ReferenceNames", {from("TEST_Place")}),
              ElementsAre("TEST_Dependency", "TEST_Holds"));
  EXPECT_THAT(classPaths("ReferenceNames", {from("TEST_DeepItem")}),
              ElementsAre("TEST_Dependency", "TEST_Holds", "TEST_Peer"));
  EXPECT_THAT(classPaths("ReferenceNames", {from("TEST_Item"), typed("ResultClass", "TEST_Peer")}),
              ElementsAre("TEST_Peer"));
  EXPECT_THAT(classPaths("ReferenceNames", {from("TEST_Item"), {"Role", text("Antecedent")}}),
              ElementsAre("TEST_Dependency"));
  const std::string body =
      ask("References", {from("TEST_Item"), typed("ResultClass", "TEST_Peer"),
                         flag("IncludeQualifiers", true), flag("IncludeClassOrigin", true)});
  EXPECT_THAT(between(body, "<CLASS NAME=\"", "\""), ElementsAre("TEST_Peer"));
  EXPECT_THAT(body, HasSubstr("QUALIFIER NAME=\"Association\""));
  EXPECT_THAT(body, HasSubstr("CLASSORIGIN=\"TEST_Peer\""));
}

}  // namespace
