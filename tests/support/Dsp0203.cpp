#include "Dsp0203.h"

#include "ContentModel.h"
#include "Dsp0203Elements.h"

#include <expat.h>

#include <algorithm>
#include <map>
#include <memory>
#include <optional>
#include <set>
#include <sstream>

namespace dsp0203 {

namespace {

struct Attribute {
  bool isRequired = false;
  std::set<std::string> values;  // empty: any
};

struct Element {
  bool isText = false;
  std::optional<ContentModel> content;  // none: text, or empty
  std::map<std::string, Attribute> attributes;
};

void replaceAll(std::string& text, std::string_view what, const std::string& with) {
  for (std::size_t at = text.find(what); at != std::string::npos; at = text.find(what, at + with.size()))
    text.replace(at, what.size(), with);
}

std::map<std::string, Attribute> readAttributes(std::string_view text) {
  std::string all(text);
  replaceAll(all, "%flavor", std::string(flavors));
  replaceAll(all, "%type", std::string(simpleTypes));
  replaceAll(all, "%paramtype", std::string(simpleTypes) + "|reference|object|instance");
  std::map<std::string, Attribute> attributes;
  std::istringstream words(all);
  for (std::string word; words >> word;) {
    Attribute attribute;
    const std::size_t nameEnd = std::min(word.find_first_of("!("), word.size());
    attribute.isRequired = word.find('!') != std::string::npos;
    if (const std::size_t open = word.find('('); open != std::string::npos) {
      std::istringstream values(word.substr(open + 1, word.size() - open - 2));
      for (std::string value; std::getline(values, value, '|');)
        attribute.values.insert(value);
    }
    attributes.emplace(word.substr(0, nameEnd), std::move(attribute));
  }
  return attributes;
}

const std::map<std::string, Element, std::less<>>& documentType() {
  static const auto type = [] {
    std::map<std::string, Element, std::less<>> all;
    for (const ElementDeclaration& declaration : elements) {
      Element element;
      element.isText = declaration.content == "#PCDATA";
      if (!element.isText && declaration.content != "EMPTY")
        element.content.emplace(declaration.content);
      element.attributes = readAttributes(declaration.attributes);
      all.emplace(declaration.name, std::move(element));
    }
    return all;
  }();
  return type;
}

class Validator {
 public:
  Validator(XML_Parser parser, std::string_view root) : parser_(parser), root_(root) {
    XML_SetUserData(parser, this);
    XML_SetElementHandler(
        parser,
        [](void* self, const char* name, const char** attributes) {
          static_cast<Validator*>(self)->start(name, attributes);
        },
        [](void* self, const char* /*name*/) { static_cast<Validator*>(self)->end(); });
    XML_SetCharacterDataHandler(parser, [](void* self, const char* text, int size) {
      static_cast<Validator*>(self)->text({text, static_cast<std::size_t>(size)});
    });
  }

  std::string check(std::string_view document) {
    const auto status = XML_Parse(parser_, document.data(), static_cast<int>(document.size()), XML_TRUE);
    if (violation_.empty() && status != XML_STATUS_OK)
      violate(std::string("not well-formed: ") + XML_ErrorString(XML_GetErrorCode(parser_)));
    return violation_;
  }

 private:
  struct Open {
    std::string name;
    const Element* type;
    ContentModel::Position position;
  };

  void violate(const std::string& message) {
    if (violation_.empty())
      violation_ = "line " + std::to_string(XML_GetCurrentLineNumber(parser_)) + ": " + message;
    XML_StopParser(parser_, XML_FALSE);
  }

  void start(const std::string& name, const char** attributes) {
    if (!violation_.empty())
      return;
    const auto found = documentType().find(name);
    if (found == documentType().end())
      return violate("there is no element " + name);
    enter(name);
    checkAttributes(name, found->second, attributes);
    const Element& type = found->second;
    open_.push_back({name, &type, type.content ? type.content->start() : ContentModel::Position()});
  }

  void enter(const std::string& name) {
    if (open_.empty()) {
      if (name != root_)
        violate("the document is " + name + ", not " + root_);
      return;
    }
    Open& parent = open_.back();
    if (parent.type->content)
      parent.position = parent.type->content->after(parent.position, name);
    if (!parent.type->content || parent.position.empty())
      violate(parent.name + " has no place for " + name + " here");
  }

  void checkAttributes(const std::string& name, const Element& type, const char** attributes) {
    std::set<std::string> given;
    for (; *attributes != nullptr; attributes += 2) {
      given.insert(attributes[0]);
      const auto declared = type.attributes.find(attributes[0]);
      if (declared == type.attributes.end())
        return violate(name + " has no attribute " + attributes[0]);
      const auto& values = declared->second.values;
      if (!values.empty() && !values.contains(attributes[1]))
        return violate(name + ": " + attributes[0] + " cannot be \"" + attributes[1] + "\"");
    }
    for (const auto& [attributeName, attribute] : type.attributes)
      if (attribute.isRequired && !given.contains(attributeName))
        return violate(name + " lacks " + attributeName);
  }

  void text(std::string_view piece) {
    const bool isBlank = piece.find_first_not_of(" \t\r\n") == std::string_view::npos;
    if (violation_.empty() && !isBlank && !open_.back().type->isText)
      violate(open_.back().name + " holds no text");
  }

  void end() {
    if (!violation_.empty())
      return;
    const Open& last = open_.back();
    if (last.type->content && !last.type->content->isComplete(last.position))
      violate(last.name + " ends too early");
    open_.pop_back();
  }

  XML_Parser parser_;
  std::string root_;
  std::vector<Open> open_;
  std::string violation_;
};

}  // namespace

std::string firstViolation(std::string_view document, std::string_view root) {
  const std::unique_ptr<XML_ParserStruct, decltype(&XML_ParserFree)> parser(XML_ParserCreate(nullptr),
                                                                            XML_ParserFree);
  return Validator(parser.get(), root).check(document);
}

std::vector<std::string> elementNames() {
  std::vector<std::string> names;
  for (const ElementDeclaration& declaration : elements)
    names.emplace_back(declaration.name);
  return names;
}

}  // namespace dsp0203
