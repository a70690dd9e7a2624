// Texts from outside: addresses to listen at, credentials, names for the log.
#include <gtest/gtest.h>

#include <cimom/http/BasicLogin.h>
#include <cimom/http/ListenAddress.h>

#include <stdexcept>

namespace tests {
namespace {

using cimom::http::parseBasicLogin;
using cimom::http::parseListenAddress;
using cimom::http::printable;

TEST(ListenAddress, IsRead) {
  EXPECT_EQ(parseListenAddress("127.0.0.1:5988").text(), "127.0.0.1:5988");
  EXPECT_EQ(parseListenAddress("localhost:0").text(), "127.0.0.1:0");
  EXPECT_EQ(parseListenAddress("0.0.0.0:65535").text(), "0.0.0.0:65535");
  EXPECT_EQ(parseListenAddress("[::1]:5989").text(), "[::1]:5989");
  EXPECT_EQ(parseListenAddress("[2001:db8:0:0::1]:5989").text(), "[2001:db8::1]:5989");
  EXPECT_EQ(parseListenAddress("127.0.0.1:5988").port(), 5988);
}

TEST(ListenAddress, KnowsLoopback) {
  EXPECT_TRUE(parseListenAddress("127.0.0.1:1").isLoopback());
  EXPECT_TRUE(parseListenAddress("127.3.2.1:1").isLoopback());
  EXPECT_TRUE(parseListenAddress("[::1]:1").isLoopback());
  EXPECT_TRUE(parseListenAddress("[::ffff:127.0.0.1]:1").isLoopback());
  EXPECT_FALSE(parseListenAddress("0.0.0.0:1").isLoopback());
  EXPECT_FALSE(parseListenAddress("[::]:1").isLoopback());
  EXPECT_FALSE(parseListenAddress("[::ffff:128.0.0.1]:1").isLoopback());
  EXPECT_FALSE(parseListenAddress("192.0.2.1:1").isLoopback());
}

TEST(ListenAddress, TellsOriginsApart) {
  const auto origin = [](const char* text) { return parseListenAddress(text).origin(); };
  EXPECT_EQ(origin("192.0.2.1:1"), origin("192.0.2.1:2"));
  EXPECT_NE(origin("192.0.2.1:1"), origin("192.0.2.2:1"));
  EXPECT_EQ(origin("[::ffff:192.0.2.1]:1"), origin("192.0.2.1:1"));
  EXPECT_EQ(origin("[2001:db8::1]:1"), origin("[2001:db8::ffff:1]:1"));
  EXPECT_NE(origin("[2001:db8::1]:1"), origin("[2001:db8:0:1::1]:1"));
}

TEST(ListenAddress, OthersAreRefused) {
  for (const std::string text : {"",
                                 ":",
                                 "5988",
                                 "127.0.0.1",
                                 "127.0.0.1:",
                                 "127.0.0.1:65536",
                                 "127.0.0.1:-1",
                                 "127.0.0.1:59x",
                                 ":5988",
                                 "example.org:5988",
                                 "::1:5989",
                                 "[::1]",
                                 "[::1]5989",
                                 "[::1:5989",
                                 "[]:1",
                                 "[127.0.0.1]:1",
                                 "127.0.0.1 :1",
                                 "127.0.0.1: 1",
                                 "[::1%lo]:1",
                                 "127.1:1"}) {
    EXPECT_THROW((void)parseListenAddress(text), std::invalid_argument) << text;
  }
  EXPECT_THROW((void)parseListenAddress(std::string("127.0.0.1\0:1", 12)), std::invalid_argument);
}

TEST(BasicLogin, IsRead) {
  const auto login = parseBasicLogin("Basic QWxhZGRpbjpvcGVuIHNlc2FtZQ==");
  ASSERT_TRUE(login);
  EXPECT_EQ(login->user, "Aladdin");
  EXPECT_EQ(login->password, "open sesame");
  const auto colons = parseBasicLogin("  bASIC   YTpiOmM=  ");
  ASSERT_TRUE(colons);
  EXPECT_EQ(colons->user, "a");
  EXPECT_EQ(colons->password, "b:c");
  const auto empty = parseBasicLogin("Basic Og==");
  ASSERT_TRUE(empty);
  EXPECT_EQ(empty->user + empty->password, "");
}

TEST(BasicLogin, OthersAreNone) {
  for (const char* text : {"", "Basic", "Basic ", "BasicQTpi", "Bearer QTpi", "Basic QTpi!", "Basic QTp",
                           "Basic Q===", "Basic QUI=", "Basic QTpiYh==", "Basic QT pi",
                           "Basic AEE6Qg==", "Basic ====", "Digest username=\"x\"", "Basic QTpi QTpi"}) {
    EXPECT_FALSE(parseBasicLogin(text)) << text;
  }
}

TEST(Printable, MakesTextSafe) {
  EXPECT_EQ(printable("anna"), "anna");
  EXPECT_EQ(printable("a\nb\x1b\"\\\xC3"), "a\\x0ab\\x1b\\x22\\x5c\\xc3");
  EXPECT_EQ(printable(std::string(100, 'x')), std::string(60, 'x') + "...");
}

}  // namespace
}  // namespace tests
