// Splits MOF text into tokens.
#pragma once

#include <cimom/mof/Declarations.h>

#include <cstddef>
#include <string>
#include <string_view>

namespace cimom::mof {

enum class TokenKind {
  End,
  Name,         ///< identifiers and keywords
  Alias,        ///< `$Name`, with the dollar sign
  Literal,      ///< text, character or number; `value` holds it
  Punctuation,  ///< one character
  Directive,    ///< `#pragma`
};

struct Token {
  TokenKind kind = TokenKind::End;
  std::string_view text;  ///< as written; part of the lexer's text
  Scalar value;           ///< of a literal
  int line = 1;

  [[nodiscard]] bool is(char punctuation) const {
    return kind == TokenKind::Punctuation && text.front() == punctuation;
  }
  /// The name or keyword, without regard to case.
  [[nodiscard]] bool isName(std::string_view name) const;
  /// For messages: the text in quotes, or "the end of the text".
  [[nodiscard]] std::string shown() const;
};

class Lexer {
 public:
  /// The text and the name must outlive the lexer.
  Lexer(std::string_view text, std::string_view fileName);

  /// The next token; from the end on it is always End. Throws `MofError`.
  Token next();

  [[nodiscard]] std::string_view fileName() const { return fileName_; }

 private:
  [[nodiscard]] char peek(std::size_t ahead = 0) const;
  [[noreturn]] void fail(const std::string& message) const;
  void skipBlanks();
  bool skipComment();
  Token nameToken();
  Token aliasToken();
  Token directiveToken();
  Token textToken();
  Token characterToken();
  Token numberToken();
  char32_t readCharacter(char quote);
  char32_t readEscape();
  [[nodiscard]] Token made(TokenKind kind, std::size_t start, Scalar value = {}) const;

  std::string_view text_;
  std::string_view fileName_;
  std::size_t position_ = 0;
  int line_ = 1;
};

}  // namespace cimom::mof
