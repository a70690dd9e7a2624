#include <cimom/broker/NumberText.h>
#include <cimom/broker/WbemUri.h>

#include <algorithm>
#include <charconv>

namespace cimom {

namespace {

bool isLetter(char character) {
  return (character >= 'a' && character <= 'z') || (character >= 'A' && character <= 'Z') ||
         character == '_' || static_cast<unsigned char>(character) >= 0x80;
}
bool isDigit(char character) {
  return character >= '0' && character <= '9';
}
bool isNameCharacter(char character) {
  return isLetter(character) || isDigit(character);
}
bool isNameSpaceCharacter(char character) {
  return isNameCharacter(character) || character == '/' || character == '-';
}
bool isNumberCharacter(char character) {
  return isNameCharacter(character) || character == '+' || character == '-' || character == '.';
}

class Parser {
 public:
  Parser(Arena& arena, const ClassTable& classes, std::string_view text, std::string_view defaultNameSpace,
         unsigned depth)
      : arena_(arena), classes_(classes), text_(text), defaultNameSpace_(defaultNameSpace), depth_(depth) {}

  ObjectPath* parse() {
    const std::string_view host = readHost();
    const std::string_view nameSpace = readNameSpace(!host.empty());
    const std::string_view className = readName("a class name");
    path_ = ObjectPath::create(arena_, classes_, nameSpace, className);
    path_->setHostName(host);
    if (atEnd()) {
      return path_;
    }
    char separator = '.';
    while (!atEnd()) {
      expect(separator,
             separator == '.' ? "\".\" and keys after the class name" : "\",\" or the end after a key");
      readKey();
      separator = ',';
    }
    return path_;
  }

 private:
  [[nodiscard]] bool atEnd() const { return position_ == text_.size(); }
  [[nodiscard]] std::string_view rest() const { return text_.substr(position_); }

  [[noreturn]] void fail(const std::string& expected) const {
    const std::string got = atEnd() ? "the text ends here" : "got '" + std::string(1, text_[position_]) + "'";
    throw WbemUriError(position_ + 1, "expected " + expected + ", " + got);
  }

  void expect(char character, const std::string& what) {
    if (atEnd() || text_[position_] != character) {
      fail(what);
    }
    ++position_;
  }

  template <class Predicate>
  std::string_view readWhile(const Predicate& predicate) {
    const std::string_view from = rest();
    const auto end = std::find_if_not(from.begin(), from.end(), predicate);
    const auto size = static_cast<std::size_t>(end - from.begin());
    position_ += size;
    return from.substr(0, size);
  }

  std::string_view readName(const char* what) {
    if (atEnd() || !isLetter(text_[position_])) {
      fail(what);
    }
    return readWhile(isNameCharacter);
  }

  // "//host/", a scheme before it or not. The scheme says how to reach the host, not what the path names.
  std::string_view readHost() {
    const std::size_t scheme = text_.find("://");
    const auto isSchemeCharacter = [](char character) {
      return isNameCharacter(character) || character == '.';
    };
    if (scheme != std::string_view::npos && scheme > 0 &&
        std::all_of(text_.begin(), text_.begin() + static_cast<std::ptrdiff_t>(scheme), isSchemeCharacter)) {
      position_ = scheme + 1;
    }
    if (!rest().starts_with("//")) {
      return {};
    }
    position_ += 2;
    const std::string_view host =
        readWhile([](char character) { return character != '/' && character != '"'; });
    if (host.empty()) {
      fail("a host name after \"//\"");
    }
    expect('/', "\"/\" and a namespace after the host name");
    return host;
  }

  std::string_view readNameSpace(bool isRequired) {
    const std::size_t start = position_;
    const std::string_view nameSpace = readWhile(isNameSpaceCharacter);
    if (!atEnd() && text_[position_] == ':') {
      ++position_;
      return nameSpace;
    }
    if (isRequired || nameSpace.find('/') != std::string_view::npos) {
      fail("\":\" after the namespace");
    }
    position_ = start;
    return defaultNameSpace_;
  }

  void readKey() {
    const std::size_t start = position_;
    const std::string_view name = readName("a key name");
    if (path_->find(name) != nullptr) {
      throw WbemUriError(start + 1, "the key " + std::string(name) + " is given twice");
    }
    expect('=', "\"=\" after the key name");
    const ClassInfo* const info = path_->classInfo();
    const PropertyInfo* const declared = info == nullptr ? nullptr : info->find(name);
    const CMPIType type = declared == nullptr ? CMPI_null : declared->type;
    const CMPIData data = readValue(type);
    if (path_->addKey(name, &data.value, data.type) != CMPI_RC_OK) {
      throw WbemUriError(start + 1, "the key " + std::string(name) + " cannot have this value");
    }
  }

