#include "Fixture.h"

namespace cimom::xml {
namespace {

std::string call(std::string_view content) {
  return "<CIM CIMVERSION=\"2.0\" DTDVERSION=\"2.0\"><MESSAGE ID=\"7\" PROTOCOLVERSION=\"1.0\"><SIMPLEREQ>"
         "<METHODCALL NAME=\"Start\">" +
         std::string(content) + "</METHODCALL></SIMPLEREQ></MESSAGE></CIM>";
}

constexpr const char* place =
    "<LOCALNAMESPACEPATH><NAMESPACE NAME=\"root\"/><NAMESPACE NAME=\"cimv2\"/></LOCALNAMESPACEPATH>";

TEST(Extrinsic, MethodOfAnInstance) {
  const std::string body =
      call(std::string("<LOCALINSTANCEPATH>") + place +
           "<INSTANCENAME CLASSNAME=\"Leaf\"><KEYBINDING NAME=\"Name\"><KEYVALUE>a</KEYVALUE>"
           "</KEYBINDING></INSTANCENAME></LOCALINSTANCEPATH>"
           "<PARAMVALUE NAME=\"Seconds\" PARAMTYPE=\"uint32\"><VALUE>5</VALUE></PARAMVALUE>");
  EXPECT_EQ(dsp0203::firstViolation(body), "");
  const MethodCall read = readRequest(body);
  EXPECT_FALSE(read.isIntrinsic);
  EXPECT_EQ(read.messageId, "7");
  EXPECT_EQ(read.name, "Start");
  EXPECT_EQ(read.nameSpace, "root/cimv2");
  ASSERT_TRUE(read.object);
  EXPECT_TRUE(read.object->isInstance);
  EXPECT_EQ(read.object->className, "Leaf");
  EXPECT_TRUE(read.parameters.empty());
}

TEST(Extrinsic, MethodOfAClass) {
  const MethodCall read = readRequest(
      call(std::string("<LOCALCLASSPATH>") + place + "<CLASSNAME NAME=\"Leaf\"/></LOCALCLASSPATH>"));
  ASSERT_TRUE(read.object);
  EXPECT_FALSE(read.object->isInstance);
  EXPECT_EQ(read.object->className, "Leaf");
}

TEST(Extrinsic, WithoutAnObject) {
  EXPECT_EQ(refusal(call("")), "400 request-not-loosely-valid");
  EXPECT_EQ(refusal(call("<CLASSNAME NAME=\"Leaf\"/>")), "400 request-not-loosely-valid");
}

}  // namespace
}  // namespace cimom::xml
