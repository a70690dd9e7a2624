// Logins by password, over HTTP.
#include <gtest/gtest.h>

#include <cimom/http/Passwords.h>

#include <chrono>
#include <utility>

#include "TestServer.h"

namespace tests {
namespace {

using namespace std::chrono_literals;
using cimom::http::setPassword;

class Logins : public testing::Test {
 protected:
  Logins() {
    settings_.passwordFile = folder_.path("passwords");
    setPassword(settings_.passwordFile, "anna", "s3cret: \xC3\xA4");
    settings_.bounds.loginDelay = 1ms;
    settings_.bounds.longestLoginDelay = 2ms;
  }

  static void tellUser(const Request& request, Answer& answer) {
    beginText(answer);
    answer.write(request.user + (request.field("Authorization") == nullptr ? "" : " and the password"));
  }

  [[nodiscard]] static std::string asking(std::string_view user, std::string_view password,
                                          std::string_view target = "/") {
    return httpRequest("GET", target, {basicLogin(user, password)});
  }

  Folder folder_;
  Log log_;
  Settings settings_ = loopback(log_);
};

TEST_F(Logins, AreNeeded) {
  Server server(settings_, tellUser);
  HttpConnection client(server.port());
  const HttpAnswer answer = client.ask(httpRequest("POST", "/", {}, "body"));
  EXPECT_EQ(answer.status, 401);
  EXPECT_EQ(answer.field("WWW-Authenticate"), "Basic realm=\"WBEM\"");
  // The body was read: the client asks again on the same connection.
  EXPECT_EQ(client.ask(asking("anna", "s3cret: \xC3\xA4")).body, "anna");
}

TEST_F(Logins, AreNeededBeforeTheBody) {
  Server server(settings_, tellUser);
  HttpConnection client(server.port());
  client.send("POST / HTTP/1.1\r\nHost: x\r\nContent-Length: 4\r\nExpect: 100-continue\r\n\r\n");
  EXPECT_EQ(client.readAnswer().status, 401);
}

TEST_F(Logins, FailWithWrongOnes) {
  Server server(settings_, tellUser);
  HttpConnection client(server.port());
  EXPECT_EQ(client.ask(asking("anna", "wrong")).status, 401);
  EXPECT_EQ(client.ask(asking("berta\n\"", "s3cret: \xC3\xA4")).status, 401);
  EXPECT_EQ(client.ask(asking("", "")).status, 401);
  EXPECT_EQ(client.ask(httpRequest("GET", "/", {{"Authorization", "Basic !!!"}})).status, 401);
  EXPECT_EQ(client.ask(httpRequest("GET", "/", {{"Authorization", "Bearer abc"}})).status, 401);
  EXPECT_TRUE(log_.waitFor("login of \"anna\" failed"));
  EXPECT_TRUE(log_.waitFor("login of \"berta\\x0a\\x22\" failed"));
  EXPECT_EQ(log_.text().find("s3cret"), std::string::npos);
  EXPECT_EQ(client.ask(asking("anna", "s3cret: \xC3\xA4")).status, 200);
}

TEST_F(Logins, AreNotNeededForOpenTargets) {
  Server server(settings_, tellUser);
  HttpConnection client(server.port());
  EXPECT_EQ(client.ask(httpRequest("GET", "/healthz")).status, 200);
  EXPECT_EQ(client.ask(httpRequest("GET", "/healthz?full")).status, 200);
  EXPECT_EQ(client.ask(httpRequest("GET", "/healthzz")).status, 401);
  EXPECT_EQ(client.ask(httpRequest("POST", "/healthz", {}, "x")).status, 401);
  EXPECT_EQ(client.ask(asking("anna", "wrong", "/healthz")).status, 200) << "a login that nobody asked for";
}

TEST_F(Logins, AreForgottenAfterAWhile) {
  settings_.bounds.rememberedLogin = 1ms;
  settings_.bounds.loginDelay = 200ms;
  settings_.bounds.longestLoginDelay = 60s;
  Server server(settings_, tellUser);
  HttpConnection client(server.port());
  EXPECT_EQ(client.ask(asking("anna", "s3cret: \xC3\xA4")).status, 200);
  EXPECT_EQ(client.ask(asking("anna", "1")).status, 401);
  const auto start = std::chrono::steady_clock::now();
  EXPECT_EQ(client.ask(asking("anna", "s3cret: \xC3\xA4")).status, 200);
  EXPECT_GE(std::chrono::steady_clock::now() - start, 150ms) << "it did not wait for its turn";
}

TEST_F(Logins, AreForgottenWhenTheFileIsReadAgain) {
  Server server(settings_, tellUser);
  HttpConnection client(server.port());
  EXPECT_EQ(client.ask(asking("anna", "s3cret: \xC3\xA4")).status, 200);
  setPassword(settings_.passwordFile, "anna", "other");
  EXPECT_EQ(client.ask(asking("anna", "s3cret: \xC3\xA4")).status, 200)
      << "nobody said that the file changed";
  EXPECT_TRUE(server.reload().empty());
  EXPECT_EQ(client.ask(asking("anna", "s3cret: \xC3\xA4")).status, 401);
  EXPECT_EQ(client.ask(asking("anna", "other")).status, 200);
}

TEST_F(Logins, KeepTheOldFileWhereTheNewIsBroken) {
  Server server(settings_, tellUser);
  HttpConnection client(server.port());
  folder_.write("passwords", "anna\n");
  const auto broken = server.reload();
  ASSERT_EQ(broken.size(), 1U);
  EXPECT_NE(broken[0].find("passwords:1: "), std::string::npos) << broken[0];
  EXPECT_TRUE(log_.waitFor("the old stays in use: "));
  EXPECT_EQ(client.ask(asking("anna", "s3cret: \xC3\xA4")).status, 200);
}

TEST_F(Logins, AreSlowedAfterFailures) {
  settings_.bounds.loginDelay = 200ms;
  settings_.bounds.longestLoginDelay = 60s;
  Server server(settings_, tellUser);
  HttpConnection client(server.port());
  HttpConnection open(server.port());
  const auto start = std::chrono::steady_clock::now();
  EXPECT_EQ(client.ask(asking("anna", "1")).status, 401);
  EXPECT_EQ(client.ask(asking("anna", "2")).status, 401);
  client.send(asking("anna", "3"));
  // Neither a sending thread nor a worker waits with it.
  EXPECT_EQ(open.ask(httpRequest("GET", "/healthz")).status, 200);
  EXPECT_EQ(client.readAnswer().status, 401);
  // One delay before the second, two before the third.
  EXPECT_GE(std::chrono::steady_clock::now() - start, 600ms);
}

TEST_F(Logins, ThatWouldWaitTooLongAreRefused) {
  settings_.bounds.loginDelay = 3s;
  settings_.bounds.longestLoginDelay = 3s;
  Server server(settings_, tellUser);
  HttpConnection client(server.port());
  EXPECT_EQ(client.ask(asking("anna", "1")).status, 401);
  // One of the two waits for its turn; the other would wait twice as long.
  HttpConnection other(server.port());
  client.send(asking("anna", "2"));
  other.send(asking("anna", "3"));
  HttpAnswer first = client.readAnswer();
  HttpAnswer second = other.readAnswer();
  if (first.status != 429) {
    std::swap(first, second);
  }
  EXPECT_EQ(first.status, 429);
  EXPECT_EQ(first.field("Retry-After"), "3");
  EXPECT_EQ(second.status, 401);
  EXPECT_TRUE(log_.waitFor("too many logins wait"));
}

TEST_F(Logins, ThatWaitAreCutAtTheEnd) {
  settings_.bounds.loginDelay = 1h;
  settings_.bounds.longestLoginDelay = 2h;
  Server server(settings_, tellUser);
  HttpConnection client(server.port());
  EXPECT_EQ(client.ask(asking("anna", "1")).status, 401);
  client.send(asking("anna", "2"));
  EXPECT_TRUE(eventually([&] { return server.requestsUnderWay() == 1; }));
  EXPECT_FALSE(server.stop(10ms));
  EXPECT_TRUE(client.isClosed());
}

TEST_F(Logins, ThatAreRememberedDoNotWait) {
  settings_.bounds.loginDelay = 1h;
  settings_.bounds.longestLoginDelay = 2h;
  Server server(settings_, tellUser);
  HttpConnection client(server.port());
  EXPECT_EQ(client.ask(asking("anna", "s3cret: \xC3\xA4")).status, 200);
  EXPECT_EQ(client.ask(asking("anna", "1")).status, 401);
  EXPECT_EQ(client.ask(asking("anna", "s3cret: \xC3\xA4")).status, 200);
}

TEST_F(Logins, FileThatOthersReadIsRefused) {
  folder_.write("passwords", "", 0644);
  try {
    const Server server(settings_, tellUser);
    FAIL() << "it started";
  } catch (const std::runtime_error& error) {
    EXPECT_NE(std::string(error.what()).find("chmod 0640"), std::string::npos) << error.what();
  }
}

}  // namespace
}  // namespace tests
