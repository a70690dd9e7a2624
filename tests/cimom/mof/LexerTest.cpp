#include <cimom/mof/Lexer.h>
#include <cimom/mof/MofError.h>
#include <cimom/mof/Numbers.h>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <limits>
#include <string>
#include <vector>

namespace {

using cimom::MofError;
using cimom::mof::fitted;
using cimom::mof::Lexer;
using cimom::mof::parseNumber;
using cimom::mof::Scalar;
using cimom::mof::Token;
using cimom::mof::TokenKind;
using testing::ElementsAre;

std::vector<std::string> texts(std::string_view text) {
  Lexer lexer(text, "text.mof");
  std::vector<std::string> result;
  for (Token token = lexer.next(); token.kind != TokenKind::End; token = lexer.next())
    result.emplace_back(token.text);
  return result;
}

Scalar literal(std::string_view text) {
  return Lexer(text, "text.mof").next().value;
}

std::string complaint(std::string_view text) {
  try {
    texts(text);
  } catch (const MofError& error) {
    return error.what();
  }
  return {};
}

TEST(MofLexer, splitsNamesPunctuationAndComments) {
  EXPECT_THAT(texts("class A_1:B { // to the end } \n /* over\n lines */ uint8 x[]; };"),
              ElementsAre("class", "A_1", ":", "B", "{", "uint8", "x", "[", "]", ";", "}", ";"));
}

TEST(MofLexer, countsLinesOverCommentsAndTexts) {
  Lexer lexer("a // one\n/* two\n three */ \"x\"\r\n  b", "text.mof");
  EXPECT_EQ(lexer.next().line, 1);
  EXPECT_EQ(lexer.next().line, 3);
  EXPECT_EQ(lexer.next().line, 4);
}

TEST(MofLexer, skipsAByteOrderMark) {
  EXPECT_THAT(texts("\xEF\xBB\xBF"
                    "class"),
              ElementsAre("class"));
}

TEST(MofLexer, readsEscapesOfTexts) {
  EXPECT_EQ(literal(R"("a\"b\\c\td\x41\x20AC!")"), Scalar(std::string("a\"b\\c\tdA\xE2\x82\xAC!")));
  EXPECT_EQ(literal("\"\xC3\xA4\""), Scalar(std::string("\xC3\xA4")));
}

TEST(MofLexer, readsCharacters) {
  EXPECT_EQ(literal("'x'"), Scalar(CMPIChar16{'x'}));
  EXPECT_EQ(literal(R"('\'')"), Scalar(CMPIChar16{'\''}));
  EXPECT_EQ(literal("'\xE2\x82\xAC'"), Scalar(CMPIChar16{0x20AC}));
}

TEST(MofLexer, saysWhatIsWrongAndWhere) {
  EXPECT_EQ(complaint("\n\"open\nclass"),
            "text.mof:2: a quoted text must end on its own line; a closing \" is missing");
  EXPECT_EQ(complaint("a\n/* open"), "text.mof:2: a comment that starts here has no end; close it with */");
  EXPECT_EQ(complaint("a ? b"), "text.mof:1: a character that MOF does not know, of code 63");
  EXPECT_EQ(complaint("12x"), "text.mof:1: '12x' is no number of at most 64 bits");
  EXPECT_EQ(complaint("#include"), "text.mof:1: expected #pragma, got '#include'");
  EXPECT_NE(complaint(R"("\q")"), "");
  EXPECT_NE(complaint(R"("\x0")"), "");
  EXPECT_NE(complaint("''"), "");
  EXPECT_NE(complaint("'ab'"), "");
  EXPECT_NE(complaint("'\xF0\x9F\x98\x80'"), "");
  EXPECT_NE(complaint("'\xC3"), "");
  EXPECT_NE(complaint("$ a"), "");
  EXPECT_NE(complaint(std::string_view("a\0b", 3)), "");
}

TEST(MofNumbers, readsEveryForm) {
  EXPECT_EQ(parseNumber("0"), Scalar(std::int64_t{0}));
  EXPECT_EQ(parseNumber("-12"), Scalar(std::int64_t{-12}));
  EXPECT_EQ(parseNumber("+7"), Scalar(std::int64_t{7}));
  EXPECT_EQ(parseNumber("017"), Scalar(std::int64_t{15}));
  EXPECT_EQ(parseNumber("0x8000"), Scalar(std::int64_t{0x8000}));
  EXPECT_EQ(parseNumber("101b"), Scalar(std::int64_t{5}));
  EXPECT_EQ(parseNumber("-1.5e2"), Scalar(-150.0));
  EXPECT_EQ(parseNumber("+2.5"), Scalar(2.5));
  EXPECT_EQ(parseNumber("18446744073709551615"), Scalar(std::numeric_limits<std::uint64_t>::max()));
  EXPECT_EQ(parseNumber("-9223372036854775808"), Scalar(std::numeric_limits<std::int64_t>::min()));
}

TEST(MofNumbers, refusesWhatIsNone) {
  for (const char* text : {"", "-", "0x", "08", "12b", "1.", "1.5e", "0x1g", "18446744073709551616",
                           "-9223372036854775809", "1.5.2", "--1"})
    EXPECT_EQ(parseNumber(text), std::nullopt) << text;
}

TEST(MofNumbers, fitsTypes) {
  EXPECT_TRUE(fitted(std::int64_t{255}, CMPI_uint8));
  EXPECT_FALSE(fitted(std::int64_t{256}, CMPI_uint8));
  EXPECT_FALSE(fitted(std::int64_t{-1}, CMPI_uint64));
  EXPECT_TRUE(fitted(std::int64_t{-128}, CMPI_sint8));
  EXPECT_FALSE(fitted(std::int64_t{-129}, CMPI_sint8));
  EXPECT_TRUE(fitted(std::numeric_limits<std::uint64_t>::max(), CMPI_uint64));
  EXPECT_FALSE(fitted(std::numeric_limits<std::uint64_t>::max(), CMPI_sint64));
  EXPECT_EQ(fitted(std::int64_t{3}, CMPI_real32), Scalar(3.0));
  EXPECT_FALSE(fitted(1.0, CMPI_uint16));
  EXPECT_FALSE(fitted(std::string("1"), CMPI_uint16));
  EXPECT_FALSE(fitted(true, CMPI_string));
  EXPECT_TRUE(fitted(Scalar(), CMPI_uint16));
}

}  // namespace
