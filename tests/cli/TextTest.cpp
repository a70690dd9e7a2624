#include <cli/Text.h>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace {

using cli::Charset;
using testing::ElementsAre;

TEST(Text, PrintableReplacesWhatCommandsATerminal) {
  EXPECT_EQ(cli::printable("plain text", Charset::Utf8), "plain text");
  EXPECT_EQ(cli::printable("a\x1b[31mred", Charset::Utf8), "a\xEF\xBF\xBD[31mred");
  EXPECT_EQ(cli::printable("bell\a del\x7F", Charset::Utf8), "bell\xEF\xBF\xBD del\xEF\xBF\xBD");
  EXPECT_EQ(cli::printable("two\nlines\tand\rmore", Charset::Utf8), "two lines and more");
  EXPECT_EQ(cli::printable(std::string_view("nul\0in", 6), Charset::Ascii), "nul?in");
}

TEST(Text, PrintableReplacesC1ControlsAndDirectionMarks) {
  EXPECT_EQ(cli::printable("csi\xC2\x9B"
                           "31m",
                           Charset::Utf8),
            "csi\xEF\xBF\xBD"
            "31m");
  // U+202E, which turns what follows around. NOLINTNEXTLINE(misc-misleading-bidirectional): that is the test
  EXPECT_EQ(cli::printable("\xE2\x80\xAEgnp.exe", Charset::Utf8), "\xEF\xBF\xBDgnp.exe");
}

TEST(Text, PrintableReplacesEachByteThatIsNoUtf8) {
  EXPECT_EQ(cli::printable("a\xFF\xFEz", Charset::Ascii), "a??z");
  EXPECT_EQ(cli::printable("cut\xE2\x82", Charset::Ascii), "cut??");
  EXPECT_EQ(cli::printable("overlong\xC0\xAF", Charset::Ascii), "overlong??");
  EXPECT_EQ(cli::printable("surrogate\xED\xA0\x80", Charset::Ascii), "surrogate???");
  EXPECT_EQ(cli::printable("beyond\xF4\x90\x80\x80", Charset::Ascii), "beyond????");
}

TEST(Text, PrintableKeepsUtf8WhereItCanBeShown) {
  EXPECT_EQ(cli::printable("Möller ® 東京", Charset::Utf8), "Möller ® 東京");
  EXPECT_EQ(cli::printable("Möller ® 東京", Charset::Ascii), "M?ller ? ??");
}

TEST(Text, ValidUtf8KeepsControlsAndReplacesBadBytes) {
  EXPECT_EQ(cli::validUtf8("a\nb\x80"), "a\nb\xEF\xBF\xBD");
  EXPECT_EQ(cli::validUtf8("😀"), "😀");
}

TEST(Text, DisplayWidthCountsCells) {
  EXPECT_EQ(cli::displayWidth(""), 0U);
  EXPECT_EQ(cli::displayWidth("abc"), 3U);
  EXPECT_EQ(cli::displayWidth("Möller"), 6U);
  EXPECT_EQ(cli::displayWidth("東京"), 4U);
  EXPECT_EQ(cli::displayWidth("e\xCC\x81"), 1U);  // e with a combining accent
  EXPECT_EQ(cli::displayWidth("\xEF\xBF\xBD"), 1U);
}

TEST(Text, CutToWidthEndsInAnEllipsis) {
  EXPECT_EQ(cli::cutToWidth("abcdef", 6, Charset::Utf8), "abcdef");
  EXPECT_EQ(cli::cutToWidth("abcdefg", 6, Charset::Utf8), "abcde…");
  EXPECT_EQ(cli::cutToWidth("abcdefg", 6, Charset::Ascii), "abc...");
  EXPECT_EQ(cli::cutToWidth("abcd efg", 6, Charset::Utf8), "abcd…");
  EXPECT_EQ(cli::cutToWidth("abcdefg", 2, Charset::Ascii), "ab");
  EXPECT_EQ(cli::cutToWidth("abcdefg", 0, Charset::Utf8), "");
}

TEST(Text, CutToWidthNeverHalvesACharacter) {
  EXPECT_EQ(cli::cutToWidth("東京都庁", 6, Charset::Utf8), "東京…");
  EXPECT_EQ(cli::cutToWidth("東京都庁", 7, Charset::Utf8), "東京都…");
  EXPECT_EQ(cli::cutToWidth("ae\xCC\x81xyz", 3, Charset::Utf8), "ae\xCC\x81…");
}

TEST(Text, WrapBreaksAtBlanks) {
  EXPECT_THAT(cli::wrapToWidth("one two three", 8), ElementsAre("one two", "three"));
  EXPECT_THAT(cli::wrapToWidth("one two three", 7), ElementsAre("one two", "three"));
  EXPECT_THAT(cli::wrapToWidth("short", 10), ElementsAre("short"));
  EXPECT_THAT(cli::wrapToWidth("", 10), ElementsAre(""));
}

TEST(Text, WrapBreaksLongWordsWhereItMust) {
  EXPECT_THAT(cli::wrapToWidth("abcdefghij", 4), ElementsAre("abcd", "efgh", "ij"));
  EXPECT_THAT(cli::wrapToWidth("東京", 1), ElementsAre("東", "京"));
  EXPECT_THAT(cli::wrapToWidth("tail      ", 4), ElementsAre("tail"));
}

TEST(Text, NearestNameFindsSlipsAlone) {
  const std::vector<std::string> names{"InstanceID", "VersionString", "Name"};
  EXPECT_EQ(cli::nearestName("instanceid", names), "InstanceID");
  EXPECT_EQ(cli::nearestName("VersoinString", names), "VersionString");
  EXPECT_EQ(cli::nearestName("Temperature", names), std::nullopt);
  EXPECT_EQ(cli::nearestName("x", {}), std::nullopt);
  EXPECT_EQ(cli::nearestName(std::string(100000, 'x'), names), std::nullopt);
}

}  // namespace
