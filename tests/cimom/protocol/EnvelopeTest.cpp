// The HTTP around CIM messages: methods, headers, media types, and what is not tried at all.
#include "Fixture.h"

#include <cimom/protocol/Envelope.h>

namespace {

using protocol_test::header;
using protocol_test::Protocol;
using protocol_test::Recorded;
using protocol_test::removeHeader;
using protocol_test::request;
using protocol_test::Request;
using testing::HasSubstr;
using testing::IsEmpty;

class Envelope : public Protocol {
 protected:
  static Request classNames() { return request("EnumerateClassNames"); }

  /// An M-POST with the prefix 73.
  static Request extended() {
    Request made = classNames();
    made.method = "M-POST";
    made.fields = {{"Content-Type", "text/xml"},
                   {"Man", "http://www.dmtf.org/cim/mapping/http/v1.0 ; ns=73"},
                   {"73-CIMOperation", "MethodCall"},
                   {"73-CIMMethod", "EnumerateClassNames"},
                   {"73-CIMObject", "root%2Ftest"}};
    return made;
  }

  /// A refusal has a reason, is in plain text, and is logged with the client's address.
  void expectRefusal(const Request& made, int status, const std::string& cimError) {
    const std::size_t logged = log_.all().size();
    const Recorded answer = send(made);
    EXPECT_EQ(answer.status, status) << answer.body;
    EXPECT_EQ(answer.field("CIMError"), cimError);
    EXPECT_EQ(answer.has("CIMError"), !cimError.empty());
    EXPECT_THAT(answer.field("Content-Type"), HasSubstr("text/plain"));
    EXPECT_GT(answer.body.size(), 10U);
    EXPECT_FALSE(answer.has("CIMOperation"));
    ASSERT_EQ(log_.all().size(), logged + 1);
    EXPECT_THAT(log_.all().back(), HasSubstr("127.0.0.1:1234: refused with " + std::to_string(status)));
  }

