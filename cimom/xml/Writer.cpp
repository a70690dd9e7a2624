#include <cimom/xml/Text.h>
#include <cimom/xml/Types.h>
#include <cimom/xml/ValueWriter.h>
#include <cimom/xml/Writer.h>

namespace cimom::xml {

namespace {

void appendParameterOpen(std::string& out, std::string_view name, CMPIType type) {
  out += "<PARAMVALUE";
  appendAttribute(out, "NAME", name);
  appendAttribute(out, "PARAMTYPE", typeName(type));
}

}  // namespace

void beginResponse(std::string& out, std::string_view messageId, std::string_view method, MethodKind kind) {
  out +=
      "<?xml version=\"1.0\" encoding=\"utf-8\"?>\n"
      "<CIM CIMVERSION=\"2.0\" DTDVERSION=\"2.0\"><MESSAGE";
  appendAttribute(out, "ID", messageId);
  out += " PROTOCOLVERSION=\"1.0\"><SIMPLERSP>";
  out += kind == MethodKind::intrinsic ? "<IMETHODRESPONSE" : "<METHODRESPONSE";
  appendAttribute(out, "NAME", method);
  out += '>';
}

void endResponse(std::string& out, MethodKind kind) {
  out += kind == MethodKind::intrinsic ? "</IMETHODRESPONSE>" : "</METHODRESPONSE>";
  out += "</SIMPLERSP></MESSAGE></CIM>\n";
}

void beginReturnValue(std::string& out) {
  out += "<IRETURNVALUE>";
}

void endReturnValue(std::string& out) {
  out += "</IRETURNVALUE>";
}

void appendError(std::string& out, int code, std::string_view description) {
  constexpr int codesEnd = 30;
  out += "<ERROR";
  appendAttribute(out, "CODE", std::to_string(code > 0 && code < codesEnd ? code : 1));
  if (!description.empty())
    appendAttribute(out, "DESCRIPTION", description);
  out += "/>";
}

void appendOutParameter(std::string& out, std::string_view name, std::string_view text) {
  appendParameterOpen(out, name, CMPI_string);
  out += "><VALUE>";
  appendText(out, text);
  out += "</VALUE></PARAMVALUE>";
}

void appendOutParameter(std::string& out, std::string_view name, bool flag) {
  appendParameterOpen(out, name, CMPI_boolean);
  out += flag ? "><VALUE>TRUE</VALUE></PARAMVALUE>" : "><VALUE>FALSE</VALUE></PARAMVALUE>";
}

void appendNullOutParameter(std::string& out, std::string_view name, CMPIType type) {
  appendParameterOpen(out, name, type);
  out += "/>";
}

}  // namespace cimom::xml
