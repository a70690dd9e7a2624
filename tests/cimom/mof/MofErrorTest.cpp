// Every error names file and line, what was expected and what is there.
#include "Compiled.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <ostream>
#include <string>

namespace {

struct Case {
  const char* what;
  const char* text;
  const char* message;
};

void PrintTo(const Case& tested,
             std::ostream* stream) {  // NOLINT(readability-identifier-naming): GoogleTest's
  *stream << tested.what;
}

class MofErrors : public testing::TestWithParam<Case> {};

TEST_P(MofErrors, areSaidWithTheirLine) {
  EXPECT_EQ(mof_test::complaint(GetParam().text), GetParam().message);
}

INSTANTIATE_TEST_SUITE_P(
    Syntax, MofErrors,
    testing::Values(
        Case{"missing semicolon", "class A {\n  datetime InstallDate\n};",
             "text.mof:2: expected ';' after property InstallDate, got '}'"},
        Case{"missing brace", "class A {\n string x;\n",
             "text.mof:3: expected '}' at the end of class A, got the end of the text"},
        Case{"missing semicolon after a class", "class A {}\nclass B {};",
             "text.mof:1: expected ';' after class A, got 'class'"},
        Case{"no declaration", "string x;",
             "text.mof:1: expected a class, an instance or a qualifier declaration, got 'string'"},
        Case{"unknown type", "class A { text x; };",
             "text.mof:1: unknown data type 'text'; for a reference, REF follows the name of the class"},
        Case{"reference to a type", "class A { string REF x; };",
             "text.mof:1: a reference is to a class; string is a data type"},
        Case{"array of references", "class A { A REF x[]; };",
             "text.mof:1: property x is an array of references, which CIM does not have"},
        Case{"qualifier twice", "[Abstract, abstract] class A {};",
             "text.mof:1: qualifier abstract is there twice"},
        Case{"no value", "class A { string x = ; };", "text.mof:1: expected a value, got ';'"},
        Case{"array size", "class A { string x[0]; };",
             "text.mof:1: the size of an array must be between 1 and 4294967295, got '0'"},
        Case{"pragma without a text", "#pragma include (x)",
             "text.mof:1: expected a text in quotes in #pragma include, got 'x'"},
        Case{"name too long to show", "class A {} abcdefghijklmnopqrstuvwxyzabcdefghijklmnopqrstuvwxyz",
             "text.mof:1: expected ';' after class A, got 'abcdefghijklmnopqrstuvwxyzabcdefghijklmn...'"}));

INSTANTIATE_TEST_SUITE_P(
    Meaning, MofErrors,
    testing::Values(
        Case{"redefinition", "class A {};\nclass a {};",
             "text.mof:2: class a is declared already, at text.mof:1"},
        Case{"unknown superclass", "\nclass A : B {};",
             "text.mof:2: unknown superclass B of class A; a superclass comes before its subclasses"},
        Case{"own superclass", "class A : A {};",
             "text.mof:1: unknown superclass A of class A; a superclass comes before its subclasses"},
        Case{"property twice", "class A { string x;\nuint8 X; };",
             "text.mof:2: property X is declared twice in class A"},
        Case{"method twice", "class A { uint8 x();\nuint8 X(); };",
             "text.mof:1: method X is declared twice in class A"},
        Case{"override of another type", "class A { string x; };\nclass B : A {\nuint8 x; };",
             "text.mof:3: property x overrides one of another type"},
        Case{"override by an array", "class A { string x; };\nclass B : A { string x[]; };",
             "text.mof:2: property x overrides one of another type"},
        Case{"override of nothing", "class A {\n[Override(\"x\")] string x; };",
             "text.mof:2: x overrides x, which is not inherited under that name"},
        Case{"override of another name",
             "class A { string y; };\nclass B : A { [Override(\"y\")] string x; };",
             "text.mof:2: x overrides y, which is not inherited under that name"},
        Case{"key below keys", "class A { [Key] string x; };\nclass B : A {\n[Key] string y; };",
             "text.mof:3: property y cannot be a key: class A has its keys already"},
        Case{"key taken back", "class A { [Key] string x; };\nclass B : A {\n[Key(false)] string x; };",
             "text.mof:3: qualifier Key must stay as it is inherited: it cannot be overridden"},
        Case{"reference outside of the inherited class",
             "class C {};\nclass D {};\nclass A { C REF x; };\nclass B : A { D REF x; };",
             "text.mof:4: type mismatch: reference x must stay with class C or one below it, not D"},
        Case{"unknown reference", "class A {\nNone REF x; };",
             "text.mof:2: reference x is to an unknown class None"},
        Case{"unknown qualifier", "class A {\n[Kee] string x; };",
             "text.mof:2: unknown qualifier 'Kee'; declare it before its use"},
        Case{"qualifier of another type", "[Version(1)] class A {};",
             "text.mof:1: qualifier Version has a value that does not fit its type"},
        Case{"qualifier that is no array", "[Version{\"1\"}] class A {};",
             "text.mof:1: qualifier Version must be one value, not an array"},
        Case{"qualifier that is an array", "class A { [Values(\"1\")] string x; };",
             "text.mof:1: qualifier Values must be an array: put it in braces"},
        Case{"qualifier declared twice", "qualifier Key : boolean, scope(any);",
             "text.mof:1: qualifier Key is declared already"},
        Case{"unknown flavor", "qualifier New : boolean, scope(any), flavor(Sweet);",
             "text.mof:1: unknown flavor 'Sweet' of qualifier New"},
        Case{"default out of range", "class A {\nuint8 x = 256; };",
             "text.mof:2: property x has a value that does not fit its type"},
        Case{"instance of nothing", "instance of A {};", "text.mof:1: unknown class A of an instance"},
        Case{"instance of an abstract class", "[Abstract] class A {};\ninstance of A {};",
             "text.mof:2: class A is abstract: it has no instances"},
        Case{"instance with another property", "class A {};\ninstance of A { x = 1; };",
             "text.mof:2: class A has no property x"},
        Case{"instance with a property twice", "class A { uint8 x; };\ninstance of A { x = 1; X = 1; };",
             "text.mof:2: property X is there twice in an instance of A"},
        Case{"instance with a wrong value", "class A { uint8 x; };\ninstance of A { x = \"1\"; };",
             "text.mof:2: property x has a value that does not fit its type"},
        Case{"include from a text", "#pragma include (\"a.mof\")",
             "text.mof:1: a text that is no file cannot include 'a.mof'"}));

TEST(MofErrorLine, canBeAsked) {
  try {
    mof_test::compiled("\n\nclass");
    FAIL() << "an unfinished class compiles";
  } catch (const cimom::MofError& error) {
    EXPECT_EQ(error.line(), 3);
  }
}

TEST(MofBounds, aClassHasOnlySoManyFeatures) {
  std::string text = "class A {\n";
  for (int count = 0; count < 5000; ++count)
    text += "string p" + std::to_string(count) + ";\n";
  EXPECT_EQ(mof_test::complaint(text + "};"),
            "text.mof:1: class A has more than 4096 properties and methods");
}

TEST(MofBounds, aSchemaHasOnlySoManyFeatures) {
  std::string text = "class A {";
  for (int count = 0; count < 4000; ++count)
    text += "string p" + std::to_string(count) + ";";
  text += "};";
  for (int count = 0; count < 300; ++count)
    text += "\nclass B" + std::to_string(count) + " : A {};";
  EXPECT_THAT(mof_test::complaint(text), testing::HasSubstr("the schema is too large"));
}

}  // namespace
