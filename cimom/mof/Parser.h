// Reads declarations from MOF text, one after the other (the MOF of DSP0004 2.x). It knows what a declaration
// looks like, not what has been declared before: that is the repository's business.
#pragma once

#include <cimom/mof/Declarations.h>
#include <cimom/mof/Lexer.h>

#include <string>
#include <string_view>
#include <utility>
#include <variant>
#include <vector>

namespace cimom::mof {

/// `#pragma include ("file")`. Of the other directives, `namespace` counts for the instances that follow it
/// in the same text; the rest (locale) is read and left out.
struct Include {
  std::string file;
  int line = 0;
};

/// Nothing more to read.
struct End {};

using Declaration = std::variant<End, Include, Class, QualifierDeclaration, InstanceDeclaration>;

class Parser {
 public:
  /// The text and the name must outlive the parser.
  Parser(std::string_view text, std::string_view fileName);

  /// The next declaration; `End` at the end. Throws `MofError`, after which no more can be read.
  Declaration next();

 private:
  void advance();
  [[noreturn]] void fail(const std::string& message) const;
  bool accept(char punctuation);
  bool acceptName(std::string_view name);
  void expect(char punctuation, const std::string& after);
  std::string expectName(const std::string& what);

  bool directive(Include& include);
  void takeNameSpace(std::string_view text);
  Class classDeclaration(Qualifiers qualifiers);
  void feature(Class& owner);
  Property property(CMPIType type, std::string reference, Qualifiers qualifiers);
  Method method(CMPIType type, Qualifiers qualifiers);
  Parameter parameter();
  QualifierDeclaration qualifierDeclaration();
  InstanceDeclaration instanceDeclaration();
  std::pair<CMPIType, std::string> dataType();
  Qualifiers qualifierList();
  Qualifier qualifier();
  std::vector<std::string> nameList(const std::string& what);
  bool arraySuffix(std::uint32_t& size);
  Value value();
  Scalar scalar();

  Lexer lexer_;
  Token token_;       ///< the one being looked at
  int lastLine_ = 1;  ///< of the token before it
  std::string name_;  ///< of the feature being read
  std::string nameSpace_;
};

}  // namespace cimom::mof
