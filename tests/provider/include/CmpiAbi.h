// What the CMPI declarations come to: every name with its value, size, offset and type, for comparison with
// the table of the binary interface.
#pragma once

#include <cmpi/cmpidt.h>
#include <cmpi/cmpift.h>

#include <algorithm>
#include <cstddef>
#include <string>
#include <type_traits>
#include <vector>

namespace tests {

/// A fact of the interface: "member CMPIString.ft" is at "8 8 CMPIStringFT*", its offset, size and type.
/// Types are texts without blanks.
struct AbiFact {
  std::string about;
  std::string fact;
};

inline std::string withoutBlanks(std::string text) {
  text.erase(std::remove(text.begin(), text.end(), ' '), text.end());
  return text;
}

inline std::string abiValue(long long value) {
  return std::to_string(value);
}
inline std::string abiValue(const char* value) {
  return '"' + std::string(value) + '"';
}

/// The text of a type, where a declaration has that type.
template <typename Declared, typename Wanted>
std::string abiType(const char* text) {
  return std::is_same_v<Declared, Wanted> ? withoutBlanks(text) : "(another type)";
}

template <typename Declared, typename Wanted>
AbiFact abiMember(const char* about, std::size_t offset, const char* type) {
  const std::size_t size = sizeof(Declared);  // NOLINT(bugprone-sizeof-expression): the size of pointers too
  return {about, std::to_string(offset) + " " + std::to_string(size) + " " + abiType<Declared, Wanted>(type)};
}

template <typename Type>
AbiFact abiLayout(const char* name) {
  return {(std::is_union_v<Type> ? "union " : "struct ") + std::string(name),
          std::to_string(sizeof(Type)) + " " + std::to_string(alignof(Type))};
}

// Together these name all that the declarations hold.
extern const std::vector<AbiFact> abiValues;
extern const std::vector<AbiFact> abiBroker;
extern const std::vector<AbiFact> abiObjects;
extern const std::vector<AbiFact> abiProviders;

}  // namespace tests

// Macros, because a name is needed both as a name and as a text. Types stand last: they may hold commas.
#define ABI_SCALAR(name, ...)                                        \
  tests::AbiFact {                                                   \
    "scalar " #name, tests::abiType<name, __VA_ARGS__>(#__VA_ARGS__) \
  }
#define ABI_CONSTANT(name)                   \
  tests::AbiFact {                           \
    "constant " #name, tests::abiValue(name) \
  }
#define ABI_ENUM(name)                          \
  tests::AbiFact {                              \
    "enum " #name, std::to_string(sizeof(name)) \
  }
#define ABI_ENUMERATOR(name, member)                                                       \
  tests::AbiFact {                                                                         \
    "enumerator " #name "." #member, tests::abiValue(static_cast<long long>(name::member)) \
  }
#define ABI_TYPE(name) tests::abiLayout<name>(#name)
#define ABI_MEMBER(name, member, ...)                                                                        \
  tests::abiMember<decltype(name::member), __VA_ARGS__>("member " #name "." #member, offsetof(name, member), \
                                                        #__VA_ARGS__)
