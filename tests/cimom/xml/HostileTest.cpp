#include "Fixture.h"

namespace cimom::xml {
namespace {

std::string withDoctype(std::string_view doctype, std::string_view content) {
  std::string body =
      request("<IPARAMVALUE NAME=\"P\"><VALUE>" + std::string(content) + "</VALUE></IPARAMVALUE>");
  return body.insert(body.find("<CIM "), doctype);
}

std::string nested(std::size_t depth) {
  std::string text;
  for (std::size_t level = 0; level < depth; ++level)
    text += "<X>";
  for (std::size_t level = 0; level < depth; ++level)
    text += "</X>";
  return text;
}

TEST(Hostile, EntitiesAreNeverDeclared) {
  EXPECT_EQ(refusal(withDoctype("<!DOCTYPE CIM [<!ENTITY a \"aaaa\">]>", "&a;")), "400 request-not-valid");
  EXPECT_EQ(refusal(withDoctype("<!DOCTYPE CIM [<!ENTITY a SYSTEM \"file:///etc/passwd\">]>", "&a;")),
            "400 request-not-valid");
  EXPECT_EQ(refusal(withDoctype("<!DOCTYPE CIM [<!ENTITY % a \"<!ENTITY b 'c'>\">%a;]>", "&b;")),
            "400 request-not-valid");
  EXPECT_EQ(refusal(withDoctype("<!DOCTYPE CIM []>", "x")), "400 request-not-valid");
}

TEST(Hostile, ALaughAmongBillions) {
  std::string doctype = "<!DOCTYPE CIM [<!ENTITY l0 \"ha\">";
  for (int level = 1; level < 30; ++level) {
    const std::string below = "&l" + std::to_string(level - 1) + ";";
    doctype += "<!ENTITY l" + std::to_string(level) + " \"" + below + below + "\">";
  }
  EXPECT_EQ(refusal(withDoctype(doctype + "]>", "&l29;")), "400 request-not-valid");
}

TEST(Hostile, ADoctypeThatDeclaresNothingIsTolerated) {
  for (const char* const doctype :
       {"<!DOCTYPE CIM SYSTEM \"HTTP://www.dmtf.org/cim/mof/dtd/\">",
        "<!DOCTYPE CIM PUBLIC \"-//X//Y\" \"file:///nowhere.dtd\">", "<!DOCTYPE CIM>"}) {
    const MethodCall call = readRequest(withDoctype(doctype, "a&lt;b&#65;"));
    EXPECT_EQ(std::get<std::string>(call.parameters.at(0).value), "a<bA") << doctype;
  }
}

TEST(Hostile, UndeclaredEntities) {
  EXPECT_EQ(refusal(withDoctype("", "&a;")), "400 request-not-well-formed");
  EXPECT_EQ(refusal(withDoctype("<!DOCTYPE CIM SYSTEM \"x.dtd\">", "&a;")), "400 request-not-well-formed");
  std::string body = withDoctype("<!DOCTYPE CIM SYSTEM \"x.dtd\">", "x");
  body.replace(body.find("\"P\""), 3, "\"P&a;Q\"");
  EXPECT_EQ(refusal(body), "400 request-not-well-formed");
  body.replace(body.find("&a;"), 3, "&amp;");
  EXPECT_EQ(readRequest(body).parameters.at(0).name, "P&Q");
}

TEST(Hostile, Depth) {
  Limits limits;
  limits.depth = 20;
  EXPECT_EQ(refusal(request(nested(15)), limits), "");  // five elements are around it
  EXPECT_EQ(refusal(request(nested(16)), limits), "");
  EXPECT_EQ(refusal(request(nested(17)), limits), "400 request-not-valid");
  EXPECT_EQ(refusal(request(nested(1'000'000))), "400 request-not-valid");
}

TEST(Hostile, Elements) {
  Limits limits;
  limits.elements = 8;  // seven are the request's own
  EXPECT_EQ(refusal(request("<X/>"), limits), "");
  EXPECT_EQ(refusal(request("<X/><X/>"), limits), "400 request-not-valid");
}

TEST(Hostile, Attributes) {
  Limits limits;
  limits.attributes = 2;
  limits.attributeLength = 100;
  EXPECT_EQ(refusal(request("<IPARAMVALUE NAME=\"P\" A=\"\"/>"), limits), "");
  EXPECT_EQ(refusal(request("<IPARAMVALUE NAME=\"P\" A=\"\" B=\"\"/>"), limits), "400 request-not-valid");
  EXPECT_EQ(refusal(request("<IPARAMVALUE NAME=\"" + std::string(100, 'n') + "\"/>"), limits), "");
  EXPECT_EQ(refusal(request("<IPARAMVALUE NAME=\"" + std::string(101, 'n') + "\"/>"), limits),
            "400 request-not-valid");
}

TEST(Hostile, Text) {
  Limits limits;
  limits.textLength = 100;
  const auto sized = [](std::size_t size) {
    return request("<IPARAMVALUE NAME=\"P\"><VALUE>" + std::string(size, 't') + "</VALUE></IPARAMVALUE>");
  };
  EXPECT_EQ(refusal(sized(100), limits), "");
  EXPECT_EQ(refusal(sized(101), limits), "400 request-not-valid");
}

TEST(Hostile, CharacterDataSectionsAndCommentsAreText) {
  const MethodCall call =
      readRequest(request("<!-- a --><IPARAMVALUE NAME=\"P\"><VALUE>a<![CDATA[<b>&c;]]><!-- no "
                          "-->d</VALUE></IPARAMVALUE><?pi x?>"));
  EXPECT_EQ(std::get<std::string>(call.parameters.at(0).value), "a<b>&c;d");
}

TEST(Hostile, NamesOfManyNestedReferencesAreRead) {
  std::string name = "<INSTANCENAME CLASSNAME=\"C\"/>";
  for (int level = 0; level < 15; ++level)
    name = "<INSTANCENAME CLASSNAME=\"C\"><KEYBINDING NAME=\"K\"><VALUE.REFERENCE>" + name +
           "</VALUE.REFERENCE></KEYBINDING></INSTANCENAME>";
  EXPECT_EQ(refusal(request("<IPARAMVALUE NAME=\"P\">" + name + "</IPARAMVALUE>")), "");
}

}  // namespace
}  // namespace cimom::xml
