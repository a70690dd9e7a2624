// The message buffer: texts and streamed values, in the order in which they came.
#include <ZelLog/ZelMessageBuffer.h>
#include <gtest/gtest.h>

#include <iomanip>
#include <iostream>
#include <sstream>
#include <string>

namespace {

using ZelLog::str;
using ZelLog::ZelMessageBuffer;

TEST(ZelMessageBuffer, aFreshBufferIsEmpty) {
  ZelMessageBuffer buffer;
  EXPECT_EQ(str(buffer), "");
}

TEST(ZelMessageBuffer, textsAreAppended) {
  ZelMessageBuffer buffer;
  buffer << "one " << std::string("two ") << ""
         << "three";
  EXPECT_EQ(str(buffer), "one two three");
  EXPECT_EQ(str(buffer), "one two three");
  buffer << ", four";
  EXPECT_EQ(str(buffer), "one two three, four");
}

TEST(ZelMessageBuffer, aNullTextPrintsAsTheCLibraryPrintsIt) {
  ZelMessageBuffer buffer;
  const char* none = nullptr;
  buffer << "<" << none << ">";
  EXPECT_EQ(str(buffer), "<(null)>");
}

TEST(ZelMessageBuffer, textsMayHoldAnyCharacter) {
  ZelMessageBuffer buffer;
  const std::string text("a\0b\n", 4);
  buffer << text;
  EXPECT_EQ(str(buffer), text);
}

TEST(ZelMessageBuffer, isAStream) {
  ZelMessageBuffer buffer;
  buffer << "n=";
  std::ostream& stream = buffer;
  stream << 42 << ' ' << std::hex << 255;
  buffer << " end";
  EXPECT_EQ(str(buffer), "n=42 ff end");
  EXPECT_EQ(str(stream), "n=42 ff end");
}

TEST(ZelMessageBuffer, textsAreFreeOfTheStreamsFormatAndErrors) {
  ZelMessageBuffer buffer;
  std::ostream& stream = buffer;
  stream << std::setw(5) << std::setfill('*');
  buffer << "a" << std::string("b");
  stream.setstate(std::ios::failbit);
  buffer << "c";
  EXPECT_EQ(str(buffer), "abc");
}

TEST(ZelMessageBuffer, textOfAnyStringStream) {
  std::ostringstream output;
  output << "out " << 1;
  EXPECT_EQ(str(static_cast<std::ostream&>(output)), "out 1");
  std::stringstream both("in");
  EXPECT_EQ(str(static_cast<std::ostream&>(both)), "in");
}

TEST(ZelMessageBuffer, otherStreamsHaveNoText) {
  std::ostream nowhere(nullptr);
  EXPECT_EQ(str(nowhere), "");
  EXPECT_EQ(str(std::cout), "");
}

}  // namespace
