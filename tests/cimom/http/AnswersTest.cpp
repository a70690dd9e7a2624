// What answers look like on the wire.
#include <gtest/gtest.h>

#include <atomic>

#include "TestServer.h"

namespace tests {
namespace {

class Answers : public testing::Test {
 protected:
  Log log_;
  Settings settings_ = loopback(log_);
};

TEST_F(Answers, ShortAnswerHasItsLength) {
  settings_.bounds.flush = std::chrono::hours(1);
  Server server(settings_, [](const Request&, Answer& answer) {
    beginText(answer, {{"X-Own", "yes"}, {"Ext", ""}});
    answer.write("one, ");
    answer.write("two");
  });
  HttpConnection client(server.port());
  const HttpAnswer answer = client.ask(httpRequest("GET", "/"));
  EXPECT_EQ(answer.status, 200);
  EXPECT_EQ(answer.version, "HTTP/1.1");
  EXPECT_EQ(answer.field("Content-Length"), "8");
  EXPECT_EQ(answer.field("X-Own"), "yes");
  EXPECT_EQ(answer.field("Ext"), "");  // there, and empty
  EXPECT_EQ(answer.body, "one, two");
  EXPECT_TRUE(answer.isComplete);
}

TEST_F(Answers, HandlerSeesTheRequest) {
  Request seen;
  Server server(settings_, [&](const Request& request, Answer& answer) {
    seen = request;
    beginText(answer);
  });
  HttpConnection client(server.port());
  const HttpAnswer answer = client.ask(
      httpRequest("M-POST", "/cimom%20x?a=b&c", {{"CIMOperation", "MethodCall"}, {"Empty", ""}}, "body"));
  EXPECT_EQ(answer.field("Content-Length"), "0");
  EXPECT_EQ(seen.method, "M-POST");
  EXPECT_EQ(seen.target, "/cimom%20x?a=b&c");
  EXPECT_EQ(seen.body, "body");
  ASSERT_NE(seen.field("cimoperation"), nullptr);
  EXPECT_EQ(*seen.field("cimoperation"), "MethodCall");
  ASSERT_NE(seen.field("Empty"), nullptr);
  EXPECT_EQ(*seen.field("Empty"), "");
  EXPECT_EQ(seen.field("Absent"), nullptr);
  EXPECT_EQ(seen.user, "");
  EXPECT_TRUE(seen.peer.starts_with("127.0.0.1:")) << seen.peer;
  EXPECT_FALSE(seen.isHttp10);
  EXPECT_FALSE(seen.takesTrailers);
}

TEST_F(Answers, BytesLeaveWhileTheHandlerWorks) {
  Signal received;
  Server server(settings_, [&](const Request&, Answer& answer) {
    beginText(answer);
    EXPECT_FALSE(answer.started());
    answer.write("first");
    EXPECT_TRUE(received.wait());
    EXPECT_TRUE(answer.started());
    answer.write("second");
  });
  HttpConnection client(server.port());
  client.send(httpRequest("GET", "/"));
  HttpAnswer answer = client.readHead();
  EXPECT_TRUE(answer.isChunked);
  EXPECT_EQ(client.readPart(answer), "first");
  received.set();
  EXPECT_EQ(client.readPart(answer), "second");
  EXPECT_EQ(client.readPart(answer), "");
  EXPECT_TRUE(answer.isComplete);
}

TEST_F(Answers, LongAnswerArrivesWholeInLargeChunks) {
  const std::string whole = pattern(10'000'000);
  Server server(settings_, [&](const Request&, Answer& answer) {
    beginText(answer);
    for (std::size_t at = 0; at < whole.size(); at += 4096) {
      ASSERT_TRUE(answer.write(std::string_view(whole).substr(at, 4096)));
    }
  });
  HttpConnection client(server.port());
  client.send(httpRequest("GET", "/"));
  HttpAnswer answer = client.readHead();
  std::size_t chunks = 0;
  while (!client.readPart(answer).empty()) {
    ++chunks;
  }
  EXPECT_TRUE(answer.isComplete);
  EXPECT_TRUE(answer.body == whole);
  EXPECT_LT(chunks, whole.size() / 16384);
}

TEST_F(Answers, OneLargeWriteArrivesWhole) {
  const std::string whole = pattern(3'000'000);
  Server server(settings_, [&](const Request&, Answer& answer) {
    beginText(answer);
    EXPECT_TRUE(answer.write(whole));
  });
  HttpConnection client(server.port());
  const HttpAnswer answer = client.ask(httpRequest("GET", "/"));
  EXPECT_TRUE(answer.isComplete);
  EXPECT_TRUE(answer.body == whole);
}

TEST_F(Answers, ConnectionIsKept) {
  Server server(settings_, echo);
  HttpConnection client(server.port());
  for (int round = 0; round < 20; ++round) {
    const std::string body = "round " + std::to_string(round);
    EXPECT_EQ(client.ask(httpRequest("POST", "/", {}, body)).body, body);
  }
}

TEST_F(Answers, PipelinedRequestsAreAnsweredInOrder) {
  Server server(settings_, echo);
  HttpConnection client(server.port());
  std::string requests;
  for (int round = 0; round < 10; ++round) {
    requests += httpRequest("POST", "/", {}, "body " + std::to_string(round));
  }
  client.send(requests);
  for (int round = 0; round < 10; ++round) {
    EXPECT_EQ(client.readAnswer().body, "body " + std::to_string(round));
  }
}

TEST_F(Answers, ClientMayEndTheConnection) {
  Server server(settings_, echo);
  HttpConnection client(server.port());
  EXPECT_EQ(client.ask(httpRequest("GET", "/x", {{"Connection", "close"}})).body, "GET /x");
  EXPECT_TRUE(client.isClosed());
}

TEST_F(Answers, HttpOneZeroGetsAWholeAnswer) {
  const std::string whole = pattern(700'000);
  Server server(settings_, [&](const Request& request, Answer& answer) {
    EXPECT_TRUE(request.isHttp10);
    beginText(answer, {{"Trailer", "X-Why"}});
    EXPECT_TRUE(answer.write(whole));
    EXPECT_FALSE(answer.started());
  });
  HttpConnection client(server.port());
  const HttpAnswer answer = client.ask(httpRequest("GET", "/", {{"TE", "trailers"}}, "", "HTTP/1.0"));
  EXPECT_EQ(answer.field("Content-Length"), std::to_string(whole.size()));
  EXPECT_FALSE(answer.field("Trailer"));
  EXPECT_TRUE(answer.body == whole);
  EXPECT_TRUE(client.isClosed());
}

TEST_F(Answers, HttpOneZeroIsRefusedWhatIsTooLarge) {
  settings_.bounds.wholeAnswer = 100'000;
  std::atomic<bool> wentOn = true;
  Server server(settings_, [&](const Request&, Answer& answer) {
    beginText(answer);
    for (int piece = 0; piece < 20 && wentOn; ++piece) {
      wentOn = answer.write(pattern(10'000));
    }
  });
  HttpConnection client(server.port());
  const HttpAnswer answer = client.ask(httpRequest("GET", "/", {}, "", "HTTP/1.0"));
  EXPECT_EQ(answer.status, 500);
  EXPECT_TRUE(answer.isComplete);
  EXPECT_NE(answer.body.find("HTTP/1.1"), std::string::npos) << answer.body;
  EXPECT_FALSE(wentOn);
  EXPECT_TRUE(log_.waitFor("would be too large"));
}

TEST_F(Answers, ToHttpOneZeroShareABound) {
  settings_.bounds.wholeAnswers = 100'000;
  Signal arrived;
  Signal go;
  Server server(settings_, [&](const Request& request, Answer& answer) {
    beginText(answer);
    answer.write(std::string(60'000, 'x'));
    if (request.target == "/first") {
      arrived.set();
      EXPECT_TRUE(go.wait());
    }
  });
  HttpConnection first(server.port());
  first.send(httpRequest("GET", "/first", {}, "", "HTTP/1.0"));
  ASSERT_TRUE(arrived.wait());
  EXPECT_EQ(HttpConnection(server.port()).ask(httpRequest("GET", "/", {}, "", "HTTP/1.0")).status, 500);
  go.set();
  EXPECT_EQ(first.readAnswer().body.size(), 60'000U);
  EXPECT_TRUE(eventually([&] {
    return HttpConnection(server.port()).ask(httpRequest("GET", "/", {}, "", "HTTP/1.0")).status == 200;
  }));
}

TEST_F(Answers, SmallestBoundsStillWork) {
  settings_.bounds.queue = 0;
  settings_.bounds.workers = 0;
  settings_.bounds.keptWorkers = 0;
  Server server(settings_, [](const Request&, Answer& answer) {
    beginText(answer);
    EXPECT_TRUE(answer.write(pattern(100'000)));
  });
  HttpConnection client(server.port());
  EXPECT_TRUE(client.ask(httpRequest("GET", "/")).body == pattern(100'000));
}

TEST_F(Answers, HeadHasNoBody) {
  settings_.bounds.flush = std::chrono::hours(1);
  Server server(settings_, echo);
  HttpConnection client(server.port());
  client.send(httpRequest("HEAD", "/") + httpRequest("GET", "/"));
  EXPECT_EQ(client.readAnswer(false).field("Content-Length"), "6");
  EXPECT_EQ(client.readAnswer().body, "GET /");
}

TEST_F(Answers, SeveralListenersAnswer) {
  settings_.listeners.push_back({"[::1]:0", false, -1});
  Server server(settings_, echo);
  ASSERT_EQ(server.addresses().size(), 2U);
  EXPECT_EQ(server.addresses()[0], "127.0.0.1:" + std::to_string(server.port(0)));
  EXPECT_EQ(server.addresses()[1], "[::1]:" + std::to_string(server.port(1)));
  HttpConnection four(server.port(0));
  HttpConnection six(server.port(1), true);
  EXPECT_EQ(four.ask(httpRequest("GET", "/4")).body, "GET /4");
  EXPECT_EQ(six.ask(httpRequest("GET", "/6")).body, "GET /6");
}

}  // namespace
}  // namespace tests
