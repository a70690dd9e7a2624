#include <cimom/Names.h>
#include <cimom/broker/WbemUri.h>
#include <cli/BriefPath.h>
#include <cli/CimRows.h>
#include <cli/CimStatus.h>
#include <cli/Messages.h>
#include <cli/Text.h>

#include <algorithm>
#include <array>
#include <charconv>
#include <string_view>
#include <utility>

namespace cli {
namespace {

/// No property can be called so.
constexpr std::string_view pathColumnName = "@path";

/// A table's properties of a software identity, with the order in which a narrow terminal loses them.
constexpr std::array<std::pair<const char*, int>, 6> tellingProperties{{{"InstanceID", 0},
                                                                        {"Description", 0},
                                                                        {"VersionString", 0},
                                                                        {"Manufacturer", 2},
                                                                        {"ReleaseDate", 1},
                                                                        {"Classifications", 3}}};

std::vector<std::string> textsOf(const cimom::mof::Property& property, std::string_view qualifierName) {
  std::vector<std::string> texts;
  const auto* qualifier = cimom::mof::findQualifier(property.qualifiers, qualifierName);
  if (qualifier != nullptr) {
    for (const auto& element : qualifier->value.elements) {
      const auto* text = std::get_if<std::string>(&element);
      texts.push_back(text == nullptr ? std::string() : *text);
    }
  }
  return texts;
}

/// The qualifiers ValueMap and Values side by side, ranges left out. Without a ValueMap, values count from 0.
std::map<std::uint64_t, std::string> valueNames(const cimom::mof::Property& property) {
  std::map<std::uint64_t, std::string> names;
  const std::vector<std::string> values = textsOf(property, "Values");
  const std::vector<std::string> map = textsOf(property, "ValueMap");
  for (std::size_t i = 0; i < values.size(); ++i) {
    std::uint64_t number = i;
    if (!map.empty()) {
      const std::string_view text = i < map.size() ? std::string_view(map[i]) : std::string_view();
      const auto result = std::from_chars(text.data(), text.data() + text.size(), number);
      if (result.ec != std::errc() || result.ptr != text.data() + text.size()) {
        continue;
      }
    }
    names.emplace(number, values[i]);
  }
  return names;
}

Column columnOf(const cimom::mof::Property& property) {
  const CMPIType type = property.type;
  const bool whole = type == CMPI_dateTime || type == CMPI_ref || (property.key && type == CMPI_string);
  return {property.name, valueNames(property), whole, 0};
}

std::string utf8(CMPIChar16 unit) {
  const unsigned code = unit;
  std::string text;
  if (code < 0x80) {
    text += static_cast<char>(code);
  } else if (code < 0x800) {
    text += static_cast<char>(0xC0U | (code >> 6U));
    text += static_cast<char>(0x80U | (code & 0x3FU));
  } else {
    text += static_cast<char>(0xE0U | (code >> 12U));
    text += static_cast<char>(0x80U | ((code >> 6U) & 0x3FU));
    text += static_cast<char>(0x80U | (code & 0x3FU));
  }
  return text;
}

Reference referenceTo(const cimom::ObjectPath& path) {
  return {cimom::formatWbemUri(path), briefPath(path)};
}

/// Objects by their text, all else null.
Scalar objectScalar(const CMPIData& data) {
  if (const auto text = cimom::text(data)) {
    return std::string(*text);
  }
  if (const auto text = cimom::dateTimeText(data)) {
    return DateTime{std::string(*text)};
  }
  if (const cimom::ObjectPath* path = cimom::objectPath(data)) {
    return referenceTo(*path);
  }
  if (const cimom::Instance* instance = cimom::instance(data)) {
    return referenceTo(instance->path());
  }
  return std::monostate{};
}

Scalar scalarOf(const CMPIData& data) {
  if (cimom::isNull(data)) {
    return std::monostate{};
  }
  switch (data.type) {
    case CMPI_boolean:
      return data.value.boolean != 0;
    case CMPI_char16:
      return utf8(data.value.char16);
    case CMPI_uint8:
      return std::uint64_t{data.value.uint8};
    case CMPI_uint16:
      return std::uint64_t{data.value.uint16};
    case CMPI_uint32:
      return std::uint64_t{data.value.uint32};
    case CMPI_uint64:
      return std::uint64_t{data.value.uint64};
    case CMPI_sint8:
      return std::int64_t{data.value.sint8};
    case CMPI_sint16:
      return std::int64_t{data.value.sint16};
    case CMPI_sint32:
      return std::int64_t{data.value.sint32};
    case CMPI_sint64:
      return std::int64_t{data.value.sint64};
    case CMPI_real32:
      return double{data.value.real32};
    case CMPI_real64:
      return data.value.real64;
    default:
      return objectScalar(data);
  }
}

Value valueOf(const CMPIData& data) {
  if (cimom::isNull(data) || (data.type & CMPI_ARRAY) == 0) {
    return scalarOf(data);
  }
  std::vector<Scalar> values;
  for (const CMPIData& element : cimom::elements(data)) {
    values.push_back(scalarOf(element));
  }
  return values;
}

[[noreturn]] void noSuchProperty(const std::vector<const cimom::SchemaClass*>& classes,
                                 const std::string& name) {
  std::vector<std::string> known;
  std::string names;
  std::string classNames;
  for (const cimom::SchemaClass* info : classes) {
    classNames.append(classNames.empty() ? "" : ", ").append(info->name());
    for (const auto& property : info->properties) {
      names.append(names.empty() ? "" : ", ").append(property.name);
      known.push_back(property.name);
    }
  }
  const auto nearest = nearestName(name, known);
  std::string message = statusName(CMPI_RC_ERR_NO_SUCH_PROPERTY) + ": ";
  message += classes.size() == 1 ? classNames + " has no property '" + name + "'"
                                 : "none of " + classNames + " has a property '" + name + "'";
  if (nearest) {
    message += "; did you mean " + *nearest + "?";
  } else if (classes.size() == 1) {
    message += "; it has " + names;
  }
  throw CommandError(message);
}

/// Where a table has a property: what tells an instance from others before the rest, and at the end the
/// system, which is the same one on most machines.
int tellingRank(const cimom::SchemaClass& info, const Column& column) {
  if (namesASystem(column.name)) {
    return 2;
  }
  return info.property(column.name)->key ? 0 : 1;
}

/// `object` has the values: an instance or a path.
template <typename Object>
Row rowFrom(const Object& object, const cimom::ObjectPath& path, const Columns& columns) {
  Row row;
  row.reserve(columns.size());
  for (const Column& column : columns) {
    if (column.name == pathColumnName) {
      row.emplace_back(Scalar(referenceTo(path)));
    } else {
      const cimom::NamedValue* value = object.find(column.name);
      row.push_back(value == nullptr ? Value() : valueOf(value->data));
    }
  }
  return row;
}

}  // namespace

Columns allColumns(const cimom::SchemaClass& info) {
  Columns columns;
  for (const auto& property : info.properties) {
    columns.push_back(columnOf(property));
  }
  return columns;
}

Columns namedColumns(const std::vector<const cimom::SchemaClass*>& classes,
                     const std::vector<std::string>& names) {
  Columns columns;
  for (const std::string& name : names) {
    const auto has = [&name](const cimom::SchemaClass* info) { return info->property(name) != nullptr; };
    const auto info = std::find_if(classes.begin(), classes.end(), has);
    if (info == classes.end()) {
      noSuchProperty(classes, name);
    }
    Column column = columnOf(*(*info)->property(name));
    const bool known = std::any_of(columns.begin(), columns.end(),
                                   [&column](const Column& other) { return other.name == column.name; });
    if (!known) {
      columns.push_back(std::move(column));
    }
  }
  return columns;
}

Columns columnsIn(const cimom::SchemaClass& info, Columns columns) {
  std::erase_if(columns, [&info](const Column& column) { return info.property(column.name) == nullptr; });
  std::stable_sort(columns.begin(), columns.end(), [&info](const Column& left, const Column& right) {
    return info.property(left.name) < info.property(right.name);
  });
  return columns;
}

Columns tellingColumns(const cimom::SchemaClass& info) {
  Columns columns;
  if (info.property("InstanceID") != nullptr && info.property("VersionString") != nullptr) {
    for (const auto& [name, dropRank] : tellingProperties) {
      if (const cimom::mof::Property* property = info.property(name)) {
        columns.push_back(columnOf(*property));
        columns.back().dropRank = dropRank;
      }
    }
    return columns;
  }
  columns = allColumns(info);
  std::erase_if(columns, [](const Column& column) { return namesAClass(column.name); });
  std::stable_sort(columns.begin(), columns.end(), [&info](const Column& left, const Column& right) {
    return tellingRank(info, left) < tellingRank(info, right);
  });
  int dropRank = 0;
  for (Column& column : columns) {
    column.dropRank = info.property(column.name)->key && !namesASystem(column.name) ? 0 : ++dropRank;
  }
  return columns;
}

Columns chosenColumns(const cimom::SchemaClass& info, const Options& options) {
  if (!options.properties.empty()) {
    Columns named = namedColumns({&info}, options.properties);
    return options.format == Format::Json ? columnsIn(info, std::move(named)) : named;
  }
  const bool brief = options.format == Format::Table && options.command == Command::List;
  return brief ? tellingColumns(info) : allColumns(info);
}

Column pathColumn() {
  return {std::string(pathColumnName), {}, true, 0};
}

Columns nameColumns(const cimom::SchemaClass& info) {
  Columns columns{pathColumn()};
  for (const cimom::mof::Property* key : info.keys()) {
    columns.push_back(columnOf(*key));
  }
  return columns;
}

std::optional<std::vector<std::string>> wantedProperties(const cimom::SchemaClass& info,
                                                         const Columns& columns) {
  if (columns.size() == info.properties.size()) {
    return std::nullopt;
  }
  std::vector<std::string> names;
  for (const Column& column : columns) {
    names.push_back(column.name);
  }
  return names;
}

Row rowOf(const cimom::Instance& instance, const Columns& columns) {
  return rowFrom(instance, instance.path(), columns);
}

Row rowOf(const cimom::ObjectPath& path, const Columns& columns) {
  return rowFrom(path, path, columns);
}

}  // namespace cli
