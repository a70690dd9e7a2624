#include "Fixture.h"

namespace cimom::xml {
namespace {

using testing::ElementsAre;
using testing::Optional;

template <class Form>
Form readAs(std::string_view content) {
  const std::string valid =
      dsp0203::firstViolation(request("<IPARAMVALUE NAME=\"P\">" + std::string(content) + "</IPARAMVALUE>"));
  EXPECT_EQ(valid, "") << "the test's own request";
  return std::get<Form>(readParameterContent(content));
}

constexpr const char* nameSpace =
    "<LOCALNAMESPACEPATH><NAMESPACE NAME=\"a\"/><NAMESPACE NAME=\"b\"/></LOCALNAMESPACEPATH>";
constexpr const char* name =
    "<INSTANCENAME CLASSNAME=\"C\"><KEYBINDING NAME=\"K\"><KEYVALUE>k</KEYVALUE></KEYBINDING></INSTANCENAME>";

std::string atHost(std::string_view content) {
  return std::string("<NAMESPACEPATH><HOST>h</HOST>") + nameSpace + "</NAMESPACEPATH>" + std::string(content);
}

TEST(Parameter, NoContentIsNull) {
  EXPECT_TRUE(std::holds_alternative<std::monostate>(readParameterContent("")));
  EXPECT_TRUE(std::holds_alternative<std::monostate>(readParameterContent("\n  ")));
}

TEST(Parameter, Value) {
  EXPECT_EQ(readAs<std::string>("<VALUE>FALSE</VALUE>"), "FALSE");
  EXPECT_EQ(readAs<std::string>("<VALUE/>"), "");
  EXPECT_EQ(readAs<std::string>("<VALUE> a\nb </VALUE>"), " a\nb ");
}

TEST(Parameter, ValueHoldsNoElements) {
  EXPECT_EQ(refusal(request("<IPARAMVALUE NAME=\"P\"><VALUE><VALUE/></VALUE></IPARAMVALUE>")),
            "400 request-not-loosely-valid");
}

TEST(Parameter, TwoValues) {
  EXPECT_EQ(refusal(request("<IPARAMVALUE NAME=\"P\"><VALUE/><VALUE/></IPARAMVALUE>")),
            "400 request-not-loosely-valid");
}

TEST(Parameter, Array) {
  using Texts = std::vector<ValueText>;
  EXPECT_THAT(readAs<Texts>("<VALUE.ARRAY><VALUE>a</VALUE><VALUE.NULL/><VALUE></VALUE></VALUE.ARRAY>"),
              ElementsAre(Optional(std::string("a")), std::nullopt, Optional(std::string())));
  EXPECT_TRUE(readAs<Texts>("<VALUE.ARRAY/>").empty());
}

TEST(Parameter, ClassName) {
  const auto read = readAs<ObjectName>("<CLASSNAME NAME=\"CIM_Thing\"/>");
  EXPECT_EQ(read.className, "CIM_Thing");
  EXPECT_FALSE(read.isInstance);
}

TEST(Parameter, InstanceNameWithKeys) {
  const auto read = readAs<ObjectName>(
      "<INSTANCENAME CLASSNAME=\"C\">"
      "<KEYBINDING NAME=\"A\"><KEYVALUE VALUETYPE=\"string\">text</KEYVALUE></KEYBINDING>"
      "<KEYBINDING NAME=\"B\"><KEYVALUE VALUETYPE=\"numeric\" TYPE=\"uint16\">5</KEYVALUE></KEYBINDING>"
      "<KEYBINDING NAME=\"C\"><KEYVALUE VALUETYPE=\"boolean\">TRUE</KEYVALUE></KEYBINDING>"
      "<KEYBINDING NAME=\"D\"><KEYVALUE>default</KEYVALUE></KEYBINDING></INSTANCENAME>");
  EXPECT_TRUE(read.isInstance);
  EXPECT_EQ(read.className, "C");
  ASSERT_EQ(read.keys.size(), 4U);
  EXPECT_EQ(read.keys[0].name, "A");
  EXPECT_EQ(read.keys[0].form, Key::Form::text);
  EXPECT_EQ(read.keys[0].text, "text");
  EXPECT_EQ(read.keys[0].type, CMPI_null);
  EXPECT_EQ(read.keys[1].form, Key::Form::numeric);
  EXPECT_EQ(read.keys[1].type, CMPI_uint16);
  EXPECT_EQ(read.keys[2].form, Key::Form::boolean);
  EXPECT_EQ(read.keys[3].form, Key::Form::text);
}

TEST(Parameter, KeysWithoutName) {
  const auto value =
      readAs<ObjectName>("<INSTANCENAME CLASSNAME=\"C\"><KEYVALUE>k</KEYVALUE></INSTANCENAME>");
  ASSERT_EQ(value.keys.size(), 1U);
  EXPECT_EQ(value.keys[0].name, "");
  EXPECT_EQ(value.keys[0].text, "k");
  const auto reference = readAs<ObjectName>(std::string("<INSTANCENAME CLASSNAME=\"C\"><VALUE.REFERENCE>") +
                                            name + "</VALUE.REFERENCE></INSTANCENAME>");
  ASSERT_EQ(reference.keys.size(), 1U);
  EXPECT_EQ(reference.keys[0].form, Key::Form::reference);
  EXPECT_EQ(reference.keys[0].reference.at(0).keys.at(0).text, "k");
  EXPECT_TRUE(readAs<ObjectName>("<INSTANCENAME CLASSNAME=\"C\"/>").keys.empty());
}

TEST(Parameter, KeysThatAreNone) {
  for (const std::string content : {
           "<KEYBINDING NAME=\"A\"/>",
           "<KEYBINDING><KEYVALUE/></KEYBINDING>",
           "<KEYBINDING NAME=\"A\"><VALUE>x</VALUE></KEYBINDING>",
           "<KEYBINDING NAME=\"A\"><KEYVALUE VALUETYPE=\"number\">1</KEYVALUE></KEYBINDING>",
           "<KEYBINDING NAME=\"A\"><KEYVALUE TYPE=\"integer\">1</KEYVALUE></KEYBINDING>",
           "<KEYBINDING NAME=\"A\"><KEYVALUE TYPE=\"reference\">1</KEYVALUE></KEYBINDING>",
           "<KEYBINDING NAME=\"A\"><KEYVALUE>1</KEYVALUE><KEYVALUE>2</KEYVALUE></KEYBINDING>",
           "<KEYVALUE>1</KEYVALUE><KEYVALUE>2</KEYVALUE>",
       })
    EXPECT_EQ(refusal(request("<IPARAMVALUE NAME=\"P\"><INSTANCENAME CLASSNAME=\"C\">" + content +
                              "</INSTANCENAME></IPARAMVALUE>")),
              "400 request-not-loosely-valid")
        << content;
}

TEST(Parameter, ReferencesInEveryForm) {
  const auto reference = [](const std::string& content) {
    return readAs<ObjectName>("<VALUE.REFERENCE>" + content + "</VALUE.REFERENCE>");
  };
  const ObjectName instancePath = reference("<INSTANCEPATH>" + atHost(name) + "</INSTANCEPATH>");
  EXPECT_EQ(instancePath.host, "h");
  EXPECT_EQ(instancePath.nameSpace, "a/b");
  EXPECT_TRUE(instancePath.isInstance);
  EXPECT_EQ(instancePath.keys.size(), 1U);
  const ObjectName localPath =
      reference(std::string("<LOCALINSTANCEPATH>") + nameSpace + name + "</LOCALINSTANCEPATH>");
  EXPECT_EQ(localPath.host, "");
  EXPECT_EQ(localPath.nameSpace, "a/b");
  EXPECT_TRUE(localPath.isInstance);
  const ObjectName classPath = reference("<CLASSPATH>" + atHost("<CLASSNAME NAME=\"C\"/>") + "</CLASSPATH>");
  EXPECT_EQ(classPath.host, "h");
  EXPECT_FALSE(classPath.isInstance);
  EXPECT_EQ(classPath.className, "C");
  const ObjectName localClass =
      reference(std::string("<LOCALCLASSPATH>") + nameSpace + "<CLASSNAME NAME=\"C\"/></LOCALCLASSPATH>");
  EXPECT_EQ(localClass.nameSpace, "a/b");
  EXPECT_TRUE(reference(name).isInstance);
  EXPECT_EQ(reference("<CLASSNAME NAME=\"C\"/>").className, "C");
}

TEST(Parameter, QualifierDeclaration) {
  const auto read = readAs<QualifierDeclarationElement>(
      "<QUALIFIER.DECLARATION NAME=\"Values\" TYPE=\"string\" ISARRAY=\"true\"><SCOPE PROPERTY=\"true\"/>"
      "<VALUE.ARRAY><VALUE>a</VALUE></VALUE.ARRAY></QUALIFIER.DECLARATION>");
  EXPECT_EQ(read.name, "Values");
  EXPECT_EQ(read.type, CMPI_stringA);
  EXPECT_EQ(std::get<std::vector<ValueText>>(read.value).size(), 1U);
}

TEST(Parameter, Class) {
  const auto read = readAs<ClassElement>(
      "<CLASS NAME=\"C\" SUPERCLASS=\"B\"><QUALIFIER NAME=\"Abstract\" "
      "TYPE=\"boolean\"><VALUE>TRUE</VALUE></QUALIFIER>"
      "<PROPERTY NAME=\"P\" TYPE=\"uint8\"/><PROPERTY.REFERENCE NAME=\"R\" REFERENCECLASS=\"B\"/>"
      "<METHOD NAME=\"M\" TYPE=\"uint32\"><PARAMETER NAME=\"A\" TYPE=\"string\"/></METHOD></CLASS>");
  EXPECT_EQ(read.name, "C");
  EXPECT_EQ(read.superClass, "B");
  ASSERT_EQ(read.qualifiers.size(), 1U);
  EXPECT_EQ(read.qualifiers[0].name, "Abstract");
  EXPECT_EQ(std::get<std::string>(read.qualifiers[0].value), "TRUE");
  ASSERT_EQ(read.properties.size(), 2U);
  EXPECT_EQ(read.properties[1].type, CMPI_ref);
  EXPECT_EQ(read.properties[1].referenceClass, "B");
  EXPECT_THAT(read.methods, ElementsAre("M"));
}

TEST(Parameter, InstanceWithPropertiesOfEveryKind) {
  const auto read = readAs<InstanceElement>(
      std::string(
          "<INSTANCE CLASSNAME=\"C\">"
          "<QUALIFIER NAME=\"Q\" TYPE=\"string\"><VALUE.ARRAY><VALUE>a</VALUE></VALUE.ARRAY></QUALIFIER>"
          "<PROPERTY NAME=\"A\" TYPE=\"string\" CLASSORIGIN=\"B\" PROPAGATED=\"true\">"
          "<QUALIFIER NAME=\"Key\" "
          "TYPE=\"boolean\"><VALUE>TRUE</VALUE></QUALIFIER><VALUE>x</VALUE></PROPERTY>"
          "<PROPERTY NAME=\"N\" TYPE=\"uint32\"/>"
          "<PROPERTY.ARRAY NAME=\"L\" TYPE=\"uint16\"><VALUE.ARRAY><VALUE>1</VALUE></VALUE.ARRAY>"
          "</PROPERTY.ARRAY><PROPERTY.ARRAY NAME=\"E\" TYPE=\"uint16\"/>"
          "<PROPERTY.REFERENCE NAME=\"R\" REFERENCECLASS=\"D\"><VALUE.REFERENCE>") +
      name +
      "</VALUE.REFERENCE></PROPERTY.REFERENCE>"
      "<PROPERTY NAME=\"I\" TYPE=\"string\" "
      "EmbeddedObject=\"instance\"><VALUE>&lt;INSTANCE/&gt;</VALUE></PROPERTY>"
      "</INSTANCE>");
  EXPECT_EQ(read.className, "C");
  EXPECT_FALSE(read.name);
  EXPECT_EQ(read.qualifiers.at(0).type, CMPI_stringA);
  ASSERT_EQ(read.properties.size(), 6U);
  EXPECT_EQ(read.properties[0].classOrigin, "B");
  EXPECT_TRUE(read.properties[0].propagated);
  EXPECT_EQ(read.properties[0].qualifiers.size(), 1U);
  EXPECT_EQ(std::get<std::string>(read.properties[0].value), "x");
  EXPECT_TRUE(std::holds_alternative<std::monostate>(read.properties[1].value));
  EXPECT_EQ(read.properties[2].type, CMPI_uint16A);
  EXPECT_TRUE(std::holds_alternative<std::monostate>(read.properties[3].value));
  EXPECT_EQ(read.properties[3].type, CMPI_uint16A);
  EXPECT_EQ(std::get<ObjectName>(read.properties[4].value).className, "C");
  EXPECT_EQ(read.properties[5].embedded, PropertyElement::Embedded::instance);
  EXPECT_EQ(std::get<std::string>(read.properties[5].value), "<INSTANCE/>");
}

TEST(Parameter, TheOldSpellingOfEmbeddedObject) {
  const auto read = std::get<InstanceElement>(
      readParameterContent("<INSTANCE CLASSNAME=\"C\"><PROPERTY NAME=\"I\" TYPE=\"string\" "
                           "EMBEDDEDOBJECT=\"object\"/></INSTANCE>"));
  EXPECT_EQ(read.properties.at(0).embedded, PropertyElement::Embedded::object);
}

TEST(Parameter, NamedInstance) {
  const auto read =
      readAs<InstanceElement>(std::string("<VALUE.NAMEDINSTANCE>") + name +
                              "<INSTANCE CLASSNAME=\"C\"><PROPERTY NAME=\"A\" TYPE=\"string\"/></INSTANCE>"
                              "</VALUE.NAMEDINSTANCE>");
  ASSERT_TRUE(read.name);
  EXPECT_EQ(read.name->keys.at(0).name, "K");
  EXPECT_EQ(read.properties.size(), 1U);
}

TEST(Parameter, InstancesThatAreNone) {
  for (const std::string content : {
           "<INSTANCE/>",
           "<INSTANCE CLASSNAME=\"C\">text</INSTANCE>",
           "<INSTANCE CLASSNAME=\"C\"><PROPERTY NAME=\"A\"/></INSTANCE>",
           "<INSTANCE CLASSNAME=\"C\"><PROPERTY TYPE=\"string\"/></INSTANCE>",
           "<INSTANCE CLASSNAME=\"C\"><PROPERTY NAME=\"A\" TYPE=\"text\"/></INSTANCE>",
           "<INSTANCE CLASSNAME=\"C\"><PROPERTY NAME=\"A\" TYPE=\"reference\"/></INSTANCE>",
           "<INSTANCE CLASSNAME=\"C\"><PROPERTY NAME=\"A\" "
           "TYPE=\"string\"><VALUE.ARRAY/></PROPERTY></INSTANCE>",
           "<INSTANCE CLASSNAME=\"C\"><PROPERTY NAME=\"A\" "
           "TYPE=\"string\"><VALUE/><VALUE/></PROPERTY></INSTANCE>",
           "<INSTANCE CLASSNAME=\"C\"><PROPERTY NAME=\"A\" TYPE=\"string\" PROPAGATED=\"yes\"/></INSTANCE>",
           "<INSTANCE CLASSNAME=\"C\"><PROPERTY NAME=\"A\" TYPE=\"string\" "
           "EmbeddedObject=\"yes\"/></INSTANCE>",
           "<INSTANCE CLASSNAME=\"C\"><METHOD NAME=\"M\"/></INSTANCE>",
           "<VALUE.NAMEDINSTANCE><INSTANCE CLASSNAME=\"C\"/></VALUE.NAMEDINSTANCE>",
           "<VALUE.NAMEDINSTANCE><INSTANCENAME CLASSNAME=\"C\"/></VALUE.NAMEDINSTANCE>",
       })
    EXPECT_EQ(refusal(request("<IPARAMVALUE NAME=\"P\">" + content + "</IPARAMVALUE>")),
              "400 request-not-loosely-valid")
        << content;
}

}  // namespace
}  // namespace cimom::xml
