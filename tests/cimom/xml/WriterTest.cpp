#include "Fixture.h"

namespace cimom::xml {
namespace {

TEST(Frame, OfAnIntrinsicMethod) {
  std::string out;
  beginResponse(out, "a&1", "GetInstance");
  beginReturnValue(out);
  endReturnValue(out);
  endResponse(out);
  EXPECT_EQ(
      out,
      "<?xml version=\"1.0\" encoding=\"utf-8\"?>\n<CIM CIMVERSION=\"2.0\" DTDVERSION=\"2.0\"><MESSAGE "
      "ID=\"a&amp;1\" PROTOCOLVERSION=\"1.0\"><SIMPLERSP><IMETHODRESPONSE NAME=\"GetInstance\"><IRETURNVALUE>"
      "</IRETURNVALUE></IMETHODRESPONSE></SIMPLERSP></MESSAGE></CIM>\n");
  EXPECT_EQ(dsp0203::firstViolation(out), "");
}

TEST(Frame, OfAMethodOfAnObject) {
  std::string out;
  beginResponse(out, "1", "Start", MethodKind::extrinsic);
  appendError(out, CMPI_RC_ERR_METHOD_NOT_AVAILABLE, "");
  endResponse(out, MethodKind::extrinsic);
  EXPECT_THAT(out,
              testing::HasSubstr("<METHODRESPONSE NAME=\"Start\"><ERROR CODE=\"16\"/></METHODRESPONSE>"));
  EXPECT_EQ(dsp0203::firstViolation(out), "");
}

TEST(Frame, OddIdsAndMethodsStayWhatTheyAre) {
  std::string out;
  beginResponse(out, "\"<1>\"\n", "\x01M");
  endResponse(out);
  EXPECT_THAT(out, testing::HasSubstr("ID=\"&quot;&lt;1&gt;&quot;&#10;\""));
  EXPECT_EQ(dsp0203::firstViolation(out), "");
}

TEST(Frame, Errors) {
  std::string out;
  appendError(out, CMPI_RC_ERR_NOT_FOUND, "no \"thing\"\nat all");
  EXPECT_EQ(out, "<ERROR CODE=\"6\" DESCRIPTION=\"no &quot;thing&quot;&#10;at all\"/>");
  for (const auto& [code, written] :
       {std::pair{21, "21"}, {29, "29"}, {0, "1"}, {30, "1"}, {-1, "1"}, {61, "1"}, {200, "1"}}) {
    out.clear();
    appendError(out, code, "");
    EXPECT_EQ(out, "<ERROR CODE=\"" + std::string(written) + "\"/>");
  }
}

TEST(Frame, WhatPullsGiveBack) {
  std::string out;
  beginResponse(out, "1", "PullInstancesWithPath");
  beginReturnValue(out);
  endReturnValue(out);
  appendOutParameter(out, "EnumerationContext", "c<1>");
  appendOutParameter(out, "EndOfSequence", false);
  appendOutParameter(out, "Other", true);
  appendNullOutParameter(out, "Missing", CMPI_uint64);
  endResponse(out);
  EXPECT_THAT(
      out,
      testing::HasSubstr(
          "<PARAMVALUE NAME=\"EnumerationContext\" PARAMTYPE=\"string\"><VALUE>c&lt;1&gt;</VALUE>"
          "</PARAMVALUE><PARAMVALUE NAME=\"EndOfSequence\" PARAMTYPE=\"boolean\"><VALUE>FALSE</VALUE>"
          "</PARAMVALUE><PARAMVALUE NAME=\"Other\" PARAMTYPE=\"boolean\"><VALUE>TRUE</VALUE></PARAMVALUE>"
          "<PARAMVALUE NAME=\"Missing\" PARAMTYPE=\"uint64\"/>"));
  EXPECT_EQ(dsp0203::firstViolation(out), "");
}

}  // namespace
}  // namespace cimom::xml
