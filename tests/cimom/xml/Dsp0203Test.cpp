#include <tests/support/ContentModel.h>
#include <tests/support/Dsp0203.h>
#include <tests/support/Dsp0203Elements.h>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <iterator>
#include <set>
#include <sstream>
#include <stdexcept>

namespace {

bool takes(const char* model, const std::string& children) {
  const ContentModel content(model);
  auto position = content.start();
  std::istringstream names(children);
  for (std::string name; names >> name;)
    position = content.after(position, name);
  return content.isComplete(position);
}

std::string message(const std::string& content) {
  return "<CIM CIMVERSION=\"2.0\" DTDVERSION=\"2.0\"><MESSAGE ID=\"1\" PROTOCOLVERSION=\"1.0\"><SIMPLERSP>\n"
         "<IMETHODRESPONSE NAME=\"X\">" +
         content + "</IMETHODRESPONSE></SIMPLERSP></MESSAGE></CIM>";
}
std::string returned(const std::string& content) {
  return message("<IRETURNVALUE>" + content + "</IRETURNVALUE>");
}

TEST(ContentModels, OneName) {
  EXPECT_TRUE(takes("(A)", "A"));
  EXPECT_FALSE(takes("(A)", ""));
  EXPECT_FALSE(takes("(A)", "A A"));
  EXPECT_FALSE(takes("(A)", "B"));
  EXPECT_TRUE(takes("(A)?", ""));
}

TEST(ContentModels, RepeatedNames) {
  EXPECT_TRUE(takes("(A*)", ""));
  EXPECT_TRUE(takes("(A*)", "A A A"));
  EXPECT_FALSE(takes("(A+)", ""));
  EXPECT_TRUE(takes("(A+)", "A A"));
  EXPECT_TRUE(takes("(A?,B)", "B"));
  EXPECT_FALSE(takes("(A?,B)", "A A B"));
}

TEST(ContentModels, SequencesAndChoices) {
  EXPECT_TRUE(takes("(A,B,C)", "A B C"));
  EXPECT_FALSE(takes("(A,B,C)", "A C"));
  EXPECT_FALSE(takes("(A,B,C)", "A B"));
  EXPECT_FALSE(takes("(A,B,C)", "B A C"));
  EXPECT_TRUE(takes("(A|B|C)", "B"));
  EXPECT_FALSE(takes("(A|B|C)", "A B"));
  EXPECT_TRUE(takes("(A|B)*", "A B B A"));
  EXPECT_TRUE(takes("(A*|B*)", "B B"));
  EXPECT_TRUE(takes("(A*|B*)", ""));
  EXPECT_FALSE(takes("(A*|B*)", "A B"));
  EXPECT_TRUE(takes("((A,B)|(C,D))", "C D"));
  EXPECT_FALSE(takes("((A,B)|(C,D))", "A D"));
  EXPECT_TRUE(takes("(E|(R?,P*))", "R P P"));
  EXPECT_FALSE(takes("(E|(R?,P*))", "E P"));
}

TEST(ContentModels, TextsThatAreNone) {
  EXPECT_THROW(ContentModel(""), std::invalid_argument);
  EXPECT_THROW(ContentModel("(A"), std::invalid_argument);
  EXPECT_THROW(ContentModel("(A|)"), std::invalid_argument);
  EXPECT_THROW(ContentModel("(A,B|C)"), std::invalid_argument);
  EXPECT_THROW(ContentModel("(A))"), std::invalid_argument);
}

TEST(Dsp0203, ValidDocuments) {
  for (const std::string& document :
       {message(""), message("<ERROR CODE=\"6\"/>"), message("<ERROR CODE=\"1\" DESCRIPTION=\"x\"/>"),
        returned(""), returned("<CLASSNAME NAME=\"A\"/><CLASSNAME NAME=\"B\"/>"),
        returned("<VALUE.NAMEDINSTANCE><INSTANCENAME CLASSNAME=\"A\"/><INSTANCE CLASSNAME=\"A\">"
                 "<PROPERTY NAME=\"P\" TYPE=\"uint8\"><VALUE>1</VALUE></PROPERTY>"
                 "<PROPERTY.ARRAY NAME=\"L\" "
                 "TYPE=\"string\"><VALUE.ARRAY><VALUE.NULL/></VALUE.ARRAY></PROPERTY.ARRAY>"
                 "</INSTANCE></VALUE.NAMEDINSTANCE>"),
        message("<IRETURNVALUE/><PARAMVALUE NAME=\"EndOfSequence\" PARAMTYPE=\"boolean\"><VALUE>TRUE</VALUE>"
                "</PARAMVALUE>")})
    EXPECT_EQ(dsp0203::firstViolation(document), "") << document;
}

TEST(Dsp0203, NotWellFormed) {
  EXPECT_THAT(dsp0203::firstViolation(message("<IRETURNVALUE>")), testing::HasSubstr("not well-formed"));
  EXPECT_NE(dsp0203::firstViolation(""), "");
}

TEST(Dsp0203, ElementsOutOfPlace) {
  EXPECT_EQ(dsp0203::firstViolation(
                returned("<VALUE.NAMEDINSTANCE><INSTANCE CLASSNAME=\"A\"/></VALUE.NAMEDINSTANCE>")),
            "line 2: VALUE.NAMEDINSTANCE has no place for INSTANCE here");
  EXPECT_EQ(dsp0203::firstViolation(
                returned("<VALUE.NAMEDINSTANCE><INSTANCENAME CLASSNAME=\"A\"/></VALUE.NAMEDINSTANCE>")),
            "line 2: VALUE.NAMEDINSTANCE ends too early");
  EXPECT_EQ(dsp0203::firstViolation(returned("<CLASSNAME NAME=\"A\"/><INSTANCE CLASSNAME=\"A\"/>")),
            "line 2: IRETURNVALUE has no place for INSTANCE here");
  EXPECT_EQ(dsp0203::firstViolation(message("<ERROR CODE=\"1\"/><IRETURNVALUE/>")),
            "line 2: IMETHODRESPONSE has no place for IRETURNVALUE here");
  EXPECT_EQ(dsp0203::firstViolation(returned("<VALUE><VALUE/></VALUE>")),
            "line 2: VALUE has no place for VALUE here");
  EXPECT_EQ(dsp0203::firstViolation(returned("<CLASSNAME NAME=\"A\"><VALUE/></CLASSNAME>")),
            "line 2: CLASSNAME has no place for VALUE here");
  EXPECT_EQ(dsp0203::firstViolation("<INSTANCE CLASSNAME=\"A\"/>"),
            "line 1: the document is INSTANCE, not CIM");
  EXPECT_EQ(dsp0203::firstViolation("<INSTANCE CLASSNAME=\"A\"/>", "INSTANCE"), "");
}

TEST(Dsp0203, UnknownNames) {
  EXPECT_EQ(dsp0203::firstViolation(returned("<VALUE.OBJ/>")), "line 2: there is no element VALUE.OBJ");
  EXPECT_EQ(dsp0203::firstViolation(returned("<CLASSNAME NAME=\"A\" COLOR=\"\"/>")),
            "line 2: CLASSNAME has no attribute COLOR");
}

TEST(Dsp0203, Attributes) {
  EXPECT_EQ(dsp0203::firstViolation(returned("<CLASSNAME/>")), "line 2: CLASSNAME lacks NAME");
  EXPECT_EQ(
      dsp0203::firstViolation(returned("<INSTANCE CLASSNAME=\"A\"><PROPERTY NAME=\"P\" TYPE=\"reference\"/>"
                                       "</INSTANCE>")),
      "line 2: PROPERTY: TYPE cannot be \"reference\"");
  EXPECT_EQ(dsp0203::firstViolation(returned("<INSTANCENAME CLASSNAME=\"A\"><KEYVALUE VALUETYPE=\"real\"/>"
                                             "</INSTANCENAME>")),
            "line 2: KEYVALUE: VALUETYPE cannot be \"real\"");
  EXPECT_EQ(dsp0203::firstViolation(message("<PARAMVALUE NAME=\"P\" PARAMTYPE=\"reference\"/>")), "");
}

TEST(Dsp0203, TextWhereElementsBelong) {
  EXPECT_EQ(dsp0203::firstViolation(returned("x")), "line 2: IRETURNVALUE holds no text");
  EXPECT_EQ(dsp0203::firstViolation(returned("\n  \t")), "");
}

// Whatever an element holds is an element of the table; and every element but the root is held by one.
TEST(Dsp0203, TheTableIsClosed) {
  std::set<std::string> held{"CIM", "TABLE"};  // tables stand alone
  for (const dsp0203::ElementDeclaration& element : dsp0203::elements) {
    if (element.content == "#PCDATA" || element.content == "EMPTY")
      continue;
    std::string content(element.content);
    std::replace_if(
        content.begin(), content.end(),
        [](char character) { return std::string_view("(),|?*+").find(character) != std::string_view::npos; },
        ' ');
    std::istringstream names(content);
    held.insert(std::istream_iterator<std::string>(names), {});
  }
  EXPECT_THAT(dsp0203::elementNames(), testing::UnorderedElementsAreArray(held));
}

}  // namespace
