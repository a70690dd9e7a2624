// Names of node types and properties, as inventory files and `swinv tree` write them: the contract's
// enumerators without their last word ("Firmware", "VersionString").
#pragma once

#include <optional>
#include <string_view>

namespace agent {

std::optional<std::string_view> nodeTypeName(int type);
std::optional<int> nodeTypeNamed(std::string_view name);

std::optional<std::string_view> propertyName(int property);
std::optional<int> propertyNamed(std::string_view name);

}  // namespace agent
