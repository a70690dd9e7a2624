#include <Linux/Digits.h>
#include <gtest/gtest.h>

#include <charconv>
#include <random>
#include <sstream>
#include <string>

namespace {

using Oru::SoftwareInventoryProfileProvider::DecimalText;
using Oru::SoftwareInventoryProfileProvider::numberOfHexadecimalDigits;

std::string inBase(std::uint64_t number, int base) {
  char digits[64];
  return {digits, std::to_chars(digits, digits + sizeof(digits), number, base).ptr};
}

/// Numbers of every length, as many of each.
template <typename Use>
void forNumbersOfAllLengths(Use use) {
  std::mt19937_64 random(20);
  for (unsigned int shift = 0; shift < 64; ++shift) {
    for (int i = 0; i < 500; ++i) {
      use(random() >> shift);
    }
  }
  for (std::uint64_t power = 1;; power *= 10) {
    use(power - 1);
    use(power);
    if (power > ~std::uint64_t{0} / 10) {
      break;
    }
  }
  use(~std::uint64_t{0});
}

TEST(Digits, DecimalTextIsTheStandardLibrarys) {
  forNumbersOfAllLengths(
      [](std::uint64_t number) { ASSERT_EQ(DecimalText(number).view(), std::to_string(number)); });
}

TEST(Digits, DecimalTextHasACharacterBehindItsDigits) {
  DecimalText text(0);
  forNumbersOfAllLengths([&text](std::uint64_t number) {
    ASSERT_EQ(DecimalText(number, '@').view(), std::to_string(number) + "@");
    text.set(number, '@');
    ASSERT_EQ(text.view(), std::to_string(number) + "@") << "whatever it was before";
  });
  EXPECT_EQ(DecimalText(0, '@').view(), "0@");
}

TEST(Digits, EveryNumberBelow100000HasItsDecimalText) {
  for (std::uint64_t number = 0; number < 100000; ++number) {
    ASSERT_EQ(DecimalText(number).view(), std::to_string(number));
    ASSERT_EQ(DecimalText(number * 100000).view(), std::to_string(number * 100000));
  }
}

TEST(Digits, HexadecimalDigitsAreReadAsAStreamReadsThem) {
  forNumbersOfAllLengths([](std::uint64_t number) {
    std::string text = inBase(number, 16);
    std::istringstream stream(text);
    std::uint64_t read = 0;
    stream >> std::hex >> read;
    ASSERT_EQ(numberOfHexadecimalDigits(text), read) << text;
    for (char& character : text) {
      character = static_cast<char>(std::toupper(character));
    }
    ASSERT_EQ(numberOfHexadecimalDigits(text), read) << text;
  });
}

TEST(Digits, LeadingZerosCountAsDigits) {
  EXPECT_EQ(numberOfHexadecimalDigits("000000000000001a"), 0x1aU);
  EXPECT_EQ(numberOfHexadecimalDigits("00000000"), 0U);
  EXPECT_EQ(numberOfHexadecimalDigits("0"), 0U);
  EXPECT_EQ(numberOfHexadecimalDigits("001a"), 0x1aU);
}

TEST(Digits, AnyOtherCharacterAnywhereMakesItAnotherText) {
  for (const std::string good : {"1", "1234567", "12345678", "123456789abcdef", "123456789ABCDEF0"}) {
    for (std::size_t at = 0; at < good.size(); ++at) {
      for (int character = -128; character < 128; ++character) {
        std::string text = good;
        text[at] = static_cast<char>(character);
        EXPECT_EQ(numberOfHexadecimalDigits(text).has_value(),
                  std::string_view("0123456789abcdefABCDEF").find(text[at]) != std::string_view::npos)
            << text;
      }
    }
  }
}

TEST(Digits, OtherLengthsAreOtherTexts) {
  EXPECT_FALSE(numberOfHexadecimalDigits(""));
  EXPECT_FALSE(numberOfHexadecimalDigits("123456789abcdef01"));
}

}  // namespace
