#include <cimom/ProviderRegistration.h>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <random>
#include <string>
#include <string_view>

namespace {

using cimom::parseRegistrations;
using cimom::ProviderRegistration;
using cimom::RegistrationError;
using testing::ElementsAre;
using testing::HasSubstr;

constexpr std::string_view sample = R"(# comment
[A_One]
   provider: OneProvider
   location: OneLibrary
   type: instance association
   namespace: root/cimv2 /root/interop
; comment
[A_Two]
Provider:Two
LOCATION :Two
type:	association
namespace: root/cimv2
unload: never
)";

std::string complaint(std::string_view text) {
  try {
    static_cast<void>(parseRegistrations(text, "a.reg"));
  } catch (const RegistrationError& error) {
    return error.what();
  }
  return {};
}

TEST(ProviderRegistrations, areRead) {
  EXPECT_THAT(
      parseRegistrations(sample, "a.reg"),
      ElementsAre(
          ProviderRegistration{
              "A_One", "OneProvider", "OneLibrary", true, true, {"root/cimv2", "root/interop"}, "a.reg:2"},
          ProviderRegistration{"A_Two", "Two", "Two", false, true, {"root/cimv2"}, "a.reg:8"}));
  EXPECT_TRUE(parseRegistrations("", "a.reg").empty());
}

TEST(ProviderRegistrations, takeLinesOfOtherSystems) {
  EXPECT_EQ(
      parseRegistrations("[A]\r\nprovider: P\r\nlocation: L\r\ntype: instance\r\nnamespace: n\r\n", "a.reg")
          .front()
          .provider,
      "P");
}

TEST(ProviderRegistrations, sayWhetherAProviderKeepsWhatItHasReturned) {
  const std::string section = "[A]\nprovider: P\nlocation: L\ntype: instance\nnamespace: n\n";
  EXPECT_FALSE(parseRegistrations(section, "a.reg").front().keepsNothing);
  EXPECT_TRUE(parseRegistrations(section + "Keeps: Nothing\n", "a.reg").front().keepsNothing);
}

TEST(ProviderRegistrations, sayWhatIsWrongAndWhere) {
  EXPECT_EQ(complaint("provider: A"), "a.reg:1: 'provider:' stands before the first [CLASS]");
  EXPECT_EQ(complaint("\n[A"), "a.reg:2: expected the name of a class in brackets, got '[A'");
  EXPECT_EQ(complaint("[]"), "a.reg:1: expected the name of a class in brackets, got '[]'");
  EXPECT_EQ(complaint("[A]\nprovider P"), "a.reg:2: expected [CLASS] or 'name: value', got 'provider P'");
  EXPECT_EQ(complaint("[A]\nprovider:"), "a.reg:2: 'provider:' has no value");
  EXPECT_EQ(complaint("[A]\nprovider: P\nProvider: P"), "a.reg:3: 'provider:' is there twice in section [A]");
  EXPECT_EQ(complaint("[A]\ntype: method"),
            "a.reg:2: unknown type 'method'; known are instance, association");
  EXPECT_EQ(complaint("[A]\nlocation: ../lib"), "a.reg:2: 'location: ../lib' is no plain name");
  EXPECT_EQ(complaint("[A]\nlocation: ..x"), "a.reg:2: 'location: ..x' is no plain name");
  EXPECT_EQ(complaint("[A]\nwhat: ever"),
            "a.reg:2: unknown entry 'what:'; known are provider, location, type, namespace, keeps");
  EXPECT_EQ(complaint("[A]\nkeeps: all"),
            "a.reg:2: 'keeps: all' means nothing here; known is 'keeps: nothing'");
  EXPECT_EQ(complaint("\n[A]\nprovider: P\nlocation: L\ntype: instance\n"),
            "a.reg:2: section [A] lacks 'namespace:'");
  EXPECT_EQ(complaint(std::string(sample) + "[a_one]"),
            "a.reg:14: class a_one has a section already, at a.reg:2");
}

TEST(ProviderRegistrations, sayWhichFileCannotBeRead) {
  try {
    static_cast<void>(cimom::readRegistrations("/none/a.reg"));
    FAIL() << "a file that is not there was read";
  } catch (const RegistrationError& error) {
    EXPECT_THAT(error.what(), HasSubstr("/none/a.reg: cannot be read: No such file"));
  }
}

// Broken texts, the same in every run: each is read or is a RegistrationError.
TEST(ProviderRegistrations, surviveBrokenTexts) {
  std::mt19937 random(11);  // NOLINT(cert-msc32-c,cert-msc51-cpp): the same texts in every run
  for (int round = 0; round < 5000; ++round) {
    std::string text(sample);
    for (std::size_t change = 0; change < 1 + random() % 5; ++change)
      text[random() % text.size()] = static_cast<char>(random() % 256);
    const std::string message = complaint(text);
    EXPECT_TRUE(message.empty() || message.starts_with("a.reg:")) << message;
  }
}

}  // namespace
