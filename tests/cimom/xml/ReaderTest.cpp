#include "Fixture.h"

namespace cimom::xml {
namespace {

std::string replacedIn(std::string text, std::string_view what, std::string_view with) {
  const std::size_t at = text.find(what);
  EXPECT_NE(at, std::string::npos) << what;
  return text.replace(at, what.size(), with);
}

TEST(Reader, FrameOfAnIntrinsicCall) {
  const MethodCall call =
      readRequest(request("<IPARAMVALUE NAME=\"ClassName\"><CLASSNAME NAME=\"C\"/></IPARAMVALUE>"
                          "<IPARAMVALUE NAME=\"LocalOnly\"><VALUE>FALSE</VALUE></IPARAMVALUE>"));
  EXPECT_EQ(call.messageId, "42");
  EXPECT_TRUE(call.isIntrinsic);
  EXPECT_EQ(call.name, "GetInstance");
  EXPECT_EQ(call.nameSpace, "root/cimv2");
  ASSERT_EQ(call.parameters.size(), 2U);
  EXPECT_EQ(call.parameters[0].name, "ClassName");
  EXPECT_FALSE(call.object);
}

TEST(Reader, TheRequestsOfTheseTestsAreValid) {
  EXPECT_EQ(dsp0203::firstViolation(request("<IPARAMVALUE NAME=\"P\"/>")), "");
}

TEST(Reader, ParametersAreFoundInAnyCase) {
  const MethodCall call =
      readRequest(request("<IPARAMVALUE NAME=\"localONLY\"><VALUE>x</VALUE></IPARAMVALUE>"));
  ASSERT_NE(call.parameter("LocalOnly"), nullptr);
  EXPECT_EQ(std::get<std::string>(call.parameter("LocalOnly")->value), "x");
  EXPECT_EQ(call.parameter("Local"), nullptr);
}

TEST(Reader, NamespaceInOneElementWithSlashes) {
  const std::string body = replacedIn(request(""), "<NAMESPACE NAME=\"root\"/><NAMESPACE NAME=\"cimv2\"/>",
                                      "<NAMESPACE NAME=\"/root/interop/\"/>");
  EXPECT_EQ(readRequest(body).nameSpace, "root/interop");
}

TEST(Reader, VersionsOfTheSameMajorNumberAreTaken) {
  const std::string body = request("");
  EXPECT_EQ(refusal(replacedIn(body, "CIMVERSION=\"2.0\"", "CIMVERSION=\"2.3\"")), "");
  EXPECT_EQ(refusal(replacedIn(body, "DTDVERSION=\"2.0\"", "DTDVERSION=\"2.3.1\"")), "");
  EXPECT_EQ(refusal(replacedIn(body, "PROTOCOLVERSION=\"1.0\"", "PROTOCOLVERSION=\"1.4\"")), "");
}

TEST(Reader, OtherVersionsAreNot) {
  const std::string body = request("");
  EXPECT_EQ(refusal(replacedIn(body, "CIMVERSION=\"2.0\"", "CIMVERSION=\"3.0\"")),
            "501 unsupported-cim-version");
  EXPECT_EQ(refusal(replacedIn(body, "CIMVERSION=\"2.0\"", "CIMVERSION=\"2\"")),
            "501 unsupported-cim-version");
  EXPECT_EQ(refusal(replacedIn(body, "CIMVERSION=\"2.0\"", "CIMVERSION=\"20.1\"")),
            "501 unsupported-cim-version");
  EXPECT_EQ(refusal(replacedIn(body, "DTDVERSION=\"2.0\"", "DTDVERSION=\"1.0\"")),
            "501 unsupported-dtd-version");
  EXPECT_EQ(refusal(replacedIn(body, "PROTOCOLVERSION=\"1.0\"", "PROTOCOLVERSION=\"2.0\"")),
            "501 unsupported-protocol-version");
}

TEST(Reader, MultipleRequestsAreRefused) {
  std::string body = replacedIn(request(""), "<SIMPLEREQ>", "<MULTIREQ><SIMPLEREQ>");
  body = replacedIn(body, "</SIMPLEREQ>", "</SIMPLEREQ></MULTIREQ>");
  EXPECT_EQ(refusal(body), "501 multiple-requests-unsupported");
}

TEST(Reader, WhatIsNoOperationIsUnsupported) {
  const std::string body = request("");
  const std::size_t from = body.find("<SIMPLEREQ>");
  const std::size_t to = body.find("</MESSAGE>");
  for (const std::string content :
       {"<SIMPLEEXPREQ><EXPMETHODCALL NAME=\"ExportIndication\"/></SIMPLEEXPREQ>", "<MULTIEXPREQ/>",
        "<SIMPLERSP><IMETHODRESPONSE NAME=\"GetClass\"/></SIMPLERSP>", "<MULTIRSP/>", "<SIMPLEEXPRSP/>"}) {
    EXPECT_EQ(refusal(std::string(body).replace(from, to - from, content)), "501 unsupported-operation")
        << content;
  }
  EXPECT_EQ(refusal("<CIM CIMVERSION=\"2.0\" DTDVERSION=\"2.0\"><DECLARATION/></CIM>"),
            "501 unsupported-operation");
}

TEST(Reader, AnAnswerToAnotherPlaceIsUnsupported) {
  EXPECT_EQ(refusal(request("<RESPONSEDESTINATION><INSTANCE CLASSNAME=\"C\"/></RESPONSEDESTINATION>")),
            "501 unsupported-operation");
}

TEST(Reader, CorrelatorsArePassedOver) {
  const std::string body =
      replacedIn(request(""), "<SIMPLEREQ>",
                 "<SIMPLEREQ><CORRELATOR NAME=\"a\" TYPE=\"string\"><VALUE>x</VALUE></CORRELATOR>");
  EXPECT_EQ(readRequest(body).name, "GetInstance");
}

TEST(Reader, NotWellFormed) {
  EXPECT_EQ(refusal(""), "400 request-not-well-formed");
  EXPECT_EQ(refusal("no XML"), "400 request-not-well-formed");
  EXPECT_EQ(refusal(request("<IPARAMVALUE NAME=\"P\">")), "400 request-not-well-formed");
  EXPECT_EQ(refusal(request("").substr(0, 120)), "400 request-not-well-formed");
  EXPECT_EQ(refusal(request("") + "<CIM/>"), "400 request-not-well-formed");
  EXPECT_EQ(refusal(request("<IPARAMVALUE NAME=\"P\" NAME=\"Q\"/>")), "400 request-not-well-formed");
  EXPECT_EQ(refusal(request("<IPARAMVALUE NAME=\"P\"><VALUE>\x01</VALUE></IPARAMVALUE>")),
            "400 request-not-well-formed");
}

TEST(Reader, RequiredAttributesAreMissing) {
  const std::string body = request("<IPARAMVALUE NAME=\"P\"/>");
  for (const std::string attribute :
       {" CIMVERSION=\"2.0\"", " DTDVERSION=\"2.0\"", " ID=\"42\"", " PROTOCOLVERSION=\"1.0\"",
        " NAME=\"GetInstance\"", " NAME=\"root\"", " NAME=\"P\""})
    EXPECT_EQ(refusal(replacedIn(body, attribute, "")), "400 request-not-loosely-valid") << attribute;
}

TEST(Reader, ElementsInWrongPlaces) {
  const std::string body = request("");
  EXPECT_EQ(refusal("<MESSAGE/>"), "400 request-not-loosely-valid");
  EXPECT_EQ(refusal("<HTML/>"), "400 request-not-loosely-valid");
  EXPECT_EQ(refusal("<CIM CIMVERSION=\"2.0\" DTDVERSION=\"2.0\"/>"), "400 request-not-loosely-valid");
  EXPECT_EQ(refusal(replacedIn(body, "<NAMESPACE NAME=\"root\"/><NAMESPACE NAME=\"cimv2\"/>", "")),
            "400 request-not-loosely-valid");
  EXPECT_EQ(refusal(request("text")), "400 request-not-loosely-valid");
  EXPECT_EQ(refusal(request("<VALUE/>")), "400 request-not-loosely-valid");
  EXPECT_EQ(refusal(replacedIn(body, "</SIMPLEREQ>", "</SIMPLEREQ><SIMPLEREQ/>")),
            "400 request-not-loosely-valid");
}

TEST(Reader, WhatTheDocumentTypeDoesNotKnowIsPassedOver) {
  const MethodCall call =
      readRequest(request("<IPARAMVALUE NAME=\"P\" "
                          "COLOR=\"red\"><EXTRA>words<VALUE>1</VALUE></EXTRA><VALUE>2</VALUE></IPARAMVALUE>"
                          "<X/>"));
  ASSERT_EQ(call.parameters.size(), 1U);
  EXPECT_EQ(std::get<std::string>(call.parameters[0].value), "2");
}

// Every element of the document type is known: none is passed over where it has no place.
TEST(Reader, EveryElementOfTheDocumentTypeIsKnown) {
  for (const std::string& name : dsp0203::elementNames())
    if (name != "IPARAMVALUE" && name != "RESPONSEDESTINATION") {
      EXPECT_EQ(refusal(request("<" + name + "/>")), "400 request-not-loosely-valid") << name;
    }
}

TEST(Reader, MessagesNameTheLineAndWhatWasExpected) {
  try {
    (void)readRequest(request("\n<IPARAMVALUE NAME=\"P\">\n<KEYVALUE/></IPARAMVALUE>"));
    FAIL() << "it was taken";
  } catch (const RequestError& error) {
    EXPECT_STREQ(error.what(), "line 6: KEYVALUE does not belong here in IPARAMVALUE");
  }
}

TEST(Reader, EncodingsOfExpat) {
  const std::string latin = replacedIn(
      request("<IPARAMVALUE NAME=\"P\"><VALUE>caf\xe9</VALUE></IPARAMVALUE>"), "utf-8", "ISO-8859-1");
  EXPECT_EQ(std::get<std::string>(readRequest(latin).parameters.at(0).value), "caf\xc3\xa9");
  const std::string ascii = replacedIn(
      request("<IPARAMVALUE NAME=\"P\"><VALUE>a&#233;</VALUE></IPARAMVALUE>"), "utf-8", "US-ASCII");
  EXPECT_EQ(std::get<std::string>(readRequest(ascii).parameters.at(0).value), "a\xc3\xa9");
  std::string utf16 = "\xff\xfe";
  for (const char character :
       replacedIn(request("<IPARAMVALUE NAME=\"P\"><VALUE>x</VALUE></IPARAMVALUE>"), "utf-8", "UTF-16"))
    utf16.append({character, '\0'});
  EXPECT_EQ(std::get<std::string>(readRequest(utf16).parameters.at(0).value), "x");
  EXPECT_EQ(refusal(replacedIn(request(""), "utf-8", "windows-1252")), "400 request-not-well-formed");
}

TEST(Reader, BytesThatAreNoUtf8) {
  EXPECT_EQ(refusal(request("<IPARAMVALUE NAME=\"P\"><VALUE>caf\xe9</VALUE></IPARAMVALUE>")),
            "400 request-not-well-formed");
}

TEST(Reader, EmbeddedInstance) {
  const InstanceElement instance = readInstance(
      "<INSTANCE CLASSNAME=\"C\"><PROPERTY NAME=\"P\" TYPE=\"uint8\"><VALUE>1</VALUE></PROPERTY></INSTANCE>");
  EXPECT_EQ(instance.className, "C");
  EXPECT_EQ(instance.properties.size(), 1U);
  EXPECT_THROW((void)readInstance("<CLASS NAME=\"C\"/>"), RequestError);
  EXPECT_THROW((void)readInstance("instance of C {};"), RequestError);
}

}  // namespace
}  // namespace cimom::xml
