#include "Fixture.h"

#include <cimom/broker/WbemUri.h>
#include <cimom/xml/Conversion.h>

namespace cimom::xml {
namespace {

Key key(std::string name, std::string text, Key::Form form = Key::Form::text, CMPIType type = CMPI_null) {
  Key made;
  made.name = std::move(name);
  made.form = form;
  made.type = type;
  made.text = std::move(text);
  return made;
}

ObjectName instanceOf(std::string className, std::vector<Key> keys) {
  ObjectName name;
  name.className = std::move(className);
  name.isInstance = true;
  name.keys = std::move(keys);
  return name;
}

class Conversion : public XmlTest {
 protected:
  ObjectPath& made(const ObjectName& name) { return *makePath(arena, classes, name, "root/cimv2"); }
  std::string uri(const ObjectName& name) { return formatWbemUri(made(name)); }

  Instance& read(std::string_view content) {
    const auto element = std::get<InstanceElement>(readParameterContent(content));
    return *makeInstance(arena, classes, element, "root/cimv2");
  }
  CMPIrc codeOf(std::string_view content) {
    try {
      (void)read(content);
    } catch (const ConversionError& error) {
      return error.code();
    }
    return CMPI_RC_OK;
  }
  CMPIrc codeOf(const ObjectName& name) {
    try {
      (void)made(name);
    } catch (const ConversionError& error) {
      return error.code();
    }
    return CMPI_RC_OK;
  }
};

TEST_F(Conversion, ClassPath) {
  ObjectName name;
  name.className = "leaf";
  EXPECT_EQ(made(name).className(), "Leaf");
  EXPECT_EQ(made(name).nameSpace(), "root/cimv2");
  name.nameSpace = "root/other";
  name.host = "server";
  EXPECT_EQ(uri(name), "//server/root/other:Leaf");
}

TEST_F(Conversion, KeysHaveTheDeclaredTypesWhateverTheClientSays) {
  const ObjectName name = instanceOf(
      "numbered", {key("NUMBER", "0x10", Key::Form::numeric), key("Flag", "true"),
                   key("When", "20240131120000.000000+060"), key("letter", "c"), key("Size", "2")});
  const ObjectPath& path = made(name);
  EXPECT_EQ(path.find("Number")->data.type, CMPI_uint32);
  EXPECT_EQ(path.find("Number")->data.value.uint32, 16U);
  EXPECT_EQ(path.find("Number")->name, "Number");
  EXPECT_EQ(path.find("Flag")->data.type, CMPI_boolean);
  EXPECT_EQ(path.find("When")->data.type, CMPI_dateTime);
  EXPECT_EQ(path.find("Letter")->data.type, CMPI_char16);
  EXPECT_EQ(path.find("Size")->data.type, CMPI_real64);
}

TEST_F(Conversion, AStringKeyTakesAnything) {
  EXPECT_EQ(uri(instanceOf("Leaf", {key("Name", "5", Key::Form::numeric)})), "root/cimv2:Leaf.Name=\"5\"");
}

TEST_F(Conversion, KeysThatDoNotFitKeepTheClientsType) {
  const ObjectPath& path =
      made(instanceOf("Numbered", {key("Number", "many"), key("Flag", "5", Key::Form::numeric),
                                   key("When", "TRUE", Key::Form::boolean)}));
  EXPECT_EQ(path.find("Number")->data.type, CMPI_string);
  EXPECT_EQ(path.find("Flag")->data.type, CMPI_sint64);
  EXPECT_EQ(path.find("When")->data.type, CMPI_boolean);
}

TEST_F(Conversion, UnknownKeysAndClasses) {
  const ObjectPath& path = made(instanceOf(
      "Nowhere", {key("A", "x"), key("B", "-5", Key::Form::numeric),
                  key("C", "18446744073709551615", Key::Form::numeric), key("D", "1.5", Key::Form::numeric),
                  key("E", "false", Key::Form::boolean), key("F", "7", Key::Form::numeric, CMPI_uint8),
                  key("G", "c", Key::Form::text, CMPI_char16)}));
  EXPECT_EQ(path.className(), "Nowhere");
  EXPECT_EQ(path.find("A")->data.type, CMPI_string);
  EXPECT_EQ(path.find("B")->data.type, CMPI_sint64);
  EXPECT_EQ(path.find("C")->data.type, CMPI_uint64);
  EXPECT_EQ(path.find("D")->data.type, CMPI_real64);
  EXPECT_EQ(path.find("E")->data.type, CMPI_boolean);
  EXPECT_EQ(path.find("F")->data.type, CMPI_uint8);
  EXPECT_EQ(path.find("G")->data.type, CMPI_char16);
  EXPECT_NE(made(instanceOf("Leaf", {key("Shoe", "x")})).find("Shoe"), nullptr);
}

TEST_F(Conversion, ANamelessKeyIsTheOneOfItsClass) {
  EXPECT_EQ(uri(instanceOf("Single", {key("", "5", Key::Form::numeric)})), "root/cimv2:Single.Id=5");
  EXPECT_EQ(codeOf(instanceOf("Numbered", {key("", "5")})), CMPI_RC_ERR_INVALID_PARAMETER);
  EXPECT_EQ(codeOf(instanceOf("Nowhere", {key("", "5")})), CMPI_RC_ERR_INVALID_PARAMETER);
}

TEST_F(Conversion, KeysThatAreRefused) {
  EXPECT_EQ(codeOf(instanceOf("Leaf", {key("Name", "a"), key("name", "b")})), CMPI_RC_ERR_INVALID_PARAMETER);
  EXPECT_EQ(codeOf(instanceOf("Nowhere", {key("A", "five", Key::Form::numeric)})),
            CMPI_RC_ERR_INVALID_PARAMETER);
  EXPECT_EQ(codeOf(instanceOf("Nowhere", {key("A", "yes", Key::Form::boolean)})),
            CMPI_RC_ERR_INVALID_PARAMETER);
}

TEST_F(Conversion, References) {
  Key left;
  left.name = "Left";
  left.form = Key::Form::reference;
  left.reference.push_back(instanceOf("leaf", {key("name", "a")}));
  Key right = left;
  right.name = "Right";
  right.reference[0].nameSpace = "root/other";
  EXPECT_EQ(
      uri(instanceOf("Tie", {left, right})),
      "root/cimv2:Tie.Left=\"root/cimv2:Leaf.Name=\\\"a\\\"\",Right=\"root/other:Leaf.Name=\\\"a\\\"\"");
}

TEST_F(Conversion, ReferencesNestedTooDeeply) {
  ObjectName name = instanceOf("Tie", {});
  for (unsigned depth = 1; depth < nestingDepth; ++depth) {
    Key left;
    left.name = "Left";
    left.form = Key::Form::reference;
    left.reference.push_back(name);
    name = instanceOf("Tie", {left});
  }
  EXPECT_EQ(codeOf(name), CMPI_RC_OK);
  Key left;
  left.name = "Left";
  left.form = Key::Form::reference;
  left.reference.push_back(name);
  EXPECT_EQ(codeOf(instanceOf("Tie", {left})), CMPI_RC_ERR_INVALID_PARAMETER);
}

TEST_F(Conversion, InstanceWithItsProperties) {
  const Instance& instance = read(
      "<INSTANCE CLASSNAME=\"LEAF\"><PROPERTY NAME=\"name\" TYPE=\"string\"><VALUE>a</VALUE></PROPERTY>"
      "<PROPERTY NAME=\"U8\" TYPE=\"uint8\"><VALUE>7</VALUE></PROPERTY>"
      "<PROPERTY NAME=\"Caption\" TYPE=\"string\"/>"
      "<PROPERTY.ARRAY NAME=\"Words\" "
      "TYPE=\"string\"><VALUE.ARRAY><VALUE>x</VALUE><VALUE.NULL/></VALUE.ARRAY>"
      "</PROPERTY.ARRAY></INSTANCE>");
  EXPECT_EQ(formatWbemUri(instance.path()), "root/cimv2:Leaf.Name=\"a\"");
  EXPECT_EQ(text(instance.find("Name")->data), "a");
  EXPECT_EQ(instance.find("U8")->data.value.uint8, 7);
  ASSERT_NE(instance.find("Caption"), nullptr);
  EXPECT_TRUE(isNull(instance.find("Caption")->data));
  EXPECT_EQ(elements(instance.find("Words")->data).size(), 2U);
  EXPECT_EQ(instance.find("Flag"), nullptr);
}

TEST_F(Conversion, NamedInstanceHasTheKeysOfItsName) {
  const std::string name =
      "<INSTANCENAME CLASSNAME=\"Leaf\"><KEYBINDING "
      "NAME=\"Name\"><KEYVALUE>a</KEYVALUE></KEYBINDING></INSTANCENAME>";
  const Instance& instance = read("<VALUE.NAMEDINSTANCE>" + name +
                                  "<INSTANCE CLASSNAME=\"Leaf\"><PROPERTY NAME=\"Caption\" TYPE=\"string\">"
                                  "<VALUE>new</VALUE></PROPERTY></INSTANCE></VALUE.NAMEDINSTANCE>");
  EXPECT_EQ(formatWbemUri(instance.path()), "root/cimv2:Leaf.Name=\"a\"");
  EXPECT_EQ(text(instance.find("Name")->data), "a");
  EXPECT_EQ(text(instance.find("Caption")->data), "new");
  EXPECT_EQ(
      codeOf(
          "<VALUE.NAMEDINSTANCE>" + name +
          "<INSTANCE CLASSNAME=\"Leaf\"><PROPERTY NAME=\"Name\" TYPE=\"string\"><VALUE>b</VALUE></PROPERTY>"
          "</INSTANCE></VALUE.NAMEDINSTANCE>"),
      CMPI_RC_ERR_INVALID_PARAMETER);
  EXPECT_EQ(codeOf("<VALUE.NAMEDINSTANCE>" + name + "<INSTANCE CLASSNAME=\"Single\"/></VALUE.NAMEDINSTANCE>"),
            CMPI_RC_ERR_INVALID_PARAMETER);
}

TEST_F(Conversion, AReferenceAsProperty) {
  const Instance& instance = read(
      "<INSTANCE CLASSNAME=\"Tie\"><PROPERTY.REFERENCE NAME=\"Left\"><VALUE.REFERENCE>"
      "<INSTANCENAME CLASSNAME=\"Leaf\"><KEYVALUE>a</KEYVALUE></INSTANCENAME>"
      "</VALUE.REFERENCE></PROPERTY.REFERENCE></INSTANCE>");
  ASSERT_NE(objectPath(instance.find("Left")->data), nullptr);
  EXPECT_EQ(formatWbemUri(*objectPath(instance.find("Left")->data)), "root/cimv2:Leaf.Name=\"a\"");
}

TEST_F(Conversion, InstancesThatDoNotFitTheirClass) {
  const auto codeOfProperty = [&](const std::string& property) {
    return codeOf("<INSTANCE CLASSNAME=\"Leaf\">" + property + "</INSTANCE>");
  };
  EXPECT_EQ(codeOf("<INSTANCE CLASSNAME=\"Nowhere\"/>"), CMPI_RC_ERR_INVALID_CLASS);
  EXPECT_EQ(codeOfProperty("<PROPERTY NAME=\"Shoe\" TYPE=\"string\"/>"), CMPI_RC_ERR_NO_SUCH_PROPERTY);
  EXPECT_EQ(codeOfProperty("<PROPERTY NAME=\"U8\" TYPE=\"uint16\"><VALUE>1</VALUE></PROPERTY>"),
            CMPI_RC_ERR_TYPE_MISMATCH);
  EXPECT_EQ(codeOfProperty("<PROPERTY NAME=\"Words\" TYPE=\"string\"><VALUE>1</VALUE></PROPERTY>"),
            CMPI_RC_ERR_TYPE_MISMATCH);
  EXPECT_EQ(codeOfProperty("<PROPERTY.REFERENCE NAME=\"Caption\"/>"), CMPI_RC_ERR_TYPE_MISMATCH);
  EXPECT_EQ(codeOfProperty("<PROPERTY NAME=\"U8\" TYPE=\"uint8\"><VALUE>256</VALUE></PROPERTY>"),
            CMPI_RC_ERR_INVALID_PARAMETER);
  EXPECT_EQ(codeOfProperty(
                "<PROPERTY.ARRAY NAME=\"Bytes\" TYPE=\"uint8\"><VALUE.ARRAY><VALUE>x</VALUE></VALUE.ARRAY>"
                "</PROPERTY.ARRAY>"),
            CMPI_RC_ERR_INVALID_PARAMETER);
  EXPECT_EQ(codeOfProperty("<PROPERTY NAME=\"U8\" TYPE=\"uint8\"/><PROPERTY NAME=\"u8\" TYPE=\"uint8\"/>"),
            CMPI_RC_ERR_INVALID_PARAMETER);
}

// The repository's classes keep an embedded instance as a text; this schema has one as an instance.
class WithInstances : public ClassModel {
  [[nodiscard]] std::vector<std::string> classNames() const override { return {"Outer"}; }
  [[nodiscard]] std::optional<ClassDeclaration> declaration(std::string_view /*className*/) const override {
    return ClassDeclaration{
        "Outer",
        "",
        {{"Inner", CMPI_instance, false}, {"Inners", CMPI_instanceA, false}, {"Id", CMPI_string, false}}};
  }
};

TEST_F(Conversion, EmbeddedInstances) {
  const ClassTable table{WithInstances()};
  const auto element = std::get<InstanceElement>(readParameterContent(
      "<INSTANCE CLASSNAME=\"Outer\">"
      "<PROPERTY NAME=\"Inner\" TYPE=\"string\" EmbeddedObject=\"instance\"><VALUE>&lt;INSTANCE "
      "CLASSNAME=&quot;Outer&quot;"
      "&gt;&lt;PROPERTY NAME=&quot;Id&quot; "
      "TYPE=&quot;string&quot;&gt;&lt;VALUE&gt;x&lt;/VALUE&gt;&lt;/PROPERTY&gt;"
      "&lt;/INSTANCE&gt;</VALUE></PROPERTY>"
      "<PROPERTY.ARRAY NAME=\"Inners\" TYPE=\"string\" EmbeddedObject=\"instance\"><VALUE.ARRAY><VALUE.NULL/>"
      "<VALUE>&lt;INSTANCE "
      "CLASSNAME=&quot;Outer&quot;/&gt;</VALUE></VALUE.ARRAY></PROPERTY.ARRAY></INSTANCE>"));
  const Instance& outer = *makeInstance(arena, table, element, "root");
  const Instance* const inner = instance(outer.find("Inner")->data);
  ASSERT_NE(inner, nullptr);
  EXPECT_EQ(text(inner->find("Id")->data), "x");
  const auto inners = elements(outer.find("Inners")->data);
  ASSERT_EQ(inners.size(), 2U);
  EXPECT_TRUE(isNull(inners[0]));
  EXPECT_NE(instance(inners[1]), nullptr);
  auto broken = element;
  broken.properties[0].value = std::string("no XML");
  EXPECT_THROW((void)makeInstance(arena, table, broken, "root"), ConversionError);
}

TEST_F(Conversion, ADeclaredTextKeepsAnEmbeddedInstanceAsText) {
  const Instance& leaf = read(
      "<INSTANCE CLASSNAME=\"Leaf\"><PROPERTY NAME=\"Inner\" TYPE=\"string\" EmbeddedObject=\"instance\">"
      "<VALUE>&lt;INSTANCE CLASSNAME=&quot;Base&quot;/&gt;</VALUE></PROPERTY></INSTANCE>");
  EXPECT_EQ(text(leaf.find("Inner")->data), "<INSTANCE CLASSNAME=\"Base\"/>");
}

}  // namespace
}  // namespace cimom::xml
