#include <cimom/Names.h>
#include <cimom/ProviderRegistration.h>

#include <algorithm>
#include <fstream>
#include <set>

namespace cimom {

namespace {

constexpr std::uintmax_t largestFile = 1U << 20U;

std::string_view trimmed(std::string_view text) {
  constexpr std::string_view blanks = " \t\r\f";
  const std::size_t first = text.find_first_not_of(blanks);
  if (first == std::string_view::npos)
    return {};
  return text.substr(first, text.find_last_not_of(blanks) - first + 1);
}

std::vector<std::string> words(std::string_view text) {
  std::vector<std::string> result;
  for (std::string_view rest = trimmed(text); !rest.empty();) {
    const std::size_t end = std::min(rest.find_first_of(" \t"), rest.size());
    result.emplace_back(rest.substr(0, end));
    rest = trimmed(rest.substr(end));
  }
  return result;
}

/// What may stand in a library's name or in front of a factory's: nothing that leads to another folder.
bool isPlainName(std::string_view name) {
  return !name.empty() && name.front() != '.' && std::all_of(name.begin(), name.end(), [](char character) {
    const char folded = foldCase(character);
    return (folded >= 'a' && folded <= 'z') || (character >= '0' && character <= '9') || character == '_' ||
           character == '-' || character == '.';
  });
}

class RegistrationParser {
 public:
  explicit RegistrationParser(std::string_view fileName) : fileName_(fileName) {}

  void line(std::string_view text) {
    ++line_;
    const std::string_view content = trimmed(text);
    if (content.empty() || content.front() == '#' || content.front() == ';')
      return;
    if (content.front() == '[') {
      startSection(content);
      return;
    }
    const std::size_t colon = content.find(':');
    if (colon == std::string_view::npos)
      fail("expected [CLASS] or 'name: value', got '" + std::string(content) + "'");
    entry(trimmed(content.substr(0, colon)), trimmed(content.substr(colon + 1)));
  }

  std::vector<ProviderRegistration> finish() {
    endSection();
    return std::move(result_);
  }

 private:
  [[noreturn]] void fail(const std::string& message) const {
    throw RegistrationError(place() + ": " + message);
  }

  [[nodiscard]] std::string place() const { return std::string(fileName_) + ":" + std::to_string(line_); }

  void startSection(std::string_view content) {
    endSection();
    const std::string_view name =
        content.back() == ']' ? trimmed(content.substr(1, content.size() - 2)) : std::string_view();
    if (!isPlainName(name))
      fail("expected the name of a class in brackets, got '" + std::string(content) + "'");
    for (const ProviderRegistration& earlier : result_) {
      if (sameName(earlier.className, name))
        fail("class " + std::string(name) + " has a section already, at " + earlier.where);
    }
    result_.emplace_back();
    result_.back().className = name;
    result_.back().where = place();
  }

  void endSection() {
    if (result_.empty())
      return;
    for (const char* needed : {"provider", "location", "type", "namespace"}) {
      if (!seen_.contains(needed))
        throw RegistrationError(result_.back().where + ": section [" + result_.back().className +
                                "] lacks '" + needed + ":'");
    }
    seen_.clear();
  }

  void entry(std::string_view name, std::string_view value) {
    if (result_.empty())
      fail("'" + std::string(name) + ":' stands before the first [CLASS]");
    std::string folded(name);
    std::transform(folded.begin(), folded.end(), folded.begin(), foldCase);
    if (!seen_.insert(folded).second)
      fail("'" + folded + ":' is there twice in section [" + result_.back().className + "]");
    if (value.empty())
      fail("'" + folded + ":' has no value");
    ProviderRegistration& section = result_.back();
    if (folded == "provider")
      section.provider = plain(folded, value);
    else if (folded == "location")
      section.location = plain(folded, value);
    else if (folded == "type")
      takeTypes(section, value);
    else if (folded == "namespace")
      takeNameSpaces(section, value);
    else if (folded == "keeps")
      takeKeeps(section, value);
    else if (folded != "unload" && folded != "group" && folded != "user" && folded != "parameters")
      fail("unknown entry '" + folded + ":'; known are provider, location, type, namespace, keeps");
  }

  [[nodiscard]] std::string plain(const std::string& name, std::string_view value) const {
    if (!isPlainName(value))
      fail("'" + name + ": " + std::string(value) + "' is no plain name");
    return std::string(value);
  }

  void takeTypes(ProviderRegistration& section, std::string_view value) const {
    for (const std::string& type : words(value)) {
      if (sameName(type, "instance"))
        section.instance = true;
      else if (sameName(type, "association"))
        section.association = true;
      else
        fail("unknown type '" + type + "'; known are instance, association");
    }
  }

  void takeKeeps(ProviderRegistration& section, std::string_view value) const {
    if (!sameName(value, "nothing"))
      fail("'keeps: " + std::string(value) + "' means nothing here; known is 'keeps: nothing'");
    section.keepsNothing = true;
  }

  static void takeNameSpaces(ProviderRegistration& section, std::string_view value) {
    for (const std::string& each : words(value))
      section.nameSpaces.push_back(each.substr(std::min(each.find_first_not_of('/'), each.size())));
  }

  std::string_view fileName_;
  int line_ = 0;
  std::set<std::string, std::less<>> seen_;
  std::vector<ProviderRegistration> result_;
};

}  // namespace

std::vector<ProviderRegistration> parseRegistrations(std::string_view text, std::string_view fileName) {
  RegistrationParser parser(fileName);
  while (!text.empty()) {
    const std::size_t end = std::min(text.find('\n'), text.size());
    parser.line(text.substr(0, end));
    text.remove_prefix(std::min(end + 1, text.size()));
  }
  return parser.finish();
}

std::vector<ProviderRegistration> readRegistrations(const std::filesystem::path& file) {
  std::error_code error;
  const std::uintmax_t size = std::filesystem::file_size(file, error);
  if (error)
    throw RegistrationError(file.string() + ": cannot be read: " + error.message());
  if (size > largestFile)
    throw RegistrationError(file.string() + ": is larger than " + std::to_string(largestFile) + " bytes");
  std::string text(static_cast<std::size_t>(size), '\0');
  std::ifstream stream(file, std::ios::binary);
  if (!stream.read(text.data(), static_cast<std::streamsize>(text.size())))
    throw RegistrationError(file.string() + ": cannot be read to its end");
  return parseRegistrations(text, file.string());
}

}  // namespace cimom
