// Parameters: which there are, what they hold, and methods of objects.
#include "Fixture.h"

namespace {

using protocol_test::className;
using protocol_test::errorCode;
using protocol_test::errorText;
using protocol_test::flag;
using protocol_test::Given;
using protocol_test::header;
using protocol_test::instanceName;
using protocol_test::Protocol;
using protocol_test::Recorded;
using protocol_test::request;
using protocol_test::Request;
using protocol_test::text;
using protocol_test::texts;
using testing::HasSubstr;

class Parameters : public Protocol {
 protected:
  const Given item_{"ClassName", className("TEST_Item")};

  /// A METHODCALL of an object.
  static Request extrinsic(const std::string& method, const std::string& target, const std::string& object) {
    Request made = request(method);
    const std::string local = R"(<LOCALNAMESPACEPATH><NAMESPACE NAME="root"/><NAMESPACE NAME="test"/>)"
                              R"(</LOCALNAMESPACEPATH>)";
    const bool isClass = target.starts_with("<CLASSNAME");
    const std::string tag = isClass ? "LOCALCLASSPATH" : "LOCALINSTANCEPATH";
    const std::size_t start = made.body.find("<IMETHODCALL");
    const std::size_t end = made.body.find("</SIMPLEREQ>");
    made.body.replace(
        start, end - start,
        "<METHODCALL NAME=\"" + method + "\"><" + tag + ">" + local + target + "</" + tag + "></METHODCALL>");
    header(made, "CIMObject") = object;
    return made;
  }
};

TEST_F(Parameters, areRequired) {
  for (const char* method :
       {"GetClass", "EnumerateInstances", "EnumerateInstanceNames", "OpenEnumerateInstances"})
    EXPECT_EQ(expectError(4, method), "the parameter ClassName is missing");
  for (const char* method : {"GetInstance", "DeleteInstance", "OpenAssociatorInstances"})
    EXPECT_EQ(expectError(4, method), "the parameter InstanceName is missing");
  for (const char* method : {"Associators", "AssociatorNames", "References", "ReferenceNames"})
    EXPECT_EQ(expectError(4, method), "the parameter ObjectName is missing");
  expectError(4, "CreateInstance");
  expectError(4, "ModifyInstance");
  expectError(4, "ExecQuery", {{"Query", text("SELECT * FROM TEST_Item")}});
  expectError(4, "PullInstancePaths", {{"EnumerationContext", text("x")}});
  expectError(4, "EnumerateInstances", {{"ClassName", ""}});
}

TEST_F(Parameters, areKnown) {
  EXPECT_THAT(expectError(4, "GetClass", {item_, flag("LocalOnlY", true), flag("Deep", true)}),
              HasSubstr("Deep"));
  expectError(4, "EnumerateInstanceNames", {item_, flag("LocalOnly", true)});
  expectError(4, "EnumerateClassNames", {flag("IncludeQualifiers", true)});
}

TEST_F(Parameters, areGivenOnce) {
  EXPECT_THAT(expectError(4, "EnumerateInstances", {item_, {"CLASSNAME", className("TEST_Item")}}),
              HasSubstr("twice"));
}

TEST_F(Parameters, ignoreTheCaseOfNames) {
  const Recorded answer = send(request("ENUMERATEINSTANCES", {{"cLASSnAME", className("test_item")}}));
  EXPECT_EQ(errorCode(answer.body), -1);
  EXPECT_THAT(answer.body, HasSubstr("<IMETHODRESPONSE NAME=\"ENUMERATEINSTANCES\">"));
}

TEST_F(Parameters, holdWhatTheyShould) {
  const std::string instance = instanceName("TEST_Item", "a");
  expectError(4, "EnumerateInstances", {{"ClassName", text("TEST_Item")}});
  expectError(4, "EnumerateInstances", {{"ClassName", instance}});
  expectError(4, "GetInstance", {{"InstanceName", className("TEST_Item")}});
  expectError(4, "GetInstance", {{"InstanceName", instance}, {"LocalOnly", text("maybe")}});
  expectError(4, "GetInstance", {{"InstanceName", instance}, {"LocalOnly", text("")}});
  expectError(4, "GetInstance", {{"InstanceName", instance}, {"PropertyList", text("Name")}});
  expectError(4, "GetInstance",
              {{"InstanceName", instance}, {"PropertyList", "<VALUE.ARRAY><VALUE.NULL/></VALUE.ARRAY>"}});
  expectError(4, "Associators", {{"ObjectName", instance}, {"Role", texts({"One"})}});
  expectError(4, "Associators", {{"ObjectName", instance}, {"AssocClass", text("TEST_Holds")}});
  expectError(4, "CreateInstance", {{"NewInstance", className("TEST_Item")}});
  expectError(4, "ModifyInstance", {{"ModifiedInstance", "<INSTANCE CLASSNAME=\"TEST_Item\"/>"}});
  for (const char* count : {"-1", "many", "4294967296", ""})
    expectError(4, "OpenEnumerateInstances", {item_, {"MaxObjectCount", text(count)}});
}

TEST_F(Parameters, takeNullForTheDefault) {
  ask("GetInstance",
      {{"InstanceName", instanceName("TEST_Item", "a")}, {"LocalOnly", ""}, {"PropertyList", ""}});
  ask("EnumerateInstances", {item_, flag("DeepInheritance", true), flag("IncludeQualifiers", false)});
}

TEST_F(Parameters, ofMethodsOfObjects) {
  const auto expect = [this](int code, const Request& made) {
    const Recorded answer = send(made);
    EXPECT_EQ(answer.status, 200) << answer.body;
    EXPECT_EQ(errorCode(answer.body), code) << answer.body;
    EXPECT_NE(errorText(answer.body), "");
    EXPECT_THAT(answer.body, HasSubstr("<METHODRESPONSE NAME="));
  };
  const std::string instance = instanceName("TEST_SubItem", "a");
  expect(16, extrinsic("RESET", className("TEST_Item"), "root/test:TEST_Item"));
  expect(16, extrinsic("Reset", instance, "root%2Ftest%3Atest_subitem.Name%3D%22a%22"));
  expect(17, extrinsic("Explode", className("TEST_Item"), "root/test:TEST_Item"));
  expect(6, extrinsic("Reset", className("TEST_None"), "root/test:TEST_None"));
  const Recorded mismatch = send(extrinsic("Reset", className("TEST_Item"), "root/test:TEST_ItemMore"));
  EXPECT_EQ(mismatch.status, 400);
  EXPECT_EQ(mismatch.field("CIMError"), "header-mismatch");
}

}  // namespace
