// Text as XML 1.0 carries it.
#pragma once

#include <string>
#include <string_view>

namespace cimom::xml {

/// Appends `plain`, UTF-8, so that it can stand in an element or in a double-quoted attribute, and reads as
/// the same text there: & < > " as entities, carriage returns (in attributes, tabs and line feeds too) as
/// character references.
///
/// What XML 1.0 cannot carry becomes U+FFFD, the replacement character, so that no value ever breaks the
/// document: control characters other than tab, line feed and carriage return, U+FFFE and U+FFFF, surrogates,
/// and each longest piece of bytes that is no UTF-8.
void appendText(std::string& out, std::string_view plain);
void appendAttributeText(std::string& out, std::string_view plain);

/// The UTF-8 of a UTF-16 code unit; U+FFFD for a surrogate and whatever else XML cannot carry.
void appendCharacter(std::string& out, char16_t unit);

}  // namespace cimom::xml
