#include "Fixture.h"

namespace {

using protocol_test::between;
using protocol_test::className;
using protocol_test::errorCode;
using protocol_test::flag;
using protocol_test::Given;
using protocol_test::instanceName;
using protocol_test::names;
using protocol_test::properties;
using protocol_test::Protocol;
using protocol_test::request;
using protocol_test::text;
using protocol_test::texts;
using testing::Contains;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::Not;
using testing::SizeIs;

class InstanceOperations : public Protocol {
 protected:
  static Given ofClass(std::string_view name) { return {"ClassName", className(name)}; }
  static Given instance(std::string_view name, std::string_view type = "TEST_Item") {
    return {"InstanceName", instanceName(type, name)};
  }
  static std::string item(const std::string& name, const std::string& more = "") {
    return R"(<INSTANCE CLASSNAME="TEST_Item"><PROPERTY NAME="Name" TYPE="string"><VALUE>)" + name +
           "</VALUE></PROPERTY>" + more + "</INSTANCE>";
  }
  static std::string number(const std::string& value, const std::string& type = "uint32") {
    return R"(<PROPERTY NAME="number" TYPE=")" + type + "\"><VALUE>" + value + "</VALUE></PROPERTY>";
  }
  static Given modified(const std::string& name, const std::string& element) {
    return {"ModifiedInstance",
            "<VALUE.NAMEDINSTANCE>" + instanceName("TEST_Item", name) + element + "</VALUE.NAMEDINSTANCE>"};
  }
};

TEST_F(InstanceOperations, enumerateInstances) {
  const std::string body = ask("EnumerateInstances", {ofClass("test_item")});
  EXPECT_THAT(names(body), ElementsAre("TEST_Item a", "TEST_Item b", "TEST_SubItem s"));
  EXPECT_THAT(between(body, "<VALUE.NAMEDINSTANCE>", "</VALUE.NAMEDINSTANCE>"), SizeIs(3));
  EXPECT_THAT(body, HasSubstr("a &lt; b"));
  EXPECT_THAT(between(body, "<INSTANCE CLASSNAME=\"", "\""),
              ElementsAre("TEST_Item", "TEST_Item", "TEST_SubItem"));
}

TEST_F(InstanceOperations, enumerateNames) {
  const std::string body = ask("EnumerateInstanceNames", {ofClass("TEST_Item")});
  EXPECT_THAT(names(body), ElementsAre("TEST_Item a", "TEST_Item b", "TEST_SubItem s"));
  EXPECT_THAT(body, Not(HasSubstr("<INSTANCE ")));
  EXPECT_THAT(body, Not(HasSubstr("PATH")));
}

TEST_F(InstanceOperations, enumerateNothing) {
  EXPECT_THAT(ask("EnumerateInstances", {ofClass("TEST_Empty")}), HasSubstr("<IRETURNVALUE></IRETURNVALUE>"));
  EXPECT_THAT(ask("EnumerateInstanceNames", {ofClass("TEST_Empty")}),
              HasSubstr("<IRETURNVALUE></IRETURNVALUE>"));
}

// Each instance has what its own class adds, unless the client wants only what the named class has.
TEST_F(InstanceOperations, showSubclassesPropertiesIfWanted) {
  EXPECT_THAT(properties(ask("EnumerateInstances", {ofClass("TEST_Item")})), Contains("Extra"));
  EXPECT_THAT(properties(ask("EnumerateInstances", {ofClass("TEST_Item"), flag("DeepInheritance", true)})),
              Contains("Extra"));
  const std::string shallow =
      ask("EnumerateInstances", {ofClass("TEST_Item"), flag("DeepInheritance", false)});
  EXPECT_THAT(properties(shallow), Not(Contains("Extra")));
  EXPECT_THAT(names(shallow), Contains("TEST_SubItem s"));
}

TEST_F(InstanceOperations, showLocalPropertiesIfWanted) {
  EXPECT_THAT(properties(ask("EnumerateInstances", {ofClass("TEST_Item")})), Contains("Caption"));
  EXPECT_THAT(properties(ask("GetInstance", {instance("a")})), Contains("Caption"));
  const std::string local = ask("EnumerateInstances", {ofClass("TEST_Item"), flag("LocalOnly", true)});
  EXPECT_THAT(properties(local), Not(Contains("Caption")));
  EXPECT_THAT(properties(local), Contains("Number"));
  EXPECT_THAT(properties(ask("GetInstance", {instance("a"), flag("LocalOnly", true)})),
              ElementsAre("Name", "Number", "Text", "Tags"));
  EXPECT_THAT(properties(ask("GetInstance", {instance("a"), flag("LocalOnly", false)})), Contains("Caption"));
}

