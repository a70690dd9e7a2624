#include <cimom/mof/MofError.h>
#include <cimom/mof/Parser.h>

#include <algorithm>
#include <array>
#include <tuple>

namespace cimom::mof {

namespace {

struct TypeName {
  std::string_view name;
  CMPIType type;
};

constexpr std::array typeNames = {
    TypeName{"uint8", CMPI_uint8},   TypeName{"uint16", CMPI_uint16},     TypeName{"uint32", CMPI_uint32},
    TypeName{"uint64", CMPI_uint64}, TypeName{"sint8", CMPI_sint8},       TypeName{"sint16", CMPI_sint16},
    TypeName{"sint32", CMPI_sint32}, TypeName{"sint64", CMPI_sint64},     TypeName{"real32", CMPI_real32},
    TypeName{"real64", CMPI_real64}, TypeName{"boolean", CMPI_boolean},   TypeName{"char16", CMPI_char16},
    TypeName{"string", CMPI_string}, TypeName{"datetime", CMPI_dateTime},
};

CMPIType typeOf(const Token& token) {
  for (const auto& [name, type] : typeNames) {
    if (token.isName(name))
      return type;
  }
  return CMPI_null;
}

CMPIType arrayOf(CMPIType type) {
  return static_cast<CMPIType>(type | CMPI_ARRAY);
}

}  // namespace

Parser::Parser(std::string_view text, std::string_view fileName) : lexer_(text, fileName) {
  advance();
}

void Parser::advance() {
  lastLine_ = token_.line;
  token_ = lexer_.next();
}

void Parser::fail(const std::string& message) const {
  throw MofError(lexer_.fileName(), token_.line, message);
}

bool Parser::accept(char punctuation) {
  if (!token_.is(punctuation))
    return false;
  advance();
  return true;
}

bool Parser::acceptName(std::string_view name) {
  if (!token_.isName(name))
    return false;
  advance();
  return true;
}

void Parser::expect(char punctuation, const std::string& after) {
  if (token_.is(punctuation)) {
    advance();
    return;
  }
  // Where something is missing at the end of a line, that line is the one to look at.
  throw MofError(lexer_.fileName(), lastLine_,
                 std::string("expected '") + punctuation + "' " + after + ", got " + token_.shown());
}

std::string Parser::expectName(const std::string& what) {
  if (token_.kind != TokenKind::Name)
    fail("expected " + what + ", got " + token_.shown());
  std::string name(token_.text);
  advance();
  return name;
}

Declaration Parser::next() {
  while (token_.kind == TokenKind::Directive) {
    Include include;
    if (directive(include))
      return include;
  }
  if (token_.kind == TokenKind::End)
    return End{};
  if (acceptName("qualifier"))
    return qualifierDeclaration();
  Qualifiers qualifiers = qualifierList();
  if (token_.isName("class"))
    return classDeclaration(std::move(qualifiers));
  if (acceptName("instance"))
    return instanceDeclaration();
  fail("expected a class, an instance or a qualifier declaration, got " + token_.shown());
}

bool Parser::directive(Include& include) {
  include.line = token_.line;
  advance();
  const bool isInclude = token_.isName("include");
  const bool isNameSpace = token_.isName("namespace");
  const std::string name = expectName("the name of a directive after #pragma");
  expect('(', "after #pragma " + name);
  const auto* text = std::get_if<std::string>(&token_.value);
  if (text == nullptr)
    fail("expected a text in quotes in #pragma " + name + ", got " + token_.shown());
  include.file = *text;
  if (isNameSpace)
    takeNameSpace(*text);
  advance();
  expect(')', "after #pragma " + name);
  return isInclude;
}

void Parser::takeNameSpace(std::string_view text) {
  text.remove_prefix(std::min(text.find_first_not_of('/'), text.size()));
  if (text.empty() || text.find(':') != std::string_view::npos)
    fail("#pragma namespace names one of this host, like \"root/interop\", got " + token_.shown());
  nameSpace_ = text;
}

Class Parser::classDeclaration(Qualifiers qualifiers) {
  Class result;
  result.qualifiers = std::move(qualifiers);
  result.file = lexer_.fileName();
  result.line = token_.line;
  advance();
  result.name = expectName("the name of a class");
  if (acceptName("as")) {
    if (token_.kind != TokenKind::Alias)
      fail("expected an alias such as $Name after 'as', got " + token_.shown());
    advance();
  }
  if (accept(':'))
    result.superclass = expectName("the superclass of " + result.name);
  expect('{', "after class " + result.name);
  while (!accept('}')) {
    if (token_.kind == TokenKind::End)
      fail("expected '}' at the end of class " + result.name + ", got " + token_.shown());
    feature(result);
  }
  expect(';', "after class " + result.name);
  return result;
}

void Parser::feature(Class& owner) {
  Qualifiers qualifiers = qualifierList();
  const int line = token_.line;
  auto [type, reference] = dataType();
  name_ = expectName("the name of a property or method");
  if (token_.is('(')) {
    owner.methods.push_back(method(type, std::move(qualifiers)));
    owner.methods.back().origin = owner.name;
    return;
  }
  owner.properties.push_back(property(type, std::move(reference), std::move(qualifiers)));
  owner.properties.back().origin = owner.name;
  owner.properties.back().line = line;
}

Property Parser::property(CMPIType type, std::string reference, Qualifiers qualifiers) {
  Property result;
  result.name = name_;
  result.type = type;
  result.referenceClass = std::move(reference);
  result.qualifiers = std::move(qualifiers);
  result.key = isTrue(result.qualifiers, "Key");
  if (arraySuffix(result.arraySize)) {
    if (result.isReference())
      fail("property " + result.name + " is an array of references, which CIM does not have");
    result.type = arrayOf(type);
  }
  if (accept('='))
    result.defaultValue = value();
  expect(';', "after property " + result.name);
  return result;
}

Method Parser::method(CMPIType type, Qualifiers qualifiers) {
  Method result;
  result.name = name_;
  result.type = type;
  result.qualifiers = std::move(qualifiers);
  expect('(', "after method " + result.name);
  if (!accept(')')) {
    do
      result.parameters.push_back(parameter());
    while (accept(','));
    expect(')', "after the parameters of method " + result.name);
  }
  expect(';', "after method " + result.name);
  return result;
}

Parameter Parser::parameter() {
  Parameter result;
  result.qualifiers = qualifierList();
  std::tie(result.type, result.referenceClass) = dataType();
  result.name = expectName("the name of a parameter");
  if (arraySuffix(result.arraySize))
    result.type = arrayOf(result.type);
  return result;
}

QualifierDeclaration Parser::qualifierDeclaration() {
  QualifierDeclaration result;
  result.line = token_.line;
  result.name = expectName("the name of a qualifier");
  expect(':', "after qualifier " + result.name);
  std::string reference;
  std::tie(result.type, reference) = dataType();
  if (arraySuffix(result.arraySize))
    result.type = arrayOf(result.type);
  if (accept('='))
    result.defaultValue = value();
  expect(',', "and the scope after qualifier " + result.name);
  if (!acceptName("scope"))
    fail("expected Scope(...) of qualifier " + result.name + ", got " + token_.shown());
  result.scopes = nameList("a scope");
  if (accept(',')) {
    if (!acceptName("flavor"))
      fail("expected Flavor(...) of qualifier " + result.name + ", got " + token_.shown());
    result.flavors = nameList("a flavor");
  }
  expect(';', "after qualifier " + result.name);
  return result;
}

std::vector<std::string> Parser::nameList(const std::string& what) {
  std::vector<std::string> names;
  expect('(', "before " + what);
  do
    names.push_back(expectName(what));
  while (accept(','));
  expect(')', "after " + what);
  return names;
}

InstanceDeclaration Parser::instanceDeclaration() {
  InstanceDeclaration result;
  result.nameSpace = nameSpace_;
  result.file = lexer_.fileName();
  result.line = token_.line;
  if (!acceptName("of"))
    fail("expected 'of' after 'instance', got " + token_.shown());
  result.className = expectName("the class of an instance");
  if (acceptName("as")) {
    if (token_.kind != TokenKind::Alias)
      fail("expected an alias such as $Name after 'as', got " + token_.shown());
    result.alias = std::string(token_.text);
    advance();
  }
  expect('{', "after instance of " + result.className);
  while (!accept('}')) {
    qualifierList();
    std::string name = expectName("a property of the instance");
    expect('=', "after property " + name);
    result.values.emplace_back(std::move(name), value());
    expect(';', "after property " + result.values.back().first);
  }
  expect(';', "after instance of " + result.className);
  return result;
}

std::pair<CMPIType, std::string> Parser::dataType() {
  const CMPIType known = typeOf(token_);
  std::string name = expectName("a data type");
  if (acceptName("ref")) {
    if (known != CMPI_null)
      fail("a reference is to a class; " + name + " is a data type");
    return {CMPI_ref, std::move(name)};
  }
  if (known == CMPI_null)
    fail("unknown data type '" + name + "'; for a reference, REF follows the name of the class");
  return {known, std::string()};
}

Qualifiers Parser::qualifierList() {
  Qualifiers result;
  if (!accept('['))
    return result;
  do {
    Qualifier next = qualifier();
    if (findQualifier(result, next.name) != nullptr)
      fail("qualifier " + next.name + " is there twice");
    result.push_back(std::move(next));
  } while (accept(','));
  expect(']', "after qualifier " + result.back().name);
  return result;
}

Qualifier Parser::qualifier() {
  Qualifier result{expectName("the name of a qualifier"), {false, {Scalar(true)}}};
  if (token_.is('{')) {
    result.value = value();
  } else if (accept('(')) {
    result.value = value();
    expect(')', "after the value of qualifier " + result.name);
  }
  // Flavors where a qualifier is used repeat or narrow those of its declaration, which decides.
  if (accept(':')) {
    do
      expectName("a flavor of qualifier " + result.name);
    while (token_.kind == TokenKind::Name);
  }
  return result;
}

bool Parser::arraySuffix(std::uint32_t& size) {
  if (!accept('['))
    return false;
  if (const auto* number = std::get_if<std::int64_t>(&token_.value)) {
    if (!std::in_range<std::uint32_t>(*number) || *number == 0)
      fail("the size of an array must be between 1 and 4294967295, got " + token_.shown());
    size = static_cast<std::uint32_t>(*number);
    advance();
  }
  expect(']', "after '['");
  return true;
}

Value Parser::value() {
  Value result;
  if (!accept('{')) {
    result.elements.push_back(scalar());
    return result;
  }
  result.isArray = true;
  if (accept('}'))
    return result;
  do
    result.elements.push_back(scalar());
  while (accept(','));
  expect('}', "after the elements of an array");
  return result;
}

Scalar Parser::scalar() {
  if (acceptName("true"))
    return true;
  if (acceptName("false"))
    return false;
  if (acceptName("null"))
    return std::monostate();
  if (token_.kind == TokenKind::Alias) {
    std::string alias(token_.text);
    advance();
    return alias;
  }
  if (token_.kind != TokenKind::Literal)
    fail("expected a value, got " + token_.shown());
  Scalar result = token_.value;
  advance();
  auto* text = std::get_if<std::string>(&result);
  // Texts that follow each other are one text, over several lines.
  while (text != nullptr && std::holds_alternative<std::string>(token_.value)) {
    *text += std::get<std::string>(token_.value);
    advance();
  }
  return result;
}

}  // namespace cimom::mof