  CMPIData readValue(CMPIType declared) {
    if (!atEnd() && text_[position_] == '"') {
      return readQuoted(declared);
    }
    CMPIData data{};
    if (!atEnd() && text_[position_] == '\'') {
      data.type = CMPI_char16;
      data.value.char16 = readChar16();
      return data;
    }
    const std::size_t start = position_;
    const std::string_view word = readWhile(isNumberCharacter);
    if (sameName(word, "true") || sameName(word, "false")) {
      data.type = CMPI_boolean;
      data.value.boolean = sameName(word, "true") ? 1 : 0;
      return data;
    }
    if (!readKeyNumber(word, declared, data)) {
      position_ = start;
      fail("a value: text in double quotes, a character in single ones, a number, true or false");
    }
    return data;
  }

  CMPIData readQuoted(CMPIType declared) {
    const std::size_t start = position_;
    const std::string content = readQuotedText();
    CMPIData data{};
    if (declared == CMPI_ref) {
      data.type = CMPI_ref;
      data.value.ref = readReference(content, start);
      return data;
    }
    if (declared == CMPI_dateTime) {
      data.value.dateTime = DateTime::create(arena_, std::string_view(content));
      if (data.value.dateTime != nullptr) {
        data.type = CMPI_dateTime;
        return data;
      }
    }
    data.type = CMPI_string;
    data.value.string = String::create(arena_, content);
    return data;
  }

  std::string readQuotedText() {
    ++position_;
    std::string content;
    while (!atEnd() && text_[position_] != '"') {
      if (text_[position_] == '\\') {
        ++position_;
        if (atEnd() || (text_[position_] != '"' && text_[position_] != '\\')) {
          fail("a quote or a backslash after the backslash");
        }
      }
      content += text_[position_++];
    }
    expect('"', "a closing double quote");
    return content;
  }

  ObjectPath* readReference(const std::string& content, std::size_t start) {
    if (depth_ == wbemUriDepth) {
      throw WbemUriError(start + 1, "references are nested too deeply");
    }
    try {
      return Parser(arena_, classes_, content, defaultNameSpace_, depth_ + 1).parse();
    } catch (const WbemUriError& error) {
      throw WbemUriError(start + 1, std::string("in the quoted reference, ") + error.what());
    }
  }

  CMPIChar16 readChar16() {
    ++position_;
    if (atEnd()) {
      fail("a character");
    }
    CMPIChar16 character = 0;
    if (text_[position_] == '\\') {
      ++position_;
      character = readEscape();
    } else if (text_[position_] == '\'' || static_cast<unsigned char>(text_[position_]) >= 0x80) {
      fail("an ASCII character or \\x and hexadecimal digits");
    } else {
      character = static_cast<unsigned char>(text_[position_++]);
    }
    expect('\'', "a closing single quote");
    return character;
  }

  CMPIChar16 readEscape() {
    if (!atEnd() && (text_[position_] == '\'' || text_[position_] == '\\')) {
      return static_cast<unsigned char>(text_[position_++]);
    }
    expect('x', "\\', \\\\ or \\x and hexadecimal digits");
    const std::string_view digits = rest().substr(0, 4);
    CMPIChar16 character = 0;
    const auto result = std::from_chars(digits.data(), digits.data() + digits.size(), character, 16);
    if (result.ptr == digits.data()) {
      fail("hexadecimal digits");
    }
    position_ += static_cast<std::size_t>(result.ptr - digits.data());
    return character;
  }

  Arena& arena_;
  const ClassTable& classes_;
  std::string_view text_;
  std::string_view defaultNameSpace_;
  unsigned depth_;
  std::size_t position_ = 0;
  ObjectPath* path_ = nullptr;
};

}  // namespace

ObjectPath* parseWbemUri(Arena& arena, const ClassTable& classes, std::string_view text,
                         std::string_view defaultNameSpace) {
  constexpr std::size_t longest = 65536;
  if (text.size() > longest) {
    throw WbemUriError(longest + 1, "expected no more than " + std::to_string(longest) + " characters");
  }
  if (const std::size_t zero = text.find('\0'); zero != std::string_view::npos) {
    throw WbemUriError(zero + 1, "a zero byte is no part of any path");
  }
  return Parser(arena, classes, text, defaultNameSpace, 0).parse();
}

}  // namespace cimom
