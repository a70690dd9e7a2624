// The XML of an answer as a tree, for tests that look into it.
#pragma once

#include <map>
#include <string>
#include <string_view>
#include <vector>

namespace serve_test {

struct Element {
  std::string name;
  std::map<std::string, std::string> attributes;
  std::string text;  ///< its own, without that of the elements in it
  std::vector<Element> children;

  /// All elements of this name below this one, in the order of the document.
  [[nodiscard]] std::vector<const Element*> all(std::string_view wanted) const;
  /// The first of them; throws `std::runtime_error` where there is none.
  [[nodiscard]] const Element& first(std::string_view wanted) const;
  [[nodiscard]] std::string attribute(const std::string& wanted) const;
  /// As XML again.
  [[nodiscard]] std::string xml() const;
};

/// Throws `std::runtime_error` where the text is no XML.
Element parseXml(std::string_view text);

std::string escaped(std::string_view text);

}  // namespace serve_test
