#include <cimom/xml/Reader.h>
#include <cimom/xml/Text.h>

#include <string>
#include <variant>

#include "Fuzzer.h"

// Any bytes can be written, in an element and in an attribute, and both read as the same text; written once
// more, it stays as it is.
void fuzz::tryOne(std::string_view input) {
  namespace xml = cimom::xml;
  std::string document = "<INSTANCE CLASSNAME=\"";
  xml::appendAttributeText(document, input);
  document += "\"><PROPERTY NAME=\"P\" TYPE=\"string\"><VALUE>";
  xml::appendText(document, input);
  document += "</VALUE></PROPERTY></INSTANCE>";
  xml::Limits limits;
  limits.attributeLength = limits.textLength = document.size();
  const xml::InstanceElement read = xml::readInstance(document, limits);
  const auto& text = std::get<std::string>(read.properties.at(0).value);
  promise(text == read.className, "an attribute reads as another text than an element");
  std::string first;
  xml::appendText(first, input);
  std::string second;
  xml::appendText(second, text);
  promise(first == second, "a text that was read is written as another");
}
