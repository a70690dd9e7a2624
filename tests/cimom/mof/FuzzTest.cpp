// Broken texts, the same in every run: each compiles or is a MofError with a line, and nothing else happens.
#include "Compiled.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cstddef>
#include <random>
#include <string>
#include <string_view>

namespace {

constexpr std::string_view sample = R"(
#pragma locale ("en_US")
[Abstract, Version ("2.1"), Description ("a \"text\"" " of two \x20AC")]
class A { [Key] string Name = "x"; sint16 Numbers[3] = {1, -0x2, 011b}; real64 R = -1.5e3; char16 C = '\''; };
/* between */ class B : A { [Override("Name"), Values {"a", "b"}] string Name; A REF Other;
  [Description("go")] uint32 Go([Key(false)] uint16 How, A REF To, string Names[]); boolean F = true; };
qualifier New : uint8[] = {1, 2}, Scope(any), Flavor(Restricted);
instance of B as $One { Name = "one"; Other = $One; Numbers = {}; R = NULL; };  // end
)";

/// Compiles it; true where it was accepted.
bool survives(std::string_view text) {
  try {
    mof_test::compiled(text);
    return true;
  } catch (const cimom::MofError& error) {
    const auto lines = std::count(text.begin(), text.end(), '\n') + 1;
    EXPECT_GE(error.line(), 1) << error.what();
    EXPECT_LE(error.line(), lines) << error.what();
    return false;
  }
}

TEST(MofFuzz, theSampleCompiles) {
  EXPECT_EQ(mof_test::complaint(sample), "");
}

TEST(MofFuzz, everyPrefix) {
  std::size_t refused = 0;
  for (std::size_t size = 0; size < sample.size(); ++size)
    refused += survives(sample.substr(0, size)) ? 0U : 1U;
  EXPECT_GT(refused, sample.size() / 2);
}

TEST(MofFuzz, bytesChangedRemovedAndDoubled) {
  std::mt19937 random(20260101);  // NOLINT(cert-msc32-c,cert-msc51-cpp): the same texts in every run
  constexpr std::string_view favourites = "\"'\\{}[]();:,=#$/*+-.0b\n\xC3\xEF\xFF";
  for (int round = 0; round < 5000; ++round) {
    std::string text(sample);
    const auto changes = 1 + random() % 4;
    for (std::size_t change = 0; change < changes; ++change) {
      const std::size_t position = random() % text.size();
      switch (random() % 4) {
        case 0:
          text[position] = static_cast<char>(random() % 256);
          break;
        case 1:
          text[position] = favourites[random() % favourites.size()];
          break;
        case 2:
          text.erase(position, 1 + random() % 8);
          break;
        default:
          text.insert(position, text.substr(position, random() % 64));
      }
    }
    survives(text);
  }
}

TEST(MofFuzz, tokensInAnyOrder) {
  constexpr std::string_view tokens[] = {
      "class",    "A",  "B",      ":",   "{",     "}",         ";",     "[",   "]",       "(",       ")",
      ",",        "=",  "string", "Key", "uint8", "REF",       "1",     "-2",  "\"x\"",   "'c'",     "true",
      "instance", "of", "$x",     "as",  "NULL",  "qualifier", "scope", "any", "#pragma", "include", "1.5"};
  std::mt19937 random(7);  // NOLINT(cert-msc32-c,cert-msc51-cpp): the same texts in every run
  for (int round = 0; round < 5000; ++round) {
    std::string text;
    const auto count = random() % 30;
    for (std::size_t index = 0; index < count; ++index)
      text.append(tokens[random() % std::size(tokens)]).append(1, ' ');
    survives(text);
  }
}

}  // namespace
