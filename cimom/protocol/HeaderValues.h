// Reading the values of HTTP headers.
#pragma once

#include <cimom/http/Server.h>

#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace cimom::protocol {

/// One element of a header's list: `text/xml;q="0.5"` is "text/xml" with the parameter q = 0.5.
struct HeaderElement {
  std::string value;
  std::vector<std::pair<std::string, std::string>> parameters;

  /// The parameter's value, whatever the case of its name; empty where there is none.
  [[nodiscard]] std::string_view parameter(std::string_view name) const;
};

/// The elements of a list, which commas part and quotes protect. Quotes are taken off. Empty ones are left
/// out.
[[nodiscard]] std::vector<HeaderElement> elementsOf(std::string_view header);

/// Whether one of the elements, or "*" or "*/*" or "type/*", accepts `wanted`, with a weight above zero. The
/// closest match decides.
[[nodiscard]] bool accepts(const std::vector<HeaderElement>& elements, std::string_view wanted);

/// All headers of this name, as one list.
[[nodiscard]] std::vector<HeaderElement> listOf(const http::Request& request, std::string_view name);

}  // namespace cimom::protocol
