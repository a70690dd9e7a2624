#include <cimom/xml/Text.h>

#include <gtest/gtest.h>

namespace cimom::xml {
namespace {

std::string inElement(std::string_view plain) {
  std::string out = "|";
  appendText(out, plain);
  return out.substr(1);
}
std::string inAttribute(std::string_view plain) {
  std::string out;
  appendAttributeText(out, plain);
  return out;
}
std::string ofUnit(char16_t unit) {
  std::string out;
  appendCharacter(out, unit);
  return out;
}

constexpr const char* replaced = "\xef\xbf\xbd";

TEST(Text, OrdinaryTextStaysAsItIs) {
  EXPECT_EQ(inElement(""), "");
  EXPECT_EQ(inElement("a"), "a");
  EXPECT_EQ(inElement("Kernel driver e1000e 3.2.6-k (Intel Corporation)"),
            "Kernel driver e1000e 3.2.6-k (Intel Corporation)");
  EXPECT_EQ(inElement("!#$%'()*+,-./0189:;=?@AZ[\\]^_`az{|}~\x7f"),
            "!#$%'()*+,-./0189:;=?@AZ[\\]^_`az{|}~\x7f");
}

TEST(Text, MarkupBecomesEntities) {
  EXPECT_EQ(inElement("<a b=\"c\">&</a>"), "&lt;a b=&quot;c&quot;&gt;&amp;&lt;/a&gt;");
  EXPECT_EQ(inElement("]]>"), "]]&gt;");
}

// Eight bytes are looked at in one: each place in them must be seen.
TEST(Text, MarkupIsFoundAtEveryPlace) {
  for (std::size_t size = 1; size < 40; ++size)
    for (std::size_t place = 0; place < size; ++place)
      for (const auto& [plain, escaped] : {std::pair<char, std::string>{'<', "&lt;"},
                                           {'>', "&gt;"},
                                           {'&', "&amp;"},
                                           {'"', "&quot;"},
                                           {'\r', "&#13;"},
                                           {'\x1f', replaced},
                                           {'\0', replaced},
                                           {'\xff', replaced}}) {
        std::string text(size, 'x');
        text[place] = plain;
        const std::string expected = std::string(place, 'x') + escaped + std::string(size - place - 1, 'x');
        ASSERT_EQ(inElement(text), expected) << size << " " << place;
      }
}

TEST(Text, LayoutStaysInElementsAndBecomesReferencesInAttributes) {
  EXPECT_EQ(inElement("a\tb\nc\rd"), "a\tb\nc&#13;d");
  EXPECT_EQ(inAttribute("a\tb\nc\rd"), "a&#9;b&#10;c&#13;d");
}

TEST(Text, ControlCharactersAreReplaced) {
  for (int control = 0; control < 0x20; ++control)
    if (control != '\t' && control != '\n' && control != '\r') {
      EXPECT_EQ(inElement(std::string(1, static_cast<char>(control))), replaced) << control;
    }
}

TEST(Text, Utf8StaysAsItIs) {
  const std::string text = "\xc3\xa9 \xe2\x82\xac \xf0\x9f\x98\x80 \xef\xbf\xbd \xed\x9f\xbf \xee\x80\x80";
  EXPECT_EQ(inElement(text), text);
}

TEST(Text, WhatIsNoUtf8IsReplaced) {
  EXPECT_EQ(inElement("a\x80z"), std::string("a") + replaced + "z");                  // no first byte
  EXPECT_EQ(inElement("a\xc3"), std::string("a") + replaced);                         // cut short
  EXPECT_EQ(inElement("\xe2\x82z"), std::string(replaced) + "z");                     // one piece
  EXPECT_EQ(inElement("\xc0\xaf"), std::string(replaced) + replaced);                 // longer than needed
  EXPECT_EQ(inElement("\xe0\x80\xaf"), std::string(replaced) + replaced + replaced);  // likewise
  EXPECT_EQ(inElement("\xed\xa0\x80"), std::string(replaced) + replaced + replaced);  // a surrogate
  EXPECT_EQ(inElement("\xf4\x90\x80\x80"), std::string(replaced) + replaced + replaced + replaced);
  EXPECT_EQ(inElement("\xf5z"), std::string(replaced) + "z");
}

TEST(Text, NonCharactersOfTheBasicPlaneAreReplaced) {
  EXPECT_EQ(inElement("\xef\xbf\xbe|\xef\xbf\xbf"), std::string(replaced) + "|" + replaced);
}

TEST(Text, CodeUnits) {
  EXPECT_EQ(ofUnit(u'a'), "a");
  EXPECT_EQ(ofUnit(u'<'), "&lt;");
  EXPECT_EQ(ofUnit(u'\u00e9'), "\xc3\xa9");
  EXPECT_EQ(ofUnit(u'\u20ac'), "\xe2\x82\xac");
  EXPECT_EQ(ofUnit(0), replaced);
  EXPECT_EQ(ofUnit(0xd800), replaced);
  EXPECT_EQ(ofUnit(0xdfff), replaced);
  EXPECT_EQ(ofUnit(0xffff), replaced);
}

}  // namespace
}  // namespace cimom::xml
