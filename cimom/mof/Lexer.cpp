#include <cimom/Names.h>
#include <cimom/mof/Lexer.h>
#include <cimom/mof/MofError.h>
#include <cimom/mof/Numbers.h>

#include <utility>

namespace cimom::mof {

namespace {

constexpr std::size_t longestShown = 40;

bool isLetter(char character) {
  const auto byte = static_cast<unsigned char>(character);
  return (foldCase(character) >= 'a' && foldCase(character) <= 'z') || character == '_' || byte >= 0x80;
}

bool isDigit(char character) {
  return character >= '0' && character <= '9';
}

int hexadecimalDigit(char character) {
  if (isDigit(character))
    return character - '0';
  const char folded = foldCase(character);
  return folded >= 'a' && folded <= 'f' ? folded - 'a' + 10 : -1;
}

void appendUtf8(std::string& text, char32_t code) {
  const auto put = [&text](char32_t byte) { text.push_back(static_cast<char>(byte)); };
  if (code < 0x80) {
    put(code);
  } else if (code < 0x800) {
    put(0xC0 | (code >> 6));
    put(0x80 | (code & 0x3F));
  } else {
    put(0xE0 | (code >> 12));
    put(0x80 | ((code >> 6) & 0x3F));
    put(0x80 | (code & 0x3F));
  }
}

}  // namespace

bool Token::isName(std::string_view name) const {
  return kind == TokenKind::Name && sameName(text, name);
}

std::string Token::shown() const {
  if (kind == TokenKind::End)
    return "the end of the text";
  if (text.size() <= longestShown)
    return "'" + std::string(text) + "'";
  return "'" + std::string(text.substr(0, longestShown)) + "...'";
}

Lexer::Lexer(std::string_view text, std::string_view fileName) : text_(text), fileName_(fileName) {
  if (text_.starts_with("\xEF\xBB\xBF"))
    position_ = 3;
}

char Lexer::peek(std::size_t ahead) const {
  return ahead < text_.size() - position_ ? text_[position_ + ahead] : '\0';
}

void Lexer::fail(const std::string& message) const {
  throw MofError(fileName_, line_, message);
}

void Lexer::skipBlanks() {
  while (position_ < text_.size()) {
    const char character = text_[position_];
    if (character == '\n')
      ++line_;
    if (character == '\n' || character == ' ' || character == '\t' || character == '\r' ||
        character == '\f') {
      ++position_;
      continue;
    }
    if (!skipComment())
      return;
  }
}

bool Lexer::skipComment() {
  if (peek() != '/')
    return false;
  if (peek(1) == '/') {
    position_ = std::min(text_.find('\n', position_), text_.size());
    return true;
  }
  if (peek(1) != '*')
    return false;
  const std::size_t end = text_.find("*/", position_ + 2);
  if (end == std::string_view::npos)
    fail("a comment that starts here has no end; close it with */");
  const std::string_view comment = text_.substr(position_, end - position_);
  line_ += static_cast<int>(std::count(comment.begin(), comment.end(), '\n'));
  position_ = end + 2;
  return true;
}

Token Lexer::made(TokenKind kind, std::size_t start, Scalar value) const {
  return {kind, text_.substr(start, position_ - start), std::move(value), line_};
}

Token Lexer::next() {
  skipBlanks();
  const char character = peek();
  if (position_ >= text_.size())
    return made(TokenKind::End, position_);
  if (isLetter(character))
    return nameToken();
  if (isDigit(character) || ((character == '+' || character == '-' || character == '.') &&
                             (isDigit(peek(1)) || (peek(1) == '.' && isDigit(peek(2))))))
    return numberToken();
  switch (character) {
    case '"':
      return textToken();
    case '\'':
      return characterToken();
    case '$':
      return aliasToken();
    case '#':
      return directiveToken();
    default:
      break;
  }
  if (std::string_view("[](){},;:=").find(character) == std::string_view::npos)
    fail("a character that MOF does not know, of code " +
         std::to_string(static_cast<unsigned char>(character)));
  ++position_;
  return made(TokenKind::Punctuation, position_ - 1);
}

Token Lexer::nameToken() {
  const std::size_t start = position_;
  while (isLetter(peek()) || isDigit(peek()))
    ++position_;
  return made(TokenKind::Name, start);
}

Token Lexer::aliasToken() {
  const std::size_t start = position_++;
  if (!isLetter(peek()))
    fail("expected a name after '$'");
  nameToken();
  return made(TokenKind::Alias, start);
}

Token Lexer::directiveToken() {
  const std::size_t start = position_++;
  const Token name = nameToken();
  if (!name.isName("pragma"))
    fail("expected #pragma, got '#" + std::string(name.text) + "'");
  return made(TokenKind::Directive, start);
}

Token Lexer::textToken() {
  const std::size_t start = position_++;
  std::string value;
  while (peek() != '"') {
    const char character = peek();
    if (character == '\\' || position_ >= text_.size() || character == '\n') {
      appendUtf8(value, readCharacter('"'));
    } else {
      value.push_back(character);
      ++position_;
    }
  }
  ++position_;
  return made(TokenKind::Literal, start, std::move(value));
}

Token Lexer::characterToken() {
  const std::size_t start = position_++;
  const char32_t code = readCharacter('\'');
  if (peek() != '\'')
    fail("expected one character between single quotes");
  ++position_;
  return made(TokenKind::Literal, start, static_cast<CMPIChar16>(code));
}

char32_t Lexer::readCharacter(char quote) {
  const char character = peek();
  if (position_ >= text_.size() || character == '\n')
    fail("a quoted text must end on its own line; a closing " + std::string(1, quote) + " is missing");
  if (character == quote)
    fail("expected a character between single quotes");
  ++position_;
  if (character == '\\')
    return readEscape();
  const auto byte = static_cast<unsigned char>(character);
  if (byte < 0x80)
    return byte;
  // UTF-8 up to U+FFFF: what a char16 can hold.
  const int more = byte >= 0xE0 ? 2 : 1;
  char32_t code = byte >= 0xE0 ? byte & 0x0FU : byte & 0x1FU;
  if (byte < 0xC2 || byte > 0xEF)
    fail("expected one character of UTF-8 that fits 16 bits");
  for (int count = 0; count < more; ++count) {
    const auto following = static_cast<unsigned char>(peek());
    if ((following & 0xC0U) != 0x80U)
      fail("expected one character of UTF-8 that fits 16 bits");
    code = code << 6 | (following & 0x3FU);
    ++position_;
  }
  return code;
}

char32_t Lexer::readEscape() {
  constexpr std::pair<char, char> simple[] = {{'b', '\b'}, {'t', '\t'}, {'n', '\n'},  {'f', '\f'},
                                              {'r', '\r'}, {'"', '"'},  {'\'', '\''}, {'\\', '\\'}};
  const char character = peek();
  for (const auto& [letter, meaning] : simple) {
    if (letter == character) {
      ++position_;
      return static_cast<unsigned char>(meaning);
    }
  }
  if (foldCase(character) != 'x')
    fail("unknown escape in a quoted text; known are \\b \\t \\n \\f \\r \\\" \\' \\\\ and \\xHHHH");
  ++position_;
  char32_t code = 0;
  int digits = 0;
  for (int digit = hexadecimalDigit(peek()); digits < 4 && digit >= 0; digit = hexadecimalDigit(peek())) {
    code = code << 4 | static_cast<char32_t>(digit);
    ++digits;
    ++position_;
  }
  if (digits == 0)
    fail("expected one to four hexadecimal digits after \\x");
  if (code == 0 || (code >= 0xD800 && code <= 0xDFFF))
    fail("\\x names no character: NUL and halves of surrogate pairs are none");
  return code;
}

Token Lexer::numberToken() {
  const std::size_t start = position_++;
  while (isLetter(peek()) || isDigit(peek()) || peek() == '.' ||
         ((peek() == '+' || peek() == '-') && foldCase(text_[position_ - 1]) == 'e' &&
          text_.substr(start, position_ - start).find('.') != std::string_view::npos))
    ++position_;
  const std::string_view written = text_.substr(start, position_ - start);
  const auto number = parseNumber(written);
  if (!number)
    fail("'" + std::string(written.substr(0, longestShown)) + "' is no number of at most 64 bits");
  return made(TokenKind::Literal, start, *number);
}

}  // namespace cimom::mof
