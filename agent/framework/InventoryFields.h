// The words of inventory files, shared by their reader and their writer.
#pragma once

#include <agent/framework/NodeTree.h>

#include <array>
#include <optional>
#include <string>
#include <string_view>

namespace agent::inventory {

inline constexpr std::string_view formatName = "swinv-inventory";
inline constexpr unsigned int formatVersion = 1;

/// Where in a file a value stands.
enum class Place { Document, Top, Nodes, Node, Properties, Reports, Report };

enum class Field : unsigned int {
  Format,
  Version,
  Nodes,
  NotRead,
  Type,
  Position,
  Id,
  Description,
  Properties,
  Children,
  Source,
  Path,
  Reason,
  Detail,
};

struct FieldDescription {
  Field field;
  Place place;  ///< the kind of object that has it
  std::string_view name;
  bool isRequired;
  std::string_view expected;
};

/// All fields, in the order of `Field`.
inline constexpr std::array<FieldDescription, 14> fields{{
    {Field::Format, Place::Top, "format", true, "\"swinv-inventory\""},
    {Field::Version, Place::Top, "version", true, "1"},
    {Field::Nodes, Place::Top, "nodes", true, "an array of nodes"},
    {Field::NotRead, Place::Top, "notRead", false, "an array of reports"},
    {Field::Type, Place::Node, "type", true, "a node type name or number"},
    {Field::Position, Place::Node, "position", false, "a text"},
    {Field::Id, Place::Node, "id", false,
     "a text of 1 to 16 hexadecimal digits, neither 0 nor ffffffffffffffff"},
    {Field::Description, Place::Node, "description", false, "a text"},
    {Field::Properties, Place::Node, "properties", false, "an object of properties"},
    {Field::Children, Place::Node, "children", false, "an array of nodes"},
    {Field::Source, Place::Report, "source", true, "a text"},
    {Field::Path, Place::Report, "path", false, "a text"},
    {Field::Reason, Place::Report, "reason", true,
     "\"absent\", \"noPermission\", \"unreadable\" or \"timedOut\""},
    {Field::Detail, Place::Report, "detail", false, "a text"},
}};

constexpr const FieldDescription& describe(Field field) {
  return fields[static_cast<unsigned int>(field)];
}

constexpr std::string_view nameOf(Field field) {
  return describe(field).name;
}

/// The field of that name in that kind of object, or null.
const FieldDescription* fieldNamed(Place place, std::string_view name);
/// The names of all fields of that kind of object, for a message.
std::string fieldNames(Place place);

std::string_view reasonName(SourceReport::Reason reason);
std::optional<SourceReport::Reason> reasonNamed(std::string_view name);

}  // namespace agent::inventory
