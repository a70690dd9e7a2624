#include "Fixture.h"

namespace cimom::xml {
namespace {

class Paths : public XmlTest {
 protected:
  ObjectPath& leaf(std::string_view name, std::string_view nameSpace = "root/cimv2") {
    ObjectPath& made = path("Leaf", nameSpace);
    setText(made, "Name", name);
    return made;
  }
  ObjectPath& tie(ObjectPath& left, ObjectPath& right) {
    ObjectPath& made = path("Tie");
    CMPIValue value{};
    value.ref = &left;
    set(made, "Left", value, CMPI_ref);
    value.ref = &right;
    set(made, "Right", value, CMPI_ref);
    return made;
  }
  static std::string written(PathForm form, const ObjectPath& objectPath, const Location& location = {}) {
    std::string out;
    PathWriter(form, location).append(out, objectPath);
    return out;
  }
};

constexpr std::string_view leafA =
    "<INSTANCENAME CLASSNAME=\"Leaf\"><KEYBINDING NAME=\"Name\"><KEYVALUE VALUETYPE=\"string\" "
    "TYPE=\"string\">a"
    "</KEYVALUE></KEYBINDING></INSTANCENAME>";
constexpr std::string_view cimv2 =
    "<LOCALNAMESPACEPATH><NAMESPACE NAME=\"root\"/><NAMESPACE NAME=\"cimv2\"/></LOCALNAMESPACEPATH>";

TEST_F(Paths, InstanceName) {
  const std::string out = written(PathForm::instanceName, leaf("a"));
  EXPECT_EQ(out, leafA);
  EXPECT_EQ(dsp0203::firstViolation(response(out)), "");
}

TEST_F(Paths, ClassWithoutKeys) {
  EXPECT_EQ(written(PathForm::instanceName, path("Leaf")),
            "<INSTANCENAME CLASSNAME=\"Leaf\"></INSTANCENAME>");
}

TEST_F(Paths, KeysOfEveryType) {
  ObjectPath& numbered = path("Numbered");
  CMPIValue value{};
  value.uint32 = 5;
  set(numbered, "Number", value, CMPI_uint32);
  value.boolean = 1;
  set(numbered, "Flag", value, CMPI_boolean);
  value.dateTime = DateTime::create(arena, std::string_view("20240131120000.000000+060"));
  set(numbered, "When", value, CMPI_dateTime);
  value.char16 = u'c';
  set(numbered, "Letter", value, CMPI_char16);
  value.real64 = 0.5;
  set(numbered, "Size", value, CMPI_real64);
  const std::string out = written(PathForm::instanceName, numbered);
  EXPECT_EQ(
      out,
      "<INSTANCENAME CLASSNAME=\"Numbered\">"
      "<KEYBINDING NAME=\"Number\"><KEYVALUE VALUETYPE=\"numeric\" TYPE=\"uint32\">5</KEYVALUE></KEYBINDING>"
      "<KEYBINDING NAME=\"Flag\"><KEYVALUE VALUETYPE=\"boolean\" "
      "TYPE=\"boolean\">TRUE</KEYVALUE></KEYBINDING>"
      "<KEYBINDING NAME=\"When\"><KEYVALUE VALUETYPE=\"string\" TYPE=\"datetime\">20240131120000.000000+060"
      "</KEYVALUE></KEYBINDING>"
      "<KEYBINDING NAME=\"Letter\"><KEYVALUE VALUETYPE=\"string\" TYPE=\"char16\">c</KEYVALUE></KEYBINDING>"
      "<KEYBINDING NAME=\"Size\"><KEYVALUE VALUETYPE=\"numeric\" TYPE=\"real64\">5.0000000000000000e-01"
      "</KEYVALUE></KEYBINDING></INSTANCENAME>");
  EXPECT_EQ(dsp0203::firstViolation(response(out)), "");
}

TEST_F(Paths, TextsAreEscaped) {
  EXPECT_THAT(written(PathForm::instanceName, leaf("a\"<&>\x01")),
              testing::HasSubstr(">a&quot;&lt;&amp;&gt;\xef\xbf\xbd</KEYVALUE>"));
  ObjectPath& odd = path("No\"Class");
  EXPECT_EQ(written(PathForm::instanceName, odd),
            "<INSTANCENAME CLASSNAME=\"No&quot;Class\"></INSTANCENAME>");
}

TEST_F(Paths, WithHostAndNamespace) {
  const Location here{"server:5988", "root/interop"};
  const std::string out = written(PathForm::instancePath, leaf("a"), here);
  EXPECT_EQ(out, "<INSTANCEPATH><NAMESPACEPATH><HOST>server:5988</HOST>" + std::string(cimv2) +
                     "</NAMESPACEPATH>" + std::string(leafA) + "</INSTANCEPATH>");
  EXPECT_EQ(dsp0203::firstViolation(response(out)), "");
  ObjectPath& elsewhere = leaf("a", "");
  elsewhere.setHostName("other");
  EXPECT_EQ(written(PathForm::instancePath, elsewhere, here),
            "<INSTANCEPATH><NAMESPACEPATH><HOST>other</HOST><LOCALNAMESPACEPATH><NAMESPACE NAME=\"root\"/>"
            "<NAMESPACE NAME=\"interop\"/></LOCALNAMESPACEPATH></NAMESPACEPATH>" +
                std::string(leafA) + "</INSTANCEPATH>");
}

TEST_F(Paths, ObjectPathHoldsAnInstancePath) {
  const std::string out = written(PathForm::objectPath, leaf("a"), {"h", ""});
  EXPECT_EQ(out, "<OBJECTPATH>" + written(PathForm::instancePath, leaf("a"), {"h", ""}) + "</OBJECTPATH>");
  EXPECT_EQ(dsp0203::firstViolation(response(out)), "");
}

TEST_F(Paths, ReferencesAreWholeAsFarAsIsKnown) {
  EXPECT_EQ(written(PathForm::valueReference, leaf("a", "")),
            "<VALUE.REFERENCE>" + std::string(leafA) + "</VALUE.REFERENCE>");
  EXPECT_EQ(written(PathForm::valueReference, leaf("a"), {"h", "x"}),
            "<VALUE.REFERENCE><LOCALINSTANCEPATH>" + std::string(cimv2) + std::string(leafA) +
                "</LOCALINSTANCEPATH></VALUE.REFERENCE>");
  ObjectPath& elsewhere = leaf("a");
  elsewhere.setHostName("other");
  const std::string out = written(PathForm::valueReference, elsewhere);
  EXPECT_EQ(out, "<VALUE.REFERENCE><INSTANCEPATH><NAMESPACEPATH><HOST>other</HOST>" + std::string(cimv2) +
                     "</NAMESPACEPATH>" + std::string(leafA) + "</INSTANCEPATH></VALUE.REFERENCE>");
  EXPECT_EQ(dsp0203::firstViolation(response(out)), "");
}

TEST_F(Paths, KeysThatAreReferences) {
  const std::string out = written(PathForm::instanceName, tie(leaf("a"), leaf("b")));
  EXPECT_THAT(
      out, testing::StartsWith("<INSTANCENAME CLASSNAME=\"Tie\"><KEYBINDING NAME=\"Left\"><VALUE.REFERENCE>"
                               "<LOCALINSTANCEPATH>"));
  EXPECT_EQ(dsp0203::firstViolation(response(out)), "");
}

TEST_F(Paths, ReferencesNestedTooDeeplyLoseTheirKeys) {
  ObjectPath* nested = &leaf("a");
  for (unsigned depth = 0; depth <= referenceDepth; ++depth)
    nested = &tie(*nested, leaf("b"));
  const std::string out = written(PathForm::instanceName, *nested);
  EXPECT_EQ(dsp0203::firstViolation(response(out)), "");
  EXPECT_EQ(out.find(">a</KEYVALUE>"), std::string::npos);
}

// One writer for all paths of an answer, whatever comes: classes, namespaces and keys change in turn.
TEST_F(Paths, OneWriterForPathsOfManyKinds) {
  ObjectPath& strange = path("Leaf");
  CMPIValue value{};
  value.uint16 = 7;
  set(strange, "Name", value, CMPI_uint16);
  ObjectPath& more = leaf("m");
  setText(more, "Extra", "x");
  ObjectPath& hosted = leaf("h");
  hosted.setHostName("other");
  const std::vector<const ObjectPath*> all{&leaf("a"),
                                           &leaf("b"),
                                           &path("Single"),
                                           &leaf("c"),
                                           &strange,
                                           &leaf("d"),
                                           &more,
                                           &leaf("e", "root/else"),
                                           &hosted,
                                           &tie(leaf("x"), leaf("y", "n")),
                                           &tie(leaf("y", "n"), leaf("x")),
                                           &leaf("f")};
  for (const PathForm form :
       {PathForm::instanceName, PathForm::instancePath, PathForm::objectPath, PathForm::valueReference}) {
    PathWriter writer(form, {"h", "n"});
    for (const ObjectPath* const each : all) {
      std::string out;
      writer.append(out, *each);
      EXPECT_EQ(out, written(form, *each, {"h", "n"}));
    }
  }
}

TEST_F(Paths, Classes) {
  std::string out;
  appendClassName(out, "A<");
  EXPECT_EQ(out, "<CLASSNAME NAME=\"A&lt;\"/>");
  EXPECT_EQ(dsp0203::firstViolation(response(out)), "");
  out.clear();
  appendClassPath(out, "A", {"h", "root/cimv2"});
  EXPECT_EQ(out, "<CLASSPATH><NAMESPACEPATH><HOST>h</HOST>" + std::string(cimv2) +
                     "</NAMESPACEPATH><CLASSNAME NAME=\"A\"/></CLASSPATH>");
  out.clear();
  appendClassObjectPath(out, "A", {"h", "root/cimv2"});
  EXPECT_EQ(dsp0203::firstViolation(response(out)), "");
}

}  // namespace
}  // namespace cimom::xml