TEST_F(InstanceOperations, showThePropertiesThatAreListed) {
  const Given wanted{"PropertyList", texts({"nUmBeR", "Number", "NoSuch"})};
  EXPECT_THAT(properties(ask("EnumerateInstances", {ofClass("TEST_Item"), wanted})),
              ElementsAre("Number", "Number", "Number"));
  EXPECT_THAT(properties(ask("GetInstance", {instance("a"), wanted})), ElementsAre("Number"));
  const Given none{"PropertyList", "<VALUE.ARRAY></VALUE.ARRAY>"};
  const std::string bare = ask("EnumerateInstances", {ofClass("TEST_Item"), none});
  EXPECT_THAT(properties(bare), IsEmpty());
  EXPECT_THAT(names(bare), SizeIs(3));
  // What a list names must pass the other conditions too.
  EXPECT_THAT(properties(ask("EnumerateInstances", {ofClass("TEST_Item"),
                                                    flag("DeepInheritance", false),
                                                    {"PropertyList", texts({"Extra", "Number"})}})),
              ElementsAre("Number", "Number", "Number"));
}

TEST_F(InstanceOperations, showOriginsAndQualifiersIfWanted) {
  EXPECT_THAT(ask("GetInstance", {instance("a")}), Not(HasSubstr("CLASSORIGIN")));
  EXPECT_THAT(ask("GetInstance", {instance("a")}), Not(HasSubstr("QUALIFIER")));
  EXPECT_THAT(ask("GetInstance", {instance("a"), flag("IncludeClassOrigin", true)}),
              HasSubstr("CLASSORIGIN=\"TEST_Element\""));
  EXPECT_THAT(ask("EnumerateInstances", {ofClass("TEST_Item"), flag("IncludeClassOrigin", true)}),
              HasSubstr("CLASSORIGIN=\"TEST_SubItem\""));
  EXPECT_THAT(ask("GetInstance", {instance("a"), flag("IncludeQualifiers", true)}),
              HasSubstr("What is counted"));
}

TEST_F(InstanceOperations, getOneInstance) {
  const std::string body = ask("GetInstance", {instance("a", "test_ITEM")});
  EXPECT_THAT(between(body, "<INSTANCE CLASSNAME=\"", "\""), ElementsAre("TEST_Item"));
  EXPECT_THAT(names(body), IsEmpty());
  EXPECT_THAT(expectError(6, "GetInstance", {instance("none")}), HasSubstr("not found"));
  expectError(5, "GetInstance", {instance("a", "TEST_None")});
}

TEST_F(InstanceOperations, refuseKeysThatDoNotFit) {
  const auto keyed = [](const std::string& keys) {
    return std::vector<Given>{
        {"InstanceName", "<INSTANCENAME CLASSNAME=\"TEST_Item\">" + keys + "</INSTANCENAME>"}};
  };
  const std::string name = R"(<KEYBINDING NAME="Name"><KEYVALUE>a</KEYVALUE></KEYBINDING>)";
  EXPECT_THAT(properties(ask("GetInstance", keyed(name))), Contains("Number"));
  expectError(4, "GetInstance", keyed(""));
  expectError(4, "GetInstance", keyed(R"(<KEYBINDING NAME="Nam"><KEYVALUE>a</KEYVALUE></KEYBINDING>)"));
  expectError(4, "GetInstance",
              keyed(name + R"(<KEYBINDING NAME="More"><KEYVALUE>a</KEYVALUE></KEYBINDING>)"));
  expectError(4, "GetInstance", keyed(name + name));
}

TEST_F(InstanceOperations, stayInTheNamespaceOfTheRequest) {
  EXPECT_EQ(expectError(3, "EnumerateInstances", {ofClass("TEST_Item")}, "root/none"),
            "there is no namespace root/none");
  expectError(3, "GetInstance", {instance("a")}, "none");
  expectError(3, "GetClass", {ofClass("TEST_Item")}, "root/none");
  expectError(3, "CloseEnumeration", {{"EnumerationContext", text("x")}}, "root/none");
  EXPECT_THAT(names(send(request("EnumerateInstances", {ofClass("TEST_Item")}, "ROOT/Other")).body),
              SizeIs(3));
  const std::string path =
      R"(<VALUE.REFERENCE><LOCALINSTANCEPATH><LOCALNAMESPACEPATH><NAMESPACE NAME="root"/>)"
      R"(<NAMESPACE NAME="other"/></LOCALNAMESPACEPATH>)" +
      instanceName("TEST_Item", "a") + "</LOCALINSTANCEPATH></VALUE.REFERENCE>";
  EXPECT_THAT(expectError(4, "GetInstance", {{"InstanceName", path}}), HasSubstr("root/other"));
}

