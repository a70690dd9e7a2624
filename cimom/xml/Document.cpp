#include <cimom/xml/Document.h>

#include <expat.h>

#include <algorithm>
#include <array>
#include <climits>
#include <memory>
#include <new>
#include <optional>

namespace cimom::xml {

namespace {

constexpr int badRequest = 400;

// The element names of DSP0203, in the order of their bytes.
constexpr auto elementNames = std::to_array<std::string_view>({
    "CIM",
    "CLASS",
    "CLASSNAME",
    "CLASSPATH",
    "CORRELATOR",
    "DECLARATION",
    "DECLGROUP",
    "DECLGROUP.WITHNAME",
    "DECLGROUP.WITHPATH",
    "ERROR",
    "EXPMETHODCALL",
    "EXPMETHODRESPONSE",
    "EXPPARAMVALUE",
    "HOST",
    "IMETHODCALL",
    "IMETHODRESPONSE",
    "INSTANCE",
    "INSTANCENAME",
    "INSTANCEPATH",
    "IPARAMVALUE",
    "IRETURNVALUE",
    "KEYBINDING",
    "KEYVALUE",
    "LOCALCLASSPATH",
    "LOCALINSTANCEPATH",
    "LOCALNAMESPACEPATH",
    "MESSAGE",
    "METHOD",
    "METHODCALL",
    "METHODRESPONSE",
    "MULTIEXPREQ",
    "MULTIEXPRSP",
    "MULTIREQ",
    "MULTIRSP",
    "NAMESPACE",
    "NAMESPACEPATH",
    "OBJECTPATH",
    "PARAMETER",
    "PARAMETER.ARRAY",
    "PARAMETER.REFARRAY",
    "PARAMETER.REFERENCE",
    "PARAMVALUE",
    "PROPERTY",
    "PROPERTY.ARRAY",
    "PROPERTY.REFERENCE",
    "QUALIFIER",
    "QUALIFIER.DECLARATION",
    "RESPONSEDESTINATION",
    "RETURNVALUE",
    "SCOPE",
    "SIMPLEEXPREQ",
    "SIMPLEEXPRSP",
    "SIMPLEREQ",
    "SIMPLEREQACK",
    "SIMPLERSP",
    "TABLE",
    "TABLECELL.DECLARATION",
    "TABLECELL.REFERENCE",
    "TABLEROW",
    "TABLEROW.DECLARATION",
    "VALUE",
    "VALUE.ARRAY",
    "VALUE.INSTANCEWITHPATH",
    "VALUE.NAMEDINSTANCE",
    "VALUE.NAMEDOBJECT",
    "VALUE.NULL",
    "VALUE.OBJECT",
    "VALUE.OBJECTWITHLOCALPATH",
    "VALUE.OBJECTWITHPATH",
    "VALUE.REFARRAY",
    "VALUE.REFERENCE",
});
static_assert(std::is_sorted(elementNames.begin(), elementNames.end()));

bool isKnown(std::string_view name) {
  return std::binary_search(elementNames.begin(), elementNames.end(), name);
}

// Builds the tree out of what expat reports. Expat is C: an error is kept until expat has returned.
class Builder {
 public:
  Builder(XML_Parser parser, const Limits& limits) : parser_(parser), limits_(limits) {
    XML_SetUserData(parser, this);
    XML_SetElementHandler(parser, onStart, onEnd);
    XML_SetCharacterDataHandler(parser, onText);
    XML_SetStartDoctypeDeclHandler(parser, onDoctype);
    XML_SetEntityDeclHandler(parser, onEntity);
    XML_SetSkippedEntityHandler(parser, onSkippedEntity);
  }

  Node build(std::string_view body) {
    if (body.size() > INT_MAX)
      throw RequestError(badRequest, "request-not-valid", "the document is too long");
    const XML_Status status = XML_Parse(parser_, body.data(), static_cast<int>(body.size()), XML_TRUE);
    if (isOutOfMemory_)
      throw std::bad_alloc();
    if (error_)
      throw RequestError(*error_);
    if (status != XML_STATUS_OK) {
      const std::string message = XML_ErrorString(XML_GetErrorCode(parser_));
      throw RequestError(badRequest, "request-not-well-formed", at(line()) + message);
    }
    if (!hasRoot_)
      throw RequestError(badRequest, "request-not-loosely-valid", "the document's element is not CIM");
    return std::move(root_);
  }

 private:
  static Builder& self(void* data) { return *static_cast<Builder*>(data); }

  static void onStart(void* data, const XML_Char* name, const XML_Char** attributes) {
    self(data).guarded([&](Builder& builder) { builder.start(name, attributes); });
  }
  static void onEnd(void* data, const XML_Char* /*name*/) {
    self(data).guarded([](Builder& builder) { builder.end(); });
  }
  static void onText(void* data, const XML_Char* text, int size) {
    self(data).guarded([&](Builder& builder) { builder.text({text, static_cast<std::size_t>(size)}); });
  }
  static void onDoctype(void* data, const XML_Char* /*name*/, const XML_Char* systemId,
                        const XML_Char* publicId, int hasInternalSubset) {
    self(data).guarded([&](Builder& builder) {
      builder.hasExternalSubset_ = systemId != nullptr || publicId != nullptr;
      if (hasInternalSubset != 0)
        builder.refuse("request-not-valid", "a document type with declarations of its own is not taken");
    });
  }
  static void onEntity(void* data, const XML_Char* /*name*/, int /*isParameter*/, const XML_Char* /*value*/,
                       int /*length*/, const XML_Char* /*base*/, const XML_Char* /*systemId*/,
                       const XML_Char* /*publicId*/, const XML_Char* /*notation*/) {
    self(data).guarded([](Builder& builder) {
      builder.refuse("request-not-valid", "declarations of entities are not taken");
    });
  }
  static void onSkippedEntity(void* data, const XML_Char* name, int /*isParameter*/) {
    self(data).guarded([&](Builder& builder) {
      builder.refuse("request-not-well-formed", "the entity " + std::string(name) + " is not declared");
    });
  }

