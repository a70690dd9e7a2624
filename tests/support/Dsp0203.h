// Holds XML documents against the document type of DSP0203 2.3.
//
// Written from the standard's table of elements, apart from the reader and the writer that it checks.
#pragma once

#include <string>
#include <string_view>
#include <vector>

namespace dsp0203 {

/// What is wrong first, with its line: not well-formed, an unknown element or attribute, an element where its
/// parent has no place for it or that ends before it is complete, a required attribute that is missing, one
/// with a value that is not among the enumerated ones, text where elements belong. Empty: the document is
/// valid. `root` is the element that the document must be.
[[nodiscard]] std::string firstViolation(std::string_view document, std::string_view root = "CIM");

/// The names of all elements that the document type has.
[[nodiscard]] std::vector<std::string> elementNames();

}  // namespace dsp0203