TEST_F(InstanceOperations, sayWhereThereIsNoSuchClassOrProvider) {
  for (const char* method : {"EnumerateInstances", "EnumerateInstanceNames"}) {
    EXPECT_THAT(expectError(5, method, {ofClass("TEST_None")}), HasSubstr("TEST_None"));
    expectError(7, method, {ofClass("TEST_Unserved")});
  }
}

TEST_F(InstanceOperations, passOnWhatTheProviderSays) {
  EXPECT_EQ(expectError(2, "EnumerateInstances", {ofClass("TEST_Refused")}),
            "access to this resource is denied");
  // A status of CMPI's own is no status of CIM.
  EXPECT_THAT(expectError(1, "EnumerateInstances", {ofClass("TEST_Broken")}), HasSubstr("100"));
}

TEST_F(InstanceOperations, takeAnAnswerWithoutItsDoneMarkerAsItIs) {
  EXPECT_THAT(names(ask("EnumerateInstances", {ofClass("TEST_NoDone")})), ElementsAre("TEST_NoDone first"));
  EXPECT_EQ(manager_.unfinishedAnswers(), 1U);
}

TEST_F(InstanceOperations, create) {
  const std::string body = ask("CreateInstance", {{"NewInstance", item("new", number("5"))}});
  EXPECT_THAT(names(body), ElementsAre("TEST_Item new made"));
  EXPECT_THAT(log_.all(), Contains("call: create Name=new Number=5"));
  EXPECT_EQ(expectError(11, "CreateInstance", {{"NewInstance", item("a")}}), "it is there");
}

TEST_F(InstanceOperations, createNothingThatTheClassDoesNotHave) {
  expectError(
      12, "CreateInstance",
      {{"NewInstance", item("new", R"(<PROPERTY NAME="No" TYPE="string"><VALUE>x</VALUE></PROPERTY>)")}});
  expectError(13, "CreateInstance", {{"NewInstance", item("new", number("5", "string"))}});
  const int code =
      errorCode(send(request("CreateInstance", {{"NewInstance", item("new", number("five"))}})).body);
  EXPECT_TRUE(code == 4 || code == 13) << code;
  expectError(5, "CreateInstance", {{"NewInstance", "<INSTANCE CLASSNAME=\"TEST_None\"/>"}});
  EXPECT_THAT(log_.all(), IsEmpty());
}

TEST_F(InstanceOperations, modify) {
  const std::string body = ask("ModifyInstance", {modified("a", item("a", number("0x10")))});
  EXPECT_THAT(body, Not(HasSubstr("IRETURNVALUE")));
  ask("ModifyInstance",
      {modified("b", item("b")), {"PropertyList", texts({"Number"})}, flag("IncludeQualifiers", false)});
  EXPECT_THAT(log_.all(),
              ElementsAre("call: modify a: Name=a Number=16", HasSubstr("modify b: Name=b only Number")));
  expectError(5, "ModifyInstance",
              {{"ModifiedInstance", "<VALUE.NAMEDINSTANCE>" + instanceName("TEST_None", "a") +
                                        "<INSTANCE CLASSNAME=\"TEST_None\"/></VALUE.NAMEDINSTANCE>"}});
}

TEST_F(InstanceOperations, remove) {
  EXPECT_THAT(ask("DeleteInstance", {instance("a")}), Not(HasSubstr("IRETURNVALUE")));
  EXPECT_THAT(log_.all(), ElementsAre("call: delete a"));
  expectError(6, "DeleteInstance", {instance("none")});
  expectError(5, "DeleteInstance", {instance("a", "TEST_None")});
}

TEST_F(InstanceOperations, passQueriesOn) {
  const Given query{"Query", text("SELECT * FROM TEST_Item")};
  const std::string body = ask("ExecQuery", {{"QueryLanguage", text("WQL")}, query});
  EXPECT_THAT(between(body, "<INSTANCE CLASSNAME=\"", "\""), SizeIs(2));
  EXPECT_THAT(log_.all(), ElementsAre("call: query WQL: SELECT * FROM TEST_Item"));
  expectError(14, "ExecQuery", {{"QueryLanguage", text("SQL")}, {"Query", text("hello")}});
  expectError(15, "ExecQuery", {{"QueryLanguage", text("WQL")}, {"Query", text("hello")}});
}

TEST_F(InstanceOperations, refuseWhatIsNotThere) {
  for (const char* method : {"SetQualifier", "GetQualifier", "EnumerateQualifiers", "GetProperty",
                             "SetProperty", "CreateClass", "ModifyClass", "DeleteClass", "NoSuchThing"})
    EXPECT_THAT(expectError(7, method), HasSubstr(method));
}

}  // namespace
