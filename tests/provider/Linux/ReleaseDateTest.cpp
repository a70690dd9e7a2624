// Scanning and formatting of dates against the C library's own scanf and printf.
#include <Linux/ReleaseDate.h>
#include <gtest/gtest.h>

#include <cstdio>
#include <cstdlib>
#include <random>
#include <string>

namespace {

using Oru::SoftwareInventoryProfileProvider::DateBuffer;
using Oru::SoftwareInventoryProfileProvider::formatDate;
using Oru::SoftwareInventoryProfileProvider::MonthDayYear;
using Oru::SoftwareInventoryProfileProvider::scanDate;

MonthDayYear scanByLibrary(const std::string& text) {
  MonthDayYear date;
  // NOLINTNEXTLINE(cert-err34-c): this is the behaviour under comparison
  static_cast<void>(std::sscanf(text.c_str(), "%02u/%02u/%04u", &date.month, &date.day, &date.year));
  return date;
}

std::string formatByLibrary(MonthDayYear date, long west) {
  char text[128];
  static_cast<void>(std::snprintf(text, sizeof(text), "%4u%02u%02u%02u%02u%02u.%06u%1c%03u", date.year,
                                  date.month, date.day, 0U, 0U, 0U, 0U, west < 0 ? '-' : '+',
                                  static_cast<unsigned int>(std::labs(west / 60))));
  return std::string(text).substr(0, 25);
}

std::string format(MonthDayYear date, long west) {
  DateBuffer buffer;
  buffer.fill('x');
  const std::size_t length = formatDate(date, west, buffer);
  EXPECT_EQ(buffer[length], '\0');
  return std::string(buffer.data(), length);
}

void compareScan(const std::string& text) {
  const MonthDayYear expected = scanByLibrary(text);
  const MonthDayYear date = scanDate(text);
  EXPECT_EQ(date.month, expected.month) << '"' << text << '"';
  EXPECT_EQ(date.day, expected.day) << '"' << text << '"';
  EXPECT_EQ(date.year, expected.year) << '"' << text << '"';
}

TEST(ReleaseDate, ExampleOfTheFormat) {
  EXPECT_EQ(format(scanDate("12/31/2010"), 0), "20101231000000.000000+000");
  EXPECT_EQ(format(scanDate("01/02/2024"), 18000), "20240102000000.000000+300");
  EXPECT_EQ(format(scanDate("01/02/2024"), -19800), "20240102000000.000000-330");
  EXPECT_EQ(format(scanDate(""), 0), "   00000000000.000000+000");
}

TEST(ReleaseDate, AYearAboveFourDigitsIsCutToTheBuffer) {
  EXPECT_EQ(format({12, 31, 12345}, 0), "123451231000000.000000+00");
  EXPECT_EQ(format({~0U, ~0U, ~0U}, 0).size(), 25U);
}

TEST(ReleaseDate, DatesInARowAreFormattedAsEachAlone) {
  Oru::SoftwareInventoryProfileProvider::DateFormatter formatter;
  for (const char* text : {"", "12/31/2010", "12/31/2010", "01/02/2024", ""}) {
    for (const long west : {0L, 18000L, 18000L, 0L}) {
      EXPECT_EQ(formatter.format(text, west), format(scanDate(text), west));
    }
  }
}

TEST(ReleaseDate, MinutesTruncateTowardZero) {
  EXPECT_EQ(format({1, 1, 2024}, 119), "20240101000000.000000+001");
  EXPECT_EQ(format({1, 1, 2024}, -119), "20240101000000.000000-001");
}

TEST(ReleaseDate, ScansTheCornersAsScanfDoes) {
  for (const char* text :
       {"",       "/",       "1",        "1/",         "1/2",   "1/2/",    "1/2/3",       " 1/ 2/ 3",
        "1 /2/3", "123/4/5", "12/345/6", "+1/-2/+3",   "-/1/2", "++1/2/3", "12/31/20105", "0x1/2/3",
        "1//2",   "a",       "1/a/2",    "\t1/\n2/\v3"}) {
    compareScan(text);
  }
  compareScan(std::string("1/2\0/3", 6));
}

TEST(ReleaseDate, ScansPlainDatesAndWhatIsOneCharacterOffAsScanfDoes) {
  const std::string digits = "0123456789";
  const std::string others = "0/9:+- \tx";
  std::mt19937 random(20260103);  // NOLINT(cert-msc32-c,cert-msc51-cpp): the same texts in every run
  for (int round = 0; round < 2000; ++round) {
    std::string plain = "00/00/0000";
    for (char& character : plain) {
      character = character == '/' ? '/' : digits[random() % digits.size()];
    }
    compareScan(plain);
    for (std::size_t at = 0; at < plain.size(); ++at) {
      std::string text = plain;
      text[at] = others[random() % others.size()];
      compareScan(text);
    }
    compareScan(plain + "0");
    compareScan(plain.substr(1));
    ASSERT_FALSE(testing::Test::HasFailure());
  }
}

TEST(ReleaseDate, ScansRandomTextsAsScanfDoes) {
  std::mt19937 random(20260102);  // NOLINT(cert-msc32-c,cert-msc51-cpp): the same texts in every run
  const std::string alphabet = "0123456789////+- \tx";
  for (int round = 0; round < 200000; ++round) {
    std::string text(random() % 14, ' ');
    for (char& character : text) {
      character = alphabet[random() % alphabet.size()];
    }
    compareScan(text);
    ASSERT_FALSE(testing::Test::HasFailure());
  }
}

TEST(ReleaseDate, FormatsRandomNumbersAsPrintfDoes) {
  std::mt19937 random(20260103);  // NOLINT(cert-msc32-c,cert-msc51-cpp): the same numbers in every run
  for (int round = 0; round < 50000; ++round) {
    const auto number = [&] { return static_cast<unsigned int>(random() >> (random() % 32)); };
    const MonthDayYear date{number(), number(), number()};
    const long west = static_cast<long>(random() % 172800) - 86400;
    ASSERT_EQ(format(date, west), formatByLibrary(date, west));
  }
}

}  // namespace
