#include "Fixture.h"

#include <cimom/broker/WbemUri.h>

namespace cimom {
namespace {

class WbemUriTest : public BrokerTest {
 protected:
  ObjectPath* parse(std::string_view uri, std::string_view defaultNameSpace = "root/default") {
    return parseWbemUri(request_.arena(), broker_.classes(), uri, defaultNameSpace);
  }
  std::string error(std::string_view uri) {
    try {
      return "no error: " + formatWbemUri(*parse(uri));
    } catch (const WbemUriError& thrown) {
      return thrown.what();
    }
  }
  CMPIData key(std::string_view uri, const char* name) { return parse(uri)->find(name)->data; }
};

TEST_F(WbemUriTest, ReadsWhatStandsBeforeTheClass) {
  struct Case {
    const char* uri;
    const char* host;
    const char* nameSpace;
  };
  const Case cases[] = {{"Test_Thing", "", "root/default"},
                        {"root/cimv2:Test_Thing", "", "root/cimv2"},
                        {"interop:Test_Thing", "", "interop"},
                        {"//host/root/cimv2:Test_Thing", "host", "root/cimv2"},
                        {"//host:5988/root/cimv2:Test_Thing", "host:5988", "root/cimv2"},
                        {"//[::1]:5989/root/cimv2:Test_Thing", "[::1]:5989", "root/cimv2"},
                        {"http://host:5988/root/cimv2:Test_Thing", "host:5988", "root/cimv2"},
                        {"cimxml.wbem://host/root:Test_Thing", "host", "root"},
                        {"//host/:Test_Thing", "host", ""}};
  for (const Case& expected : cases) {
    const ObjectPath& path = *parse(expected.uri);
    EXPECT_EQ(path.hostName(), expected.host) << expected.uri;
    EXPECT_EQ(path.nameSpace(), expected.nameSpace) << expected.uri;
    EXPECT_EQ(path.className(), "Test_Thing") << expected.uri;
    EXPECT_TRUE(path.keys().empty());
  }
}

TEST_F(WbemUriTest, ReadsKeys) {
  const ObjectPath& path = *parse(R"(test_thing.INSTANCEID="a \"b\" \\ c,d=e:f",K2=5,K3=true)");
  EXPECT_EQ(path.className(), "Test_Thing");
  ASSERT_EQ(path.keys().size(), 3U);
  EXPECT_EQ(path.keys()[0].name, "InstanceID");
  EXPECT_EQ(text(path.keys()[0].data), R"(a "b" \ c,d=e:f)");
  EXPECT_EQ(path.keys()[1].name, "K2");
  EXPECT_EQ(path.keys()[1].data.type, CMPI_sint64);
  EXPECT_EQ(path.keys()[1].data.value.sint64, 5);
  EXPECT_EQ(path.keys()[2].data.type, CMPI_boolean);
  EXPECT_EQ(path.keys()[2].data.value.boolean, 1);
}

TEST_F(WbemUriTest, KeysTakeTheTypeThatIsDeclared) {
  EXPECT_EQ(key("Test_Keyed.Uint8=255", "Uint8").type, CMPI_uint8);
  EXPECT_EQ(key("Test_Keyed.Uint8=255", "Uint8").value.uint8, 255);
  EXPECT_EQ(key("Test_Keyed.Uint8=256", "Uint8").type, CMPI_sint64);  // kept, for others to refuse
  EXPECT_EQ(key("Test_Keyed.Uint8=-1", "Uint8").type, CMPI_sint64);
  EXPECT_EQ(key("Test_Keyed.Sint8=-128", "Sint8").value.sint8, -128);
  EXPECT_EQ(key("Test_Keyed.Sint8=-129", "Sint8").type, CMPI_sint64);
  EXPECT_EQ(key("Test_Keyed.Uint64=18446744073709551615", "Uint64").value.uint64, 18446744073709551615U);
  EXPECT_EQ(key("Unknown.K=18446744073709551615", "K").type, CMPI_uint64);
  EXPECT_EQ(key("Test_Keyed.Sint32=+7", "Sint32").value.sint32, 7);
  EXPECT_EQ(key("Test_Keyed.Real64=2", "Real64").value.real64, 2.0);
  EXPECT_EQ(key("Test_Keyed.Real32=1.5e1", "Real32").value.real32, 15.0F);
  EXPECT_EQ(key("Unknown.K=-2.5", "K").value.real64, -2.5);
  EXPECT_EQ(key("Test_Keyed.Char16='x'", "Char16").value.char16, 'x');
  EXPECT_EQ(key(R"(Test_Keyed.Char16='\'')", "Char16").value.char16, '\'');
  EXPECT_EQ(key(R"(Test_Keyed.Char16='\x20AC')", "Char16").value.char16, 0x20ac);
  EXPECT_EQ(key(R"(Test_Keyed.Time="20240229123456.123456+060")", "Time").type, CMPI_dateTime);
  EXPECT_EQ(key(R"(Test_Keyed.Time="yesterday")", "Time").type, CMPI_string);
  EXPECT_EQ(key("Test_Keyed.String=5", "String").type, CMPI_sint64);
  EXPECT_EQ(key("Test_Keyed.Boolean=FALSE", "Boolean").value.boolean, 0);
}

TEST_F(WbemUriTest, ReadsReferences) {
  const ObjectPath& path = *parse(
      R"(root/test:Test_Link.Left="root/other:Test_Thing.InstanceID=\"a \\\"b\\\"\"",Right="Test_Thing")");
  const ObjectPath* const left = objectPath(path.find("Left")->data);
  ASSERT_NE(left, nullptr);
  EXPECT_EQ(left->nameSpace(), "root/other");
  EXPECT_EQ(text(left->find("InstanceID")->data), R"(a "b")");
  EXPECT_EQ(objectPath(path.find("Right")->data)->nameSpace(), "root/default");
}

TEST_F(WbemUriTest, ErrorsSayWhereAndWhat) {
  EXPECT_EQ(error(""), "column 1: expected a class name, the text ends here");
  EXPECT_EQ(error("5"), "column 1: expected a class name, got '5'");
  EXPECT_EQ(error("//"), "column 3: expected a host name after \"//\", the text ends here");
  EXPECT_EQ(error("//host"),
            "column 7: expected \"/\" and a namespace after the host name, the text ends here");
  EXPECT_EQ(error("//host/root/test"), "column 17: expected \":\" after the namespace, the text ends here");
  EXPECT_EQ(error("root/test"), "column 10: expected \":\" after the namespace, the text ends here");
  EXPECT_EQ(error("C x"), "column 2: expected \".\" and keys after the class name, got ' '");
  EXPECT_EQ(error("C."), "column 3: expected a key name, the text ends here");
  EXPECT_EQ(error("C.K"), "column 4: expected \"=\" after the key name, the text ends here");
  EXPECT_EQ(
      error("C.K=x"),
      "column 5: expected a value: text in double quotes, a character in single ones, a number, true or "
      "false, got 'x'");
  EXPECT_EQ(error("C.K=\"x"), "column 7: expected a closing double quote, the text ends here");
  EXPECT_EQ(error("C.K=\"x\\n\""), "column 8: expected a quote or a backslash after the backslash, got 'n'");
  EXPECT_EQ(error("C.K=1;L=2"), "column 6: expected \",\" or the end after a key, got ';'");
  EXPECT_EQ(error("C.K=\"1\";"), "column 8: expected \",\" or the end after a key, got ';'");
  EXPECT_EQ(error("C.K=1,"), "column 7: expected a key name, the text ends here");
  EXPECT_EQ(error("C.K=1,k=2"), "column 7: the key k is given twice");
  EXPECT_EQ(error("C.K=99999999999999999999").substr(0, 26), "column 5: expected a value");
  EXPECT_EQ(error("C.K='xy'"), "column 7: expected a closing single quote, got 'y'");
  EXPECT_EQ(error("C.K=''"), "column 6: expected an ASCII character or \\x and hexadecimal digits, got '''");
  EXPECT_EQ(
      error("Test_Link.Left=\"C.K\""),
      "column 16: in the quoted reference, column 4: expected \"=\" after the key name, the text ends here");
  EXPECT_EQ(error(std::string("C\0D", 3)), "column 2: a zero byte is no part of any path");
  EXPECT_EQ(error(std::string(65537, 'C')), "column 65537: expected no more than 65536 characters");
}

TEST_F(WbemUriTest, NestingIsBounded) {
  ObjectPath* path = ObjectPath::create(request_.arena(), broker_.classes(), "", "Test_Link");
  for (unsigned depth = 0; depth < wbemUriDepth + 3; ++depth) {
    CMPIValue value{};
    value.ref = path;
    ObjectPath* const outer = ObjectPath::create(request_.arena(), broker_.classes(), "", "Test_Link");
    ASSERT_EQ(outer->addKey("Left", &value, CMPI_ref), CMPI_RC_OK);
    path = outer;
    const std::string uri = formatWbemUri(*path);
    const ObjectPath* const read = parse(uri, "");
    EXPECT_EQ(formatWbemUri(*read), uri);
    EXPECT_EQ(samePath(*read, *path), depth < wbemUriDepth) << depth;
  }
  std::string quoted = "Test_Link";
  for (unsigned depth = 0; depth < wbemUriDepth + 1; ++depth) {
    std::string escaped;
    for (const char character : quoted) {
      escaped +=
          (character == '"' || character == '\\') ? std::string("\\") + character : std::string(1, character);
    }
    quoted = "Test_Link.Left=\"" + escaped + "\"";
  }
  EXPECT_NE(error(quoted).find("nested too deeply"), std::string::npos);
}

TEST_F(WbemUriTest, WritesEachType) {
  ObjectPath* const path = ObjectPath::create(request_.arena(), broker_.classes(), "root/test", "Test_Keyed");
  for (const auto& [name, type] : propertyTypes()) {
    if (type != CMPI_instance) {
      const CMPIValue value = sample(type);
      ASSERT_EQ(path->addKey(name, &value, type), CMPI_RC_OK);
    }
  }
  EXPECT_EQ(formatWbemUri(*path),
            R"(root/test:Test_Keyed.Boolean=true,Char16='A',Real32=1.5,Real64=-2.5,)"
            R"(Reference="root/test:Test_Thing.InstanceID=\"referred\"",)"
            R"(Sint16=65,Sint32=65,Sint64=65,Sint8=65,String="text",Time="20240229123456.123456+060",)"
            R"(Uint16=65,Uint32=65,Uint64=65,Uint8=65)");
}

}  // namespace
}  // namespace cimom
