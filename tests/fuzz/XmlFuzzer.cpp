#include <cimom/broker/Arena.h>
#include <cimom/broker/ClassTable.h>
#include <cimom/broker/WbemUri.h>
#include <cimom/mof/ClassRepository.h>
#include <cimom/xml/Conversion.h>
#include <cimom/xml/Reader.h>
#include <cimom/xml/Writer.h>
#include <tests/support/Dsp0203.h>

#include <string>
#include <variant>

#include "Fuzzer.h"

namespace {

namespace xml = cimom::xml;

constexpr std::string_view schema = R"(
Qualifier Key : boolean = false, Scope(property, reference);
Qualifier Association : boolean = false, Scope(association);
class Thing { [Key] string Name; [Key] uint16 Number; boolean Flag; datetime When; char16 Letter; real64 Size;
              string Words[]; sint8 Bytes[]; };
[Association] class Tie { [Key] Thing REF Left; [Key] Thing REF Right; };
)";

cimom::ClassRepository compiled() {
  cimom::ClassRepository repository;
  repository.compileText(schema, "schema.mof");
  return repository;
}

const cimom::ClassRepository& repository() {
  static const cimom::ClassRepository made = compiled();
  return made;
}

const cimom::ClassTable& classes() {
  static const cimom::ClassTable made(repository());
  return made;
}

// The parameter of a request that holds this.
xml::ParameterValue readAgain(const std::string& content) {
  const std::string body =
      "<CIM CIMVERSION=\"2.0\" DTDVERSION=\"2.0\"><MESSAGE ID=\"1\" PROTOCOLVERSION=\"1.0\"><SIMPLEREQ>"
      "<IMETHODCALL NAME=\"X\"><LOCALNAMESPACEPATH><NAMESPACE NAME=\"n\"/></LOCALNAMESPACEPATH>"
      "<IPARAMVALUE NAME=\"P\">" +
      content + "</IPARAMVALUE></IMETHODCALL></SIMPLEREQ></MESSAGE></CIM>";
  return xml::readRequest(body).parameters.at(0).value;
}

// A path is written as a name that says the same.
void tryPath(cimom::Arena& arena, const xml::ObjectName& name) {
  const cimom::ObjectPath* const path = xml::makePath(arena, classes(), name, "root/cimv2");
  std::string out;
  xml::PathWriter(xml::PathForm::valueReference).append(out, *path);
  fuzz::promise(dsp0203::firstViolation(out, "VALUE.REFERENCE").empty(), "a path is no valid XML");
  const auto again = std::get<xml::ObjectName>(readAgain(out));
  const cimom::ObjectPath* const other = xml::makePath(arena, classes(), again, "");
  fuzz::promise(cimom::formatWbemUri(*path) == cimom::formatWbemUri(*other), "a path reads as another");
}

void tryInstance(cimom::Arena& arena, const xml::InstanceElement& element) {
  const cimom::Instance* const instance = xml::makeInstance(arena, classes(), element, "root/cimv2");
  std::string out;
  xml::InstanceWriter(repository(), {}).append(out, *instance);
  fuzz::promise(dsp0203::firstViolation(out, "VALUE.NAMEDINSTANCE").empty(), "an instance is no valid XML");
  const auto again = std::get<xml::InstanceElement>(readAgain(out));
  const cimom::Instance* const other = xml::makeInstance(arena, classes(), again, "root/cimv2");
  std::string second;
  xml::InstanceWriter(repository(), {}).append(second, *other);
  fuzz::promise(out == second, "an instance reads as another");
}

}  // namespace

// A request is read or refused; what it names can be written, and reads as the same.
void fuzz::tryOne(std::string_view input) {
  cimom::Arena arena;
  try {
    const xml::MethodCall call = xml::readRequest(input);
    if (call.object)
      tryPath(arena, *call.object);
    for (const xml::Parameter& parameter : call.parameters) {
      try {
        if (const auto* const name = std::get_if<xml::ObjectName>(&parameter.value))
          tryPath(arena, *name);
        if (const auto* const element = std::get_if<xml::InstanceElement>(&parameter.value))
          tryInstance(arena, *element);
      } catch (const xml::ConversionError&) {
      }
    }
  } catch (const xml::RequestError&) {
  } catch (const xml::ConversionError&) {
  }
}
