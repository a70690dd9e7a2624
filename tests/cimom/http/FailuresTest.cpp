// Answers that cannot be completed.
#include <gtest/gtest.h>

#include <stdexcept>

#include "TestServer.h"

namespace tests {
namespace {

class Failures : public testing::Test {
 protected:
  Log log_;
  Settings settings_ = loopback(log_);
};

/// Fails once the client has the first bytes.
Handler failsLate(Signal& received) {
  return [&received](const Request&, Answer& answer) {
    beginText(answer, {{"Trailer", "X-Why"}});
    answer.write("some");
    EXPECT_TRUE(received.wait());
    EXPECT_TRUE(eventually([&] { return answer.started(); }));
    answer.fail({{"X-Why", "broken"}});
    EXPECT_FALSE(answer.write("more"));
  };
}

TEST_F(Failures, GoIntoTheTrailers) {
  Signal received;
  Server server(settings_, failsLate(received));
  HttpConnection client(server.port());
  client.send(httpRequest("GET", "/", {{"TE", "deflate;q=0.5, Trailers"}, {"Connection", "TE"}}));
  HttpAnswer answer = client.readHead();
  EXPECT_EQ(answer.field("Trailer"), "X-Why");
  EXPECT_EQ(client.readPart(answer), "some");
  received.set();
  EXPECT_EQ(client.readPart(answer), "");
  EXPECT_TRUE(answer.isComplete);
  EXPECT_EQ(answer.trailer("X-Why"), "broken");
}

TEST_F(Failures, EndTheConnectionWithoutTrailers) {
  Signal received;
  Server server(settings_, failsLate(received));
  HttpConnection client(server.port());
  client.send(httpRequest("GET", "/"));
  HttpAnswer answer = client.readHead();
  EXPECT_FALSE(answer.field("Trailer"));
  EXPECT_EQ(client.readPart(answer), "some");
  received.set();
  EXPECT_TRUE(client.isClosed());
}

TEST_F(Failures, KeepTheConnectionWithTrailers) {
  Signal received;
  Server server(settings_, failsLate(received));
  HttpConnection client(server.port());
  const std::string request = httpRequest("GET", "/", {{"TE", "trailers"}});
  client.send(request);
  HttpAnswer answer = client.readHead();
  EXPECT_EQ(client.readPart(answer), "some");
  received.set();
  EXPECT_EQ(client.readPart(answer), "");
  EXPECT_EQ(client.ask(request).trailer("X-Why"), "broken");
}

TEST_F(Failures, BeforeTheFirstByteTheAnswerBeginsAnew) {
  settings_.bounds.flush = std::chrono::hours(1);
  Server server(settings_, [](const Request&, Answer& answer) {
    beginText(answer);
    answer.write("some");
    answer.fail({{"X-Why", "broken"}});
    EXPECT_FALSE(answer.started());
    answer.begin(503, {{"X-Why", "busy"}});
    answer.write("later");
  });
  HttpConnection client(server.port());
  const HttpAnswer answer = client.ask(httpRequest("GET", "/"));
  EXPECT_EQ(answer.status, 503);
  EXPECT_EQ(answer.body, "later");
  EXPECT_EQ(answer.field("X-Why"), "busy");
}

TEST_F(Failures, HandlerThatSaysNothing) {
  Server server(settings_, [](const Request&, Answer&) {});
  HttpConnection client(server.port());
  EXPECT_EQ(client.ask(httpRequest("GET", "/")).status, 500);
  EXPECT_EQ(client.ask(httpRequest("GET", "/")).status, 500);
}

TEST_F(Failures, HandlerThatThrows) {
  settings_.bounds.flush = std::chrono::hours(1);
  Server server(settings_, [](const Request& request, Answer& answer) {
    if (request.target == "/other") {
      throw 1;
    }
    if (request.target == "/begun") {
      beginText(answer);
      answer.write("some");
    }
    throw std::runtime_error("the disk is gone");
  });
  HttpConnection client(server.port());
  const HttpAnswer answer = client.ask(httpRequest("GET", "/"));
  EXPECT_EQ(answer.status, 500);
  EXPECT_EQ(answer.body.find("disk"), std::string::npos) << "what failed inside is nobody's business outside";
  EXPECT_EQ(client.ask(httpRequest("GET", "/begun")).status, 500);
  EXPECT_EQ(client.ask(httpRequest("GET", "/other")).status, 500);
  EXPECT_TRUE(log_.waitFor("the disk is gone"));
}

TEST_F(Failures, HandlerThatThrowsLate) {
  Signal received;
  Server server(settings_, [&](const Request&, Answer& answer) {
    beginText(answer);
    answer.write("some");
    EXPECT_TRUE(received.wait());
    throw std::runtime_error("the disk is gone");
  });
  HttpConnection client(server.port());
  client.send(httpRequest("GET", "/"));
  HttpAnswer answer = client.readHead();
  EXPECT_EQ(client.readPart(answer), "some");
  received.set();
  EXPECT_TRUE(client.isClosed());
  EXPECT_TRUE(log_.waitFor("the disk is gone"));
}

TEST_F(Failures, FieldsThatHttpCannotCarryAreLeftOut) {
  Server server(settings_, [](const Request&, Answer& answer) {
    answer.begin(200, {{"X-Bad", "a\r\nX-Smuggled: yes"}, {"X-Good", "yes"}, {"Content-Length", "99"}});
    answer.write("text");
  });
  HttpConnection client(server.port());
  const HttpAnswer answer = client.ask(httpRequest("GET", "/"));
  EXPECT_FALSE(answer.field("X-Bad"));
  EXPECT_FALSE(answer.field("X-Smuggled"));
  EXPECT_EQ(answer.field("X-Good"), "yes");
  EXPECT_EQ(answer.body, "text");
  EXPECT_TRUE(log_.waitFor("was left out"));
}

}  // namespace
}  // namespace tests
