#include <agent/framework/NodeTree.h>

#include <gtest/gtest.h>

#include <random>
#include <string>

namespace agent {
namespace {

const std::string replaced = "\xEF\xBF\xBD";

TEST(CleanText, LeavesCleanTextsAlone) {
  for (const char* text :
       {"", "2.14.1", "a b  c", "Gr\xC3\xBC\xC3\x9F", "\xE2\x82\xAC", "\xF0\x9F\x98\x80", "N/A"}) {
    EXPECT_EQ(cleanText(text), text);
  }
}

TEST(CleanText, StripsBlanksAndControlCharactersAtBothEnds) {
  EXPECT_EQ(cleanText("  BIOS \t\r\n"), "BIOS");
  EXPECT_EQ(cleanText("\x01 \x7F x \xC2\x85 "), "x");
  EXPECT_EQ(cleanText(" \t\n"), "");
  EXPECT_EQ(cleanText(std::string_view("\0\0a\0", 4)), "a");
}

TEST(CleanText, PutsABlankForEachControlCharacterInside) {
  EXPECT_EQ(cleanText("a\tb\r\nc"), "a b  c");
  EXPECT_EQ(cleanText("a\xC2\x80z"), "a z");
  EXPECT_EQ(cleanText("a\xC2\xA0z"), "a\xC2\xA0z") << "U+00A0 is no control character";
}

TEST(CleanText, ReplacesEachByteThatIsNotUtf8) {
  EXPECT_EQ(cleanText("a\xFFz"), "a" + replaced + "z");
  EXPECT_EQ(cleanText("\x80"), replaced) << "a continuation byte alone";
  EXPECT_EQ(cleanText("\xC3"), replaced) << "cut short";
  EXPECT_EQ(cleanText("\xE2\x82"), replaced + replaced) << "cut short";
  EXPECT_EQ(cleanText("\xC0\xAF"), replaced + replaced) << "overlong";
  EXPECT_EQ(cleanText("\xE0\x80\xAF"), replaced + replaced + replaced) << "overlong";
  EXPECT_EQ(cleanText("\xF0\x80\x80\xAF"), replaced + replaced + replaced + replaced) << "overlong";
  EXPECT_EQ(cleanText("\xED\xA0\x80"), replaced + replaced + replaced) << "a surrogate";
  EXPECT_EQ(cleanText("\xF4\x90\x80\x80"), replaced + replaced + replaced + replaced) << "beyond U+10FFFF";
  EXPECT_EQ(cleanText("\xF4\x8F\xBF\xBF"), "\xF4\x8F\xBF\xBF") << "U+10FFFF";
  EXPECT_EQ(cleanText("\xE2\x82z"), replaced + replaced + "z");
}

TEST(CleanText, ReplacesWhatNoXmlHolds) {
  EXPECT_EQ(cleanText("a\xEF\xBF\xBEz"), "a" + replaced + "z") << "U+FFFE";
  EXPECT_EQ(cleanText("\xEF\xBF\xBF"), replaced) << "U+FFFF";
  EXPECT_EQ(cleanText("\xEF\xBF\xBD\xEF\xBB\xBF"), "\xEF\xBF\xBD\xEF\xBB\xBF") << "U+FFFD and U+FEFF";
  EXPECT_EQ(cleanText("\xF0\x9F\xBF\xBF"), "\xF0\x9F\xBF\xBF") << "U+1FFFF";
}

TEST(CleanText, CleansOnceAndForAll) {
  std::mt19937 random(7);
  for (int i = 0; i < 20'000; ++i) {
    std::string text;
    for (std::size_t length = random() % 12; length > 0; --length) {
      text += static_cast<char>(random());
    }
    const std::string once = cleanText(text);
    ASSERT_EQ(cleanText(once), once);
  }
}

}  // namespace
}  // namespace agent
