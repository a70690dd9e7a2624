#include <cimom/Names.h>
#include <cimom/protocol/HeaderValues.h>

#include <algorithm>
#include <cstddef>

namespace cimom::protocol {

namespace {

std::string_view trimmed(std::string_view text) {
  const std::size_t first = text.find_first_not_of(" \t");
  if (first == std::string_view::npos)
    return {};
  return text.substr(first, text.find_last_not_of(" \t") - first + 1);
}

std::string unquoted(std::string_view text) {
  text = trimmed(text);
  if (text.size() < 2 || text.front() != '"' || text.back() != '"')
    return std::string(text);
  std::string plain;
  text = text.substr(1, text.size() - 2);
  for (std::size_t at = 0; at < text.size(); ++at) {
    if (text[at] == '\\' && at + 1 < text.size())
      ++at;
    plain += text[at];
  }
  return plain;
}

/// The pieces between separators that stand in no quotes.
std::vector<std::string_view> parted(std::string_view text, char separator) {
  std::vector<std::string_view> pieces;
  bool quoted = false;
  std::size_t start = 0;
  for (std::size_t at = 0; at < text.size(); ++at) {
    if (quoted && text[at] == '\\') {
      ++at;
    } else if (text[at] == '"') {
      quoted = !quoted;
    } else if (text[at] == separator && !quoted) {
      pieces.push_back(text.substr(start, at - start));
      start = at + 1;
    }
  }
  pieces.push_back(text.substr(start));
  return pieces;
}

/// How closely an element names what is wanted: 0 not at all, 1 as anything, 2 by its type, 3 itself.
int closeness(std::string_view element, std::string_view wanted) {
  if (sameName(element, wanted))
    return 3;
  const std::size_t slash = wanted.find('/');
  if (slash != std::string_view::npos && element.ends_with("/*") &&
      sameName(element.substr(0, element.size() - 1), wanted.substr(0, slash + 1)))
    return 2;
  return element == "*" || element == "*/*" ? 1 : 0;
}

/// A weight is zero only if it has no other digit.
bool isZero(std::string_view weight) {
  return !weight.empty() && weight.find_first_not_of("0.") == std::string_view::npos;
}

}  // namespace

std::string_view HeaderElement::parameter(std::string_view name) const {
  const auto found = std::find_if(parameters.begin(), parameters.end(),
                                  [name](const auto& each) { return sameName(each.first, name); });
  return found == parameters.end() ? std::string_view() : std::string_view(found->second);
}

std::vector<HeaderElement> elementsOf(std::string_view header) {
  std::vector<HeaderElement> elements;
  for (const std::string_view piece : parted(header, ',')) {
    const std::vector<std::string_view> parts = parted(piece, ';');
    HeaderElement element{unquoted(parts.front()), {}};
    if (element.value.empty())
      continue;
    for (std::size_t index = 1; index < parts.size(); ++index) {
      const std::size_t equals = std::min(parts[index].find('='), parts[index].size());
      const std::size_t value = std::min(equals + 1, parts[index].size());
      element.parameters.emplace_back(trimmed(parts[index].substr(0, equals)),
                                      unquoted(parts[index].substr(value)));
    }
    elements.push_back(std::move(element));
  }
  return elements;
}

bool accepts(const std::vector<HeaderElement>& elements, std::string_view wanted) {
  int closest = 0;
  bool accepted = false;
  for (const HeaderElement& element : elements) {
    const int close = closeness(element.value, wanted);
    if (close > closest) {
      closest = close;
      accepted = !isZero(element.parameter("q"));
    }
  }
  return accepted;
}

std::vector<HeaderElement> listOf(const http::Request& request, std::string_view name) {
  std::vector<HeaderElement> all;
  for (const http::Field& field : request.fields) {
    if (!sameName(field.name, name))
      continue;
    for (HeaderElement& element : elementsOf(field.value))
      all.push_back(std::move(element));
  }
  return all;
}

}  // namespace cimom::protocol
