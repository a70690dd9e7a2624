// The parameters of an operation: what it takes, and what a request gives.
#pragma once

#include <cimom/ObjectManager.h>
#include <cimom/xml/Request.h>
#include <cmpi/cmpidt.h>

#include <cstdint>
#include <optional>
#include <span>
#include <string>
#include <string_view>

namespace cimom::protocol {

enum class ParameterKind {
  flag,
  number,            ///< uint32
  text,              ///< string
  className,         ///< CLASSNAME
  instanceName,      ///< INSTANCENAME
  objectName,        ///< either of them
  propertyList,      ///< array of names
  newInstance,       ///< INSTANCE
  modifiedInstance,  ///< VALUE.NAMEDINSTANCE
};

struct ParameterRule {
  std::string_view name;
  ParameterKind kind;
  bool isRequired = false;  ///< null is not enough
  bool defaultFlag = false;
};

/// Names a parameter as its operation's rules do.
class Arguments {
 public:
  /// Checks all that is given. Throws `CimError` with CMPI_RC_ERR_INVALID_PARAMETER: a required parameter
  /// that is missing or null, one that the operation does not have, one given twice, a value of another kind.
  /// Both arguments must outlive this.
  Arguments(const xml::MethodCall& call, std::span<const ParameterRule> rules);

  [[nodiscard]] bool flag(std::string_view name) const;
  [[nodiscard]] std::optional<std::uint32_t> number(std::string_view name) const;
  /// Empty where it is null.
  [[nodiscard]] std::string text(std::string_view name) const;
  [[nodiscard]] std::string className(std::string_view name) const;
  /// For required parameters alone.
  [[nodiscard]] const xml::ObjectName& object(std::string_view name) const;
  [[nodiscard]] const xml::InstanceElement& instance(std::string_view name) const;
  [[nodiscard]] PropertyList propertyList() const;

 private:
  template <class T>
  [[nodiscard]] const T* value(std::string_view name) const;

  const xml::MethodCall& call_;
  std::span<const ParameterRule> rules_;
};

}  // namespace cimom::protocol
