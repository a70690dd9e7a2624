#include <cimom/Names.h>
#include <cimom/protocol/Arguments.h>
#include <cimom/protocol/CimError.h>
#include <cimom/xml/Conversion.h>

#include <algorithm>
#include <variant>

namespace cimom::protocol {

namespace {

[[noreturn]] void refuse(const std::string& reason) {
  throw CimError(CMPI_RC_ERR_INVALID_PARAMETER, reason);
}

std::string_view expected(ParameterKind kind) {
  switch (kind) {
    case ParameterKind::flag:
      return "true or false";
    case ParameterKind::number:
      return "a uint32";
    case ParameterKind::text:
      return "a single text";
    case ParameterKind::className:
      return "a CLASSNAME";
    case ParameterKind::instanceName:
      return "an INSTANCENAME";
    case ParameterKind::objectName:
      return "a CLASSNAME or an INSTANCENAME";
    case ParameterKind::propertyList:
      return "an array of property names";
    case ParameterKind::newInstance:
      return "an INSTANCE";
    case ParameterKind::modifiedInstance:
      return "a VALUE.NAMEDINSTANCE";
  }
  return "";
}

bool isName(const xml::ParameterValue& value, std::optional<bool> ofInstance) {
  const auto* name = std::get_if<xml::ObjectName>(&value);
  return name != nullptr && (!ofInstance || name->isInstance == *ofInstance);
}

bool isPropertyList(const xml::ParameterValue& value) {
  const auto* names = std::get_if<std::vector<xml::ValueText>>(&value);
  return names != nullptr && std::all_of(names->begin(), names->end(),
                                         [](const xml::ValueText& name) { return name.has_value(); });
}

bool isOf(ParameterKind kind, const xml::ParameterValue& value) {
  const auto* text = std::get_if<std::string>(&value);
  const auto* instance = std::get_if<xml::InstanceElement>(&value);
  switch (kind) {
    case ParameterKind::flag:
      return text != nullptr && xml::booleanOf(*text);
    case ParameterKind::number:
      return text != nullptr && xml::uint32Of(*text);
    case ParameterKind::text:
      return text != nullptr;
    case ParameterKind::className:
      return isName(value, false);
    case ParameterKind::instanceName:
      return isName(value, true);
    case ParameterKind::objectName:
      return isName(value, std::nullopt);
    case ParameterKind::propertyList:
      return isPropertyList(value);
    case ParameterKind::newInstance:
      return instance != nullptr && !instance->name;
    case ParameterKind::modifiedInstance:
      return instance != nullptr && instance->name;
  }
  return false;
}

bool isNull(const xml::Parameter* parameter) {
  return parameter == nullptr || std::holds_alternative<std::monostate>(parameter->value);
}

}  // namespace

Arguments::Arguments(const xml::MethodCall& call, std::span<const ParameterRule> rules)
    : call_(call), rules_(rules) {
  for (const xml::Parameter& given : call.parameters) {
    const auto rule = std::find_if(rules.begin(), rules.end(),
                                   [&](const auto& each) { return sameName(each.name, given.name); });
    if (rule == rules.end())
      refuse(call.name + " has no parameter " + given.name);
    if (call.parameter(given.name) != &given)
      refuse("the parameter " + given.name + " is given twice");
    if (!isNull(&given) && !isOf(rule->kind, given.value))
      refuse("the parameter " + given.name + " must be " + std::string(expected(rule->kind)));
  }
  for (const ParameterRule& rule : rules) {
    if (rule.isRequired && isNull(call.parameter(rule.name)))
      refuse("the parameter " + std::string(rule.name) + " is missing");
  }
}

template <class T>
const T* Arguments::value(std::string_view name) const {
  const xml::Parameter* parameter = call_.parameter(name);
  return parameter == nullptr ? nullptr : std::get_if<T>(&parameter->value);
}

bool Arguments::flag(std::string_view name) const {
  if (const auto* given = value<std::string>(name))
    return *xml::booleanOf(*given);
  const auto rule =
      std::find_if(rules_.begin(), rules_.end(), [name](const auto& each) { return each.name == name; });
  return rule != rules_.end() && rule->defaultFlag;
}

std::optional<std::uint32_t> Arguments::number(std::string_view name) const {
  const auto* given = value<std::string>(name);
  return given == nullptr ? std::nullopt : xml::uint32Of(*given);
}

std::string Arguments::text(std::string_view name) const {
  const auto* given = value<std::string>(name);
  return given == nullptr ? "" : *given;
}

std::string Arguments::className(std::string_view name) const {
  const auto* given = value<xml::ObjectName>(name);
  return given == nullptr ? "" : given->className;
}

const xml::ObjectName& Arguments::object(std::string_view name) const {
  return *value<xml::ObjectName>(name);
}

const xml::InstanceElement& Arguments::instance(std::string_view name) const {
  return *value<xml::InstanceElement>(name);
}

PropertyList Arguments::propertyList() const {
  const auto* given = value<std::vector<xml::ValueText>>("PropertyList");
  if (given == nullptr)
    return std::nullopt;
  std::vector<std::string> names;
  for (const xml::ValueText& name : *given)
    names.push_back(*name);
  return names;
}

}  // namespace cimom::protocol