  template <class Step>
  void guarded(const Step& step) {
    if (error_ || isOutOfMemory_)
      return;
    try {
      step(*this);
    } catch (const std::bad_alloc&) {
      isOutOfMemory_ = true;
      XML_StopParser(parser_, XML_FALSE);
    }
  }

  [[nodiscard]] std::size_t line() const { return XML_GetCurrentLineNumber(parser_); }
  static std::string at(std::size_t line) { return "line " + std::to_string(line) + ": "; }

  void refuse(const char* cimError, const std::string& message) {
    error_.emplace(badRequest, cimError, at(line()) + message);
    XML_StopParser(parser_, XML_FALSE);
  }

  void start(const char* name, const char** attributes) {
    ++depth_;
    if (depth_ > limits_.depth)
      return refuse("request-not-valid", "elements are nested deeper than " + std::to_string(limits_.depth));
    if (++elements_ > limits_.elements)
      return refuse("request-not-valid", "more than " + std::to_string(limits_.elements) + " elements");
    if (hasExternalSubset_ && refersToEntities())
      return refuse("request-not-well-formed", "an attribute refers to an entity that is not declared");
    if (skippedFrom_ != 0)
      return;
    if (!isKnown(name)) {
      skippedFrom_ = depth_;
      return;
    }
    open(name, attributes);
  }

  void open(const char* name, const char** attributes) {
    Node* node = &root_;
    if (!open_.empty()) {
      open_.back()->children.emplace_back();
      node = &open_.back()->children.back();
    }
    hasRoot_ = true;
    node->name = name;
    node->line = line();
    for (; *attributes != nullptr; attributes += 2) {
      const std::string_view value = attributes[1];
      if (node->attributes.size() == limits_.attributes || value.size() > limits_.attributeLength)
        return refuse("request-not-valid", "too many attributes, or too long ones, in " + node->name);
      node->attributes.emplace_back(attributes[0], value);
    }
    open_.push_back(node);
  }

  void end() {
    if (skippedFrom_ == 0)
      open_.pop_back();
    else if (skippedFrom_ == depth_)
      skippedFrom_ = 0;
    --depth_;
  }

  void text(std::string_view piece) {
    if (skippedFrom_ != 0 || open_.empty())
      return;
    std::string& all = open_.back()->text;
    if (piece.size() > limits_.textLength - all.size())
      return refuse("request-not-valid", "text longer than " + std::to_string(limits_.textLength) + " bytes");
    all += piece;
  }

  // Where the document names an external subset, which is not read, expat takes an undeclared entity in an
  // attribute for one declared there and leaves it out without a word. So the tag is looked at as it came.
  [[nodiscard]] bool refersToEntities() const {
    int offset = 0;
    int size = 0;
    const char* const context = XML_GetInputContext(parser_, &offset, &size);
    const int count = XML_GetCurrentByteCount(parser_);
    if (context == nullptr || count > size - offset)
      return true;
    std::string tag(context + offset, static_cast<std::size_t>(count));
    std::erase(tag, '\0');  // of UTF-16
    for (std::size_t from = tag.find('&'); from != std::string::npos; from = tag.find('&', from + 1)) {
      const std::string_view rest = std::string_view(tag).substr(from + 1);
      constexpr std::array<std::string_view, 6> predefined{"#", "amp;", "lt;", "gt;", "quot;", "apos;"};
      if (std::none_of(predefined.begin(), predefined.end(),
                       [rest](std::string_view each) { return rest.starts_with(each); }))
        return true;
    }
    return false;
  }

  XML_Parser parser_;
  const Limits& limits_;
  Node root_;
  bool hasRoot_ = false;
  std::vector<Node*> open_;
  std::size_t depth_ = 0;
  std::size_t elements_ = 0;
  std::size_t skippedFrom_ = 0;  // depth of the unknown element that is being passed over; 0: none
  bool hasExternalSubset_ = false;
  bool isOutOfMemory_ = false;
  std::optional<RequestError> error_;
};

}  // namespace

const std::string* Node::attribute(std::string_view attributeName) const {
  const auto found = std::find_if(attributes.begin(), attributes.end(),
                                  [&](const auto& each) { return each.first == attributeName; });
  return found == attributes.end() ? nullptr : &found->second;
}

Node parseDocument(std::string_view body, const Limits& limits) {
  const std::unique_ptr<XML_ParserStruct, decltype(&XML_ParserFree)> parser(XML_ParserCreate(nullptr),
                                                                            XML_ParserFree);
  if (parser == nullptr)
    throw std::bad_alloc();
  return Builder(parser.get(), limits).build(body);
}

void failStructure(std::size_t line, const std::string& message) {
  throw RequestError(badRequest, "request-not-loosely-valid",
                     "line " + std::to_string(line) + ": " + message);
}

}  // namespace cimom::xml
