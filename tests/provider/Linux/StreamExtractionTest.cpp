// The extraction helpers against the standard streams themselves, on random texts.
#include <Linux/StreamExtraction.h>
#include <gtest/gtest.h>

#include <locale>
#include <random>
#include <sstream>

namespace {

using Oru::SoftwareInventoryProfileProvider::StreamExtraction;

struct Extracted {
  std::uint64_t number = 0;
  char character = '\0';
  std::string word;
  bool failed = false;

  friend bool operator==(const Extracted&, const Extracted&) = default;
};

void PrintTo(const Extracted& extracted, std::ostream* stream) {  // NOLINT(readability-identifier-naming)
  *stream << extracted.number << " '" << extracted.character << "' \"" << extracted.word << "\""
          << (extracted.failed ? " failed" : "");
}

Extracted byStream(const std::string& text, bool hexadecimal) {
  std::istringstream stream(text);
  stream.imbue(std::locale::classic());
  stream >> (hexadecimal ? std::hex : std::dec);
  Extracted extracted;
  stream >> extracted.number >> extracted.character >> extracted.word;
  extracted.failed = stream.fail();
  return extracted;
}

Extracted byHelper(const std::string& text, bool hexadecimal) {
  StreamExtraction extraction(text);
  Extracted extracted;
  extracted.number = hexadecimal ? extraction.hexadecimal() : extraction.decimal();
  extracted.character = extraction.character();
  extracted.word = extraction.word();
  extracted.failed = extraction.failed();
  return extracted;
}

void compare(const std::string& text) {
  EXPECT_EQ(byHelper(text, false), byStream(text, false)) << "decimal: \"" << text << '"';
  EXPECT_EQ(byHelper(text, true), byStream(text, true)) << "hexadecimal: \"" << text << '"';
}

TEST(StreamExtraction, ReadsTheCornersAsStreamsDo) {
  for (const char* text : {"",
                           " ",
                           "0",
                           "1a",
                           "0x1a@b",
                           "0X1A",
                           "0x",
                           "0xg",
                           "00x1",
                           "0x0x1",
                           "-1",
                           "+1",
                           "-0",
                           "--1",
                           "+-1",
                           "-",
                           "- 1",
                           "-0x10",
                           "+0x",
                           "18446744073709551615@a",
                           "18446744073709551616@a",
                           "-18446744073709551615",
                           "-18446744073709551616",
                           "ffffffffffffffff x y",
                           "10000000000000000 x y",
                           "99999999999999999999999 @a",
                           "\t\n\v\f\r 12\t@\nword\vrest",
                           "12@",
                           "12 ",
                           "12",
                           "@a",
                           "1,234 x",
                           "1.5e3",
                           "0 0 0",
                           "\x80 12",
                           "1\x80@x"}) {
    compare(text);
  }
}

TEST(StreamExtraction, ReadsRandomTextsAsStreamsDo) {
  std::mt19937 random(20260101);  // NOLINT(cert-msc32-c,cert-msc51-cpp): the same texts in every run
  const std::string alphabet = "00112345678999abcdefABCDEFxX+-@@  \t\n.,gz";
  for (int round = 0; round < 200000; ++round) {
    std::string text(random() % 28, ' ');
    for (char& character : text) {
      character = alphabet[random() % alphabet.size()];
    }
    compare(text);
    ASSERT_FALSE(testing::Test::HasFailure());
  }
}

TEST(StreamExtraction, ReadsEveryByteAsStreamsDo) {
  for (int byte = 0; byte < 256; ++byte) {
    compare(std::string(1, static_cast<char>(byte)) + "7@" + std::string(1, static_cast<char>(byte)) + "w");
    compare("7" + std::string(1, static_cast<char>(byte)) + "@w");
  }
}

}  // namespace