  void expectAnswer(const Request& made) {
    const Recorded answer = send(made);
    EXPECT_EQ(answer.status, 200) << answer.body;
    EXPECT_THAT(answer.body, HasSubstr("TEST_Element"));
  }
};

TEST_F(Envelope, answersAPostInXml) {
  const Recorded answer = send(classNames());
  EXPECT_EQ(answer.status, 200);
  EXPECT_EQ(answer.field("Content-Type"), "application/xml; charset=utf-8");
  EXPECT_EQ(answer.field("CIMOperation"), "MethodResponse");
  EXPECT_FALSE(answer.has("CIMError"));
  EXPECT_FALSE(answer.has("Man"));
  EXPECT_FALSE(answer.has("Ext"));
  EXPECT_THAT(log_.all(), IsEmpty());
}

TEST_F(Envelope, answersAtAnyPath) {
  Request made = classNames();
  made.target = "/some/where?else";
  expectAnswer(made);
}

TEST_F(Envelope, saysThatItIsWell) {
  Request made;
  made.method = "GET";
  made.target = "/healthz";
  const Recorded answer = send(made);
  EXPECT_EQ(answer.status, 200);
  EXPECT_EQ(answer.body, "ok\n");
  EXPECT_THAT(answer.field("Content-Type"), HasSubstr("text/plain"));
  made.target = "/healthz?verbose";
  EXPECT_EQ(send(made).status, 200);
  EXPECT_THAT(log_.all(), IsEmpty());

  settings_.healthz = false;
  restart();
  EXPECT_EQ(send(made).status, 405);
}

TEST_F(Envelope, refusesOtherMethods) {
  for (const char* method : {"GET", "PUT", "OPTIONS", "post"}) {
    Request made = classNames();
    made.method = method;
    expectRefusal(made, 405, "");
    EXPECT_EQ(send(made).field("Allow"), "POST, M-POST");
  }
}

TEST_F(Envelope, takesCimHeadersWithThePrefixOfAnMPost) {
  const Recorded answer = send(extended());
  EXPECT_EQ(answer.status, 200) << answer.body;
  EXPECT_THAT(answer.body, HasSubstr("TEST_Element"));
  EXPECT_EQ(answer.field("Man"), "http://www.dmtf.org/cim/mapping/http/v1.0 ; ns=73");
  EXPECT_TRUE(answer.has("Ext"));
  EXPECT_EQ(answer.field("Ext"), "");
  EXPECT_EQ(answer.field("Cache-Control"), "no-cache");
  EXPECT_EQ(answer.field("73-CIMOperation"), "MethodResponse");
  EXPECT_FALSE(answer.has("CIMOperation"));
}

TEST_F(Envelope, takesBothVersionsOfTheMappingAndQuotes) {
  Request made = extended();
  header(made, "Man") = R"("http://www.dmtf.org/cim/mapping/http/v1.1"; ns=73)";
  EXPECT_EQ(send(made).field("Man"), "http://www.dmtf.org/cim/mapping/http/v1.1 ; ns=73");
}

TEST_F(Envelope, takesAnMPostWithoutANumber) {
  Request made = classNames();
  made.method = "M-POST";
  header(made, "Man") = "http://www.dmtf.org/cim/mapping/http/v1.0";
  const Recorded answer = send(made);
  EXPECT_EQ(answer.status, 200);
  EXPECT_EQ(answer.field("Man"), "http://www.dmtf.org/cim/mapping/http/v1.0");
  EXPECT_EQ(answer.field("CIMOperation"), "MethodResponse");
}

TEST_F(Envelope, refusesExtensionsThatItDoesNotKnow) {
  Request made = extended();
  removeHeader(made, "Man");
  expectRefusal(made, 400, "");
  for (const char* man :
       {"http://www.dmtf.org/cim/mapping/http/v2.0 ; ns=73", "http://example.com/x ; ns=1",
        "http://www.dmtf.org/cim/mapping/http/v1.0 ; ns=73, \"http://example.com/x\"; ns=74"}) {
    header(made, "Man") = man;
    expectRefusal(made, 510, "");
  }
  header(made, "Man") = "http://www.dmtf.org/cim/mapping/http/v1.0 ; ns=xy";
  expectRefusal(made, 400, "");
}

TEST_F(Envelope, spellsTheErrorsOfAnMPostWithItsPrefix) {
  Request made = extended();
  header(made, "73-CIMMethod") = "GetClass";
  const Recorded answer = send(made);
  EXPECT_EQ(answer.status, 400);
  EXPECT_EQ(answer.field("73-CIMError"), "header-mismatch");
  EXPECT_FALSE(answer.has("CIMError"));
  EXPECT_TRUE(answer.has("Ext"));
  header(made, "73-CIMProtocolVersion") = "2.0";
  EXPECT_EQ(send(made).field("73-CIMProtocolVersion"), "1.3");
  // Without the prefix they are none of CIM's.
  made = extended();
  removeHeader(made, "73-CIMOperation");
  header(made, "CIMOperation") = "MethodCall";
  EXPECT_EQ(send(made).status, 400);
}

TEST_F(Envelope, wantsAMethodCall) {
  Request made = classNames();
  header(made, "CIMOperation") = "methodcall";
  expectAnswer(made);
  header(made, "CIMOperation") = "MethodResponse";
  expectRefusal(made, 400, "unsupported-operation");
  removeHeader(made, "CIMOperation");
  expectRefusal(made, 400, "unsupported-operation");
}

TEST_F(Envelope, speaksTheFirstMajorVersion) {
  Request made = classNames();
  for (const char* version : {"1", "1.0", "1.4"}) {
    header(made, "CIMProtocolVersion") = version;
    expectAnswer(made);
  }
  for (const char* version : {"2.0", "10.0", ""}) {
    header(made, "CIMProtocolVersion") = version;
    expectRefusal(made, 501, "unsupported-protocol-version");
  }
  EXPECT_EQ(send(made).field("CIMProtocolVersion"), "1.3");
}

TEST_F(Envelope, refusesBatches) {
  Request made = classNames();
  header(made, "CIMBatch") = "CIMBatch";
  expectRefusal(made, 501, "multiple-requests-unsupported");
  // By its body too.
  made = classNames();
  const std::string one = made.body.substr(made.body.find("<SIMPLEREQ>"));
  const std::string simple = one.substr(0, one.find("</MESSAGE>"));
  made.body.replace(made.body.find("<SIMPLEREQ>"), simple.size(),
                    "<MULTIREQ>" + simple + simple + "</MULTIREQ>");
  expectRefusal(made, 501, "multiple-requests-unsupported");
}

TEST_F(Envelope, holdsTheHeadersAgainstTheBody) {
  const Request good = classNames();
  Request made = good;
  header(made, "CIMMethod") = "GetClass";
  expectRefusal(made, 400, "header-mismatch");
  header(made, "CIMMethod") = "";
  expectRefusal(made, 400, "header-mismatch");
  removeHeader(made, "CIMMethod");
  expectRefusal(made, 400, "header-mismatch");

  made = good;
  for (const char* object : {"root/cimv2", "root", "root/test:TEST_Item", ""}) {
    header(made, "CIMObject") = object;
    expectRefusal(made, 400, "header-mismatch");
  }
  removeHeader(made, "CIMObject");
  expectRefusal(made, 400, "header-mismatch");
}

TEST_F(Envelope, decodesHeadersAndIgnoresTheCaseOfNames) {
  Request made = classNames();
  header(made, "CIMMethod") = "%45numerate%43lass%4eames";
  header(made, "CIMObject") = "ROOT%2Ftest";
  expectAnswer(made);
  header(made, "CIMObject") = "/root/test";
  header(made, "CIMMethod") = "enumerateCLASSnames";
  expectAnswer(made);
  for (const char* broken : {"root%2", "root%2Gtest", "root%", "root%%2Ftest"}) {
    header(made, "CIMObject") = broken;
    expectRefusal(made, 400, "header-mismatch");
  }
}

TEST_F(Envelope, takesXmlAlone) {
  Request made = classNames();
  for (const char* type :
       {"text/xml", "Application/XML", "application/xml; charset=UTF-8", "text/xml;charset=\"us-ascii\""}) {
    header(made, "Content-Type") = type;
    expectAnswer(made);
  }
  for (const char* type :
       {"text/plain", "application/json", "application/x-www-form-urlencoded", "text/xml; charset=koi8-r"}) {
    header(made, "Content-Type") = type;
    expectRefusal(made, 415, "");
  }
  removeHeader(made, "Content-Type");
  expectAnswer(made);
}

TEST_F(Envelope, answersInTheMediaTypeThatTheClientTakes) {
  Request made = classNames();
  header(made, "Accept") = "text/xml";
  EXPECT_EQ(send(made).field("Content-Type"), "text/xml; charset=utf-8");
  for (const char* accept : {"text/xml, application/xml", "*/*", "application/*", "text/html, */*;q=0.1"}) {
    header(made, "Accept") = accept;
    EXPECT_EQ(send(made).field("Content-Type"), "application/xml; charset=utf-8") << accept;
  }
  header(made, "Accept") = "application/xml;q=0, */*";
  EXPECT_EQ(send(made).field("Content-Type"), "text/xml; charset=utf-8");
  for (const char* accept : {"text/html", "application/xml;q=0.0", "image/*"}) {
    header(made, "Accept") = accept;
    expectRefusal(made, 406, "");
  }
}

TEST_F(Envelope, answersInUtf8) {
  Request made = classNames();
  for (const char* charset : {"utf-8", "iso-8859-1, *;q=0.5", "*"}) {
    header(made, "Accept-Charset") = charset;
    expectAnswer(made);
  }
  for (const char* charset : {"iso-8859-1", "utf-8;q=0, *"}) {
    header(made, "Accept-Charset") = charset;
    expectRefusal(made, 406, "");
  }
}

TEST_F(Envelope, refusesBodiesThatAreNoRequests) {
  Request made = classNames();
  const std::string good = made.body;
  for (const std::string& body : {std::string(), std::string("<CIM>"), good.substr(0, good.size() / 2)}) {
    made.body = body;
    expectRefusal(made, 400, "request-not-well-formed");
  }
  made.body = "<html/>";
  expectRefusal(made, 400, "request-not-loosely-valid");
  made.body = good;
  made.body.replace(made.body.find("CIMVERSION=\"2.0\""), 16, "CIMVERSION=\"3.0\"");
  expectRefusal(made, 501, "unsupported-cim-version");
}

TEST_F(Envelope, neverLogsControlCharacters) {
  Request made = classNames();
  header(made, "CIMOperation") = "Method\nroot: logged in";
  send(made);
  ASSERT_EQ(log_.all().size(), 1U);
  EXPECT_EQ(log_.all().front().find('\n'), std::string::npos);
}

TEST(PercentEncoding, isReadAndWritten) {
  using cimom::protocol::percentDecoded;
  using cimom::protocol::percentEncoded;
  EXPECT_EQ(percentDecoded("a%20b%C3%a4"), "a b\xC3\xA4");
  EXPECT_EQ(percentDecoded("%41"), "A");
  EXPECT_EQ(percentDecoded(""), "");
  for (const char* broken : {"%", "%4", "a%4", "%4g", "%g4"})
    EXPECT_EQ(percentDecoded(broken), std::nullopt) << broken;
  EXPECT_EQ(percentEncoded("a b%\n\xC3\xA4"), "a b%25%0A%C3%A4");
}

}  // namespace
