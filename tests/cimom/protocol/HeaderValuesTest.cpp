#include <cimom/protocol/HeaderValues.h>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <random>

namespace {

using cimom::protocol::accepts;
using cimom::protocol::elementsOf;
using cimom::protocol::HeaderElement;
using testing::ElementsAre;
using testing::IsEmpty;
using testing::Pair;
using testing::SizeIs;

TEST(HeaderValues, areListsWithParameters) {
  const std::vector<HeaderElement> elements =
      elementsOf("text/xml; q=0.5;charset=\"utf-8\" , ,\"a, b; c\"; ns = 7");
  ASSERT_THAT(elements, SizeIs(2));
  EXPECT_EQ(elements[0].value, "text/xml");
  EXPECT_THAT(elements[0].parameters, ElementsAre(Pair("q", "0.5"), Pair("charset", "utf-8")));
  EXPECT_EQ(elements[0].parameter("CHARSET"), "utf-8");
  EXPECT_EQ(elements[0].parameter("none"), "");
  EXPECT_EQ(elements[1].value, "a, b; c");
  EXPECT_EQ(elements[1].parameter("ns"), "7");
  EXPECT_THAT(elementsOf(""), IsEmpty());
  EXPECT_THAT(elementsOf(" , ;,"), IsEmpty());
}

TEST(HeaderValues, mayBeBroken) {
  EXPECT_THAT(elementsOf("\""), ElementsAre(testing::Field(&HeaderElement::value, "\"")));
  EXPECT_THAT(elementsOf("\"a, b"), ElementsAre(testing::Field(&HeaderElement::value, "\"a, b")));
  EXPECT_THAT(elementsOf("\"a\\"), SizeIs(1));
  EXPECT_THAT(elementsOf(R"("a\"b")"), ElementsAre(testing::Field(&HeaderElement::value, "a\"b")));
  EXPECT_EQ(elementsOf("a;=;b=;c").front().parameters.size(), 3U);
}

TEST(HeaderValues, mayBeAnything) {
  std::mt19937 random(7);  // NOLINT(cert-msc32-c,cert-msc51-cpp): the same bytes each time
  constexpr std::string_view pieces = "\",;=\\ \tq*/.0ax";
  for (int round = 0; round < 20000; ++round) {
    std::string text;
    for (std::size_t length = random() % 24; length > 0; --length)
      text += pieces[random() % pieces.size()];
    const std::vector<HeaderElement> elements = elementsOf(text);
    for (const HeaderElement& each : elements)
      EXPECT_FALSE(each.value.empty());
    if (accepts(elements, "text/xml")) {
      EXPECT_FALSE(elements.empty());
    }
  }
}

TEST(HeaderValues, acceptByTheClosestMatch) {
  const auto takes = [](std::string_view header) { return accepts(elementsOf(header), "text/xml"); };
  EXPECT_TRUE(takes("TEXT/xml"));
  EXPECT_TRUE(takes("text/*"));
  EXPECT_TRUE(takes("*/*;q=0.001"));
  EXPECT_FALSE(takes("*/*, text/*;q=0"));
  EXPECT_FALSE(takes("text/*, text/xml;q=0.000"));
  EXPECT_TRUE(takes("text/xml, */*;q=0"));
  EXPECT_FALSE(takes("text/xmlx, tex/*"));
  EXPECT_FALSE(takes(""));
}

}  // namespace
