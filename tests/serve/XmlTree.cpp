#include "XmlTree.h"

#include <expat.h>

#include <memory>
#include <stdexcept>
#include <type_traits>

namespace serve_test {
namespace {

/// Elements that are open, from the root on; each goes into its parent when it ends.
struct Builder {
  std::vector<Element> open{Element{}};
};

void XMLCALL startElement(void* user, const XML_Char* name, const XML_Char** attributes) {
  Element element;
  element.name = name;
  for (std::size_t i = 0; attributes[i] != nullptr; i += 2) {
    element.attributes[attributes[i]] = attributes[i + 1];
  }
  static_cast<Builder*>(user)->open.push_back(std::move(element));
}

void XMLCALL endElement(void* user, const XML_Char*) {
  std::vector<Element>& open = static_cast<Builder*>(user)->open;
  Element element = std::move(open.back());
  open.pop_back();
  open.back().children.push_back(std::move(element));
}

void XMLCALL takeText(void* user, const XML_Char* text, int length) {
  static_cast<Builder*>(user)->open.back().text.append(text, static_cast<std::size_t>(length));
}

void collect(const Element& from, std::string_view wanted, std::vector<const Element*>& found) {
  for (const Element& child : from.children) {
    if (child.name == wanted) {
      found.push_back(&child);
    }
    collect(child, wanted, found);
  }
}

}  // namespace

std::vector<const Element*> Element::all(std::string_view wanted) const {
  std::vector<const Element*> found;
  collect(*this, wanted, found);
  return found;
}

const Element& Element::first(std::string_view wanted) const {
  const auto found = all(wanted);
  if (found.empty()) {
    throw std::runtime_error("there is no " + std::string(wanted) + " in " + xml());
  }
  return *found.front();
}

std::string Element::attribute(const std::string& wanted) const {
  const auto found = attributes.find(wanted);
  return found == attributes.end() ? std::string() : found->second;
}

std::string Element::xml() const {
  std::string out = "<" + name;
  for (const auto& [key, value] : attributes) {
    out += " " + key + "=\"" + escaped(value) + "\"";
  }
  out += ">" + escaped(text);
  for (const Element& child : children) {
    out += child.xml();
  }
  return out + "</" + name + ">";
}

Element parseXml(std::string_view text) {
  const std::unique_ptr<std::remove_pointer_t<XML_Parser>, decltype(&XML_ParserFree)> parser(
      XML_ParserCreate(nullptr), &XML_ParserFree);
  Builder builder;
  XML_SetUserData(parser.get(), &builder);
  XML_SetElementHandler(parser.get(), startElement, endElement);
  XML_SetCharacterDataHandler(parser.get(), takeText);
  if (XML_Parse(parser.get(), text.data(), static_cast<int>(text.size()), XML_TRUE) != XML_STATUS_OK) {
    throw std::runtime_error(std::string("no XML: ") + XML_ErrorString(XML_GetErrorCode(parser.get())));
  }
  return std::move(builder.open.front().children.front());
}

std::string escaped(std::string_view text) {
  std::string out;
  for (const char character : text) {
    switch (character) {
      case '&':
        out += "&amp;";
        break;
      case '<':
        out += "&lt;";
        break;
      case '"':
        out += "&quot;";
        break;
      default:
        out += character;
    }
  }
  return out;
}

}  // namespace serve_test
