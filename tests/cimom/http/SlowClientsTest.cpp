// Clients that read slowly or not at all.
#include <gtest/gtest.h>

#include <atomic>
#include <thread>

#include "TestServer.h"

namespace tests {
namespace {

constexpr int smallBuffer = 4096;

class SlowClients : public testing::Test {
 protected:
  /// Writes without end, until nothing more is taken.
  void handle(const Request& request, Answer& answer) {
    if (request.target == "/short") {
      echo(request, answer);
      return;
    }
    const std::string piece = pattern(16384);
    beginText(answer);
    ++writing_;
    while (answer.write(piece)) {
      written_ += piece.size();
    }
    ++cut_;
  }

  Handler handler() {
    return [this](const Request& request, Answer& answer) { handle(request, answer); };
  }

  /// Whether nothing was written for a while.
  bool writingStopped() {
    std::size_t before = 0;
    return eventually([&] {
      const std::size_t now = written_;
      const bool same = now == before && now > 0;
      before = now;
      std::this_thread::sleep_for(std::chrono::milliseconds(100));
      return same;
    });
  }

  Log log_;
  Settings settings_ = loopback(log_);
  std::atomic<int> writing_ = 0;
  std::atomic<int> cut_ = 0;
  std::atomic<std::size_t> written_ = 0;
};

TEST_F(SlowClients, HoldTheHandlerBack) {
  settings_.bounds.queue = 65536;
  Server server(settings_, handler());
  HttpConnection client(server.port(), false, smallBuffer);
  client.send(httpRequest("GET", "/"));
  ASSERT_TRUE(writingStopped());
  // What the queue and the kernel hold, and no more.
  EXPECT_LT(written_, 20'000'000U);
  const std::size_t before = written_;
  while (written_ == before) {
    ASSERT_FALSE(client.receive().empty());
  }
  EXPECT_EQ(cut_, 0);
}

TEST_F(SlowClients, AreCutByTime) {
  settings_.bounds.stall = std::chrono::milliseconds(300);
  Server server(settings_, handler());
  HttpConnection client(server.port(), false, smallBuffer);
  client.send(httpRequest("GET", "/"));
  EXPECT_TRUE(eventually([&] { return cut_ == 1; }));
  EXPECT_TRUE(log_.waitFor("took nothing of its answer for 300 ms"));
  EXPECT_TRUE(eventually([&] { return server.requestsUnderWay() == 0; }));
}

TEST_F(SlowClients, AreCutAfterTheHandlerHasReturned) {
  settings_.bounds.stall = std::chrono::milliseconds(300);
  settings_.bounds.queue = 16'000'000;
  std::atomic<bool> returned = false;
  Server server(settings_, [&](const Request&, Answer& answer) {
    beginText(answer);
    answer.write(std::string(8'000'000, 'x'));
    returned = true;
  });
  HttpConnection client(server.port(), false, smallBuffer);
  client.send(httpRequest("GET", "/"));
  EXPECT_TRUE(log_.waitFor("took nothing of its answer for 300 ms"));
  EXPECT_TRUE(returned);
  EXPECT_TRUE(eventually([&] { return server.requestsUnderWay() == 0; }));
}

TEST_F(SlowClients, DoNotUseUpTheWorkers) {
  constexpr int stalled = 12;
  settings_.bounds.workers = 2;
  settings_.bounds.keptWorkers = 1;
  Server server(settings_, handler());
  std::vector<HttpConnection> clients;
  for (int next = 0; next < stalled; ++next) {
    clients.emplace_back(server.port(), false, smallBuffer).send(httpRequest("GET", "/"));
  }
  EXPECT_TRUE(eventually([&] { return writing_ == stalled; })) << writing_;
  HttpConnection other(server.port());
  EXPECT_EQ(other.ask(httpRequest("GET", "/short")).body, "GET /short");
  EXPECT_EQ(cut_, 0);
}

TEST_F(SlowClients, ThatGoAwayAreNoticed) {
  Server server(settings_, handler());
  {
    HttpConnection client(server.port(), false, smallBuffer);
    client.send(httpRequest("GET", "/"));
    ASSERT_TRUE(eventually([&] { return writing_ == 1; }));
  }
  EXPECT_TRUE(eventually([&] { return cut_ == 1; }));
}

TEST_F(SlowClients, ThatReadSlowlyGetEverything) {
  settings_.bounds.stall = std::chrono::seconds(20);
  settings_.bounds.queue = 20'000;
  const std::string whole = pattern(3'000'000);
  Server server(settings_, [&](const Request&, Answer& answer) {
    beginText(answer);
    EXPECT_TRUE(answer.write(whole));
  });
  HttpConnection client(server.port(), false, smallBuffer);
  client.send(httpRequest("GET", "/"));
  HttpAnswer answer = client.readHead();
  std::this_thread::sleep_for(std::chrono::milliseconds(300));
  for (int part = 0; !client.readPart(answer).empty(); ++part) {
    if (part % 32 == 0) {
      std::this_thread::sleep_for(std::chrono::milliseconds(5));
    }
  }
  EXPECT_TRUE(answer.isComplete);
  EXPECT_TRUE(answer.body == whole);
}

}  // namespace
}  // namespace tests
