// What the object manager itself must know of a query: the class that it is about.
#pragma once

#include <string>
#include <string_view>

namespace cimom {

/// Whether the language is one of those that the standards define: WQL, and CQL by its names of DSP0202.
[[nodiscard]] bool isKnownQueryLanguage(std::string_view language);

/// The first name after the word FROM, outside of quoted texts: "SELECT * FROM CIM_Thing WHERE ..." gives
/// CIM_Thing. Empty where there is none.
[[nodiscard]] std::string classOfQuery(std::string_view query);

}  // namespace cimom
