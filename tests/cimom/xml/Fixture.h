// A small schema, requests as clients write them, and answers held against the document type.
#pragma once

#include <cimom/broker/Arena.h>
#include <cimom/broker/ClassTable.h>
#include <cimom/broker/Objects.h>
#include <cimom/mof/ClassRepository.h>
#include <cimom/xml/Reader.h>
#include <cimom/xml/Writer.h>
#include <tests/support/Dsp0203.h>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <string>
#include <string_view>

namespace cimom::xml {

inline constexpr std::string_view schemaText = R"(
Qualifier Key : boolean = false, Scope(property, reference), Flavor(DisableOverride, ToSubclass);
Qualifier Association : boolean = false, Scope(association), Flavor(DisableOverride, ToSubclass);
Qualifier Abstract : boolean = false, Scope(class, association), Flavor(Restricted);
Qualifier Description : string = null, Scope(any), Flavor(EnableOverride, ToSubclass, Translatable);
Qualifier Values : string[], Scope(property, method, parameter), Flavor(EnableOverride, ToSubclass, Translatable);
Qualifier MaxLen : uint32 = null, Scope(property, method, parameter);
Qualifier EmbeddedObject : boolean = false, Scope(property, method, parameter), Flavor(DisableOverride);
Qualifier EmbeddedInstance : string = null, Scope(property, method, parameter);

[Abstract, Description("A thing <with> \"marks\" & more")]
class Base {
  [Key, Description("its name")] string Name;
  [Description("how it is")] uint16 State = 5;
  string Caption;
  [Description("starts it")] uint32 Start([Description("how long")] uint32 Seconds, string Words[], Base REF Other);
};
[Description("a leaf")]
class Leaf : Base {
  [Description("the leaf's own words"), Values {"a", "b"}] string Caption;
  boolean Flag; char16 Letter; datetime When; real32 Small; real64 Large;
  uint8 U8; sint8 S8; sint16 S16; uint32 U32; sint32 S32; uint64 U64; sint64 S64;
  string Words[]; uint8 Bytes[4]; boolean Flags[];
  [EmbeddedInstance("Base")] string Inner;
  [EmbeddedObject] string Any[];
  uint32 Stop(Base REF Others[]);
};
class Numbered { [Key] uint32 Number; [Key] boolean Flag; [Key] datetime When; [Key] char16 Letter;
                 [Key] real64 Size; string Note; };
class Single { [Key] uint16 Id; };
[Association] class Tie { [Key] Base REF Left; [Key] Base REF Right; uint16 Rank; };
)";

struct Schema {
  Schema() { repository.compileText(schemaText, "schema.mof"); }
  ClassRepository repository;
};

class XmlTest : public testing::Test {
 protected:
  ObjectPath& path(std::string_view className, std::string_view nameSpace = "root/cimv2") {
    return *ObjectPath::create(arena, classes, nameSpace, className);
  }
  Instance& make(std::string_view className, std::string_view nameSpace = "root/cimv2") {
    return *Instance::create(arena, path(className, nameSpace));
  }
  template <class Object>
  void setText(Object& object, std::string_view name, std::string_view text) {
    CMPIValue value{};
    value.string = String::create(arena, text);
    set(object, name, value, CMPI_string);
  }
  static void set(Instance& instance, std::string_view name, const CMPIValue& value, CMPIType type) {
    ASSERT_EQ(instance.setProperty(name, &value, type), CMPI_RC_OK) << name;
  }
  static void set(ObjectPath& objectPath, std::string_view name, const CMPIValue& value, CMPIType type) {
    ASSERT_EQ(objectPath.addKey(name, &value, type), CMPI_RC_OK) << name;
  }
  [[nodiscard]] const SchemaClass& schemaOf(std::string_view name) const {
    return *schema.repository.find(name);
  }

  /// What goes between the tags of IRETURNVALUE, in a whole response.
  static std::string response(std::string_view content) {
    std::string out;
    beginResponse(out, "1", "Some");
    beginReturnValue(out);
    out += content;
    endReturnValue(out);
    endResponse(out);
    return out;
  }

  Schema schema;
  ClassTable classes{schema.repository};
  Arena arena;
};

/// A request for an intrinsic method, with what stands after its namespace.
inline std::string request(std::string_view parameters, std::string_view method = "GetInstance") {
  return "<?xml version=\"1.0\" encoding=\"utf-8\"?>\n<CIM CIMVERSION=\"2.0\" DTDVERSION=\"2.0\">\n"
         "<MESSAGE ID=\"42\" PROTOCOLVERSION=\"1.0\"><SIMPLEREQ><IMETHODCALL NAME=\"" +
         std::string(method) +
         "\"><LOCALNAMESPACEPATH><NAMESPACE NAME=\"root\"/><NAMESPACE "
         "NAME=\"cimv2\"/></LOCALNAMESPACEPATH>\n" +
         std::string(parameters) + "</IMETHODCALL></SIMPLEREQ></MESSAGE>\n</CIM>\n";
}

/// One parameter named P with this content, read.
inline ParameterValue readParameterContent(std::string_view content) {
  const MethodCall call =
      readRequest(request("<IPARAMVALUE NAME=\"P\">" + std::string(content) + "</IPARAMVALUE>"));
  return call.parameters.at(0).value;
}

/// "STATUS header" of the error that a request is refused with; empty: it is taken.
inline std::string refusal(std::string_view body, const Limits& limits = {}) {
  try {
    (void)readRequest(body, limits);
  } catch (const RequestError& error) {
    return std::to_string(error.httpStatus()) + " " + error.cimError();
  }
  return {};
}

}  // namespace cimom::xml
