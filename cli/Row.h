// What the writers print: rows of values under named columns, free of the host's objects.
#pragma once

#include <cstdint>
#include <map>
#include <string>
#include <variant>
#include <vector>

namespace cli {

/// A CIM datetime in its 25 characters.
struct DateTime {
  std::string text;
  friend bool operator==(const DateTime&, const DateTime&) = default;
};

/// A reference as a WBEM URI, and in the short form that tables show; empty: they show the URI without host
/// and namespace.
struct Reference {
  std::string uri;
  std::string brief = {};
  friend bool operator==(const Reference&, const Reference&) = default;
};

/// One value; null is `std::monostate`.
using Scalar =
    std::variant<std::monostate, bool, std::uint64_t, std::int64_t, double, std::string, DateTime, Reference>;

/// The value of a property: null, one value, or a list of them (which may be empty).
using Value = std::variant<Scalar, std::vector<Scalar>>;

inline bool isNull(const Value& value) {
  const Scalar* scalar = std::get_if<Scalar>(&value);
  return scalar != nullptr && std::holds_alternative<std::monostate>(*scalar);
}

struct Column {
  std::string name;
  /// What the numbers of this property stand for; tables print these. Empty: numbers are numbers.
  std::map<std::uint64_t, std::string> valueNames = {};
  /// Tables never cut it: half a key or half a date is no use to anyone.
  bool whole = false;
  /// Tables leave columns out when the terminal is too narrow, the highest rank first; 0: never.
  int dropRank = 0;
};

using Columns = std::vector<Column>;

/// The values of one object, one for each column.
using Row = std::vector<Value>;

}  // namespace cli
