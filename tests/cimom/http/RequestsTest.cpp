// Requests that are large, broken, slow or many.
#include <gtest/gtest.h>

#include <atomic>
#include <thread>

#include "TestServer.h"

namespace tests {
namespace {

class Requests : public testing::Test {
 protected:
  Log log_;
  Settings settings_ = loopback(log_);
};

TEST_F(Requests, MayWaitForContinue) {
  Server server(settings_, echo);
  HttpConnection client(server.port());
  client.send("POST / HTTP/1.1\r\nHost: x\r\nContent-Length: 4\r\nExpect: 100-continue\r\n\r\n");
  EXPECT_EQ(client.readAnswer().status, 100);
  client.send("body");
  EXPECT_EQ(client.readAnswer().body, "body");
}

TEST_F(Requests, ThatAreTooLargeAreNotContinued) {
  settings_.bounds.body = 1000;
  Server server(settings_, echo);
  HttpConnection client(server.port());
  client.send("POST / HTTP/1.1\r\nHost: x\r\nContent-Length: 1001\r\nExpect: 100-continue\r\n\r\n");
  EXPECT_EQ(client.readAnswer().status, 413);
  EXPECT_TRUE(client.isClosed());
}

TEST_F(Requests, WithBodiesUpToTheBoundAreServed) {
  settings_.bounds.body = 100'000;
  Server server(settings_, echo);
  HttpConnection client(server.port());
  const std::string most = pattern(100'000);
  EXPECT_TRUE(client.ask(httpRequest("POST", "/", {}, most)).body == most);
  EXPECT_EQ(client.ask(httpRequest("POST", "/", {}, pattern(100'001))).status, 413);
  // It was read to its end: the connection is still good.
  EXPECT_EQ(client.ask(httpRequest("POST", "/", {}, "body")).body, "body");
  EXPECT_TRUE(log_.waitFor("refused with 413"));
}

TEST_F(Requests, WithHugeBodiesAreRefusedAtOnce) {
  settings_.bounds.body = 1000;
  Server server(settings_, echo);
  HttpConnection client(server.port());
  client.send("POST / HTTP/1.1\r\nHost: x\r\nContent-Length: 99999999999999999999\r\n\r\n");
  EXPECT_EQ(client.readHead().status, 413);
  // libmicrohttpd says more than it announced here; it ends the connection in any case.
  EXPECT_TRUE(eventually([&] { return client.isClosed(); }));
  HttpConnection next(server.port());
  next.send("POST / HTTP/1.1\r\nHost: x\r\nContent-Length: 900000000\r\n\r\n");
  EXPECT_EQ(next.readAnswer().status, 413);
  EXPECT_TRUE(next.isClosed());
}

TEST_F(Requests, MayHaveChunkedBodies) {
  settings_.bounds.body = 1000;
  Server server(settings_, echo);
  HttpConnection client(server.port());
  const std::string head = "POST / HTTP/1.1\r\nHost: x\r\nTransfer-Encoding: chunked\r\n\r\n";
  EXPECT_EQ(client.ask(head + "4\r\nbody\r\n3\r\n, 2\r\n0\r\n\r\n").body, "body, 2");
  std::string large = head;
  for (int chunk = 0; chunk < 11; ++chunk) {
    large += "64\r\n" + pattern(100) + "\r\n";
  }
  EXPECT_EQ(client.ask(large + "0\r\n\r\n").status, 413);
  EXPECT_EQ(client.ask(head + "4\r\nbody\r\n0\r\n\r\n").body, "body");
}

TEST_F(Requests, WithEndlessBodiesAreCut) {
  settings_.bounds.body = 1000;
  Server server(settings_, echo);
  HttpConnection client(server.port());
  client.send("POST / HTTP/1.1\r\nHost: x\r\nTransfer-Encoding: chunked\r\n\r\n");
  const std::string chunk = "1000\r\n" + pattern(4096) + "\r\n";
  EXPECT_TRUE(eventually([&] { return !client.send(chunk); }));
}

TEST_F(Requests, ShareABoundOnTheirBodies) {
  settings_.bounds.body = 60'000;
  settings_.bounds.bodies = 100'000;
  Signal arrived;
  Signal go;
  Server server(settings_, [&](const Request& request, Answer& answer) {
    arrived.set();
    EXPECT_TRUE(request.target != "/first" || go.wait());
    echo(request, answer);
  });
  const std::string body = pattern(60'000);
  HttpConnection first(server.port());
  first.send(httpRequest("POST", "/first", {}, body));
  ASSERT_TRUE(arrived.wait());
  HttpConnection second(server.port());
  EXPECT_EQ(second.ask(httpRequest("POST", "/", {}, body)).status, 503);
  go.set();
  EXPECT_TRUE(first.readAnswer().body == body);
  EXPECT_EQ(second.ask(httpRequest("POST", "/", {}, body)).status, 200);
}

TEST_F(Requests, WithLargeHeadersAreRefused) {
  settings_.bounds.header = 4000;
  Server server(settings_, echo);
  HttpConnection client(server.port());
  EXPECT_EQ(client.ask(httpRequest("GET", "/", {{"X-Long", std::string(3000, 'x')}})).status, 200);
  EXPECT_EQ(client.ask(httpRequest("GET", "/", {{"X-Long", std::string(5000, 'x')}})).status, 431);
  HttpConnection huge(server.port());
  huge.send(httpRequest("GET", "/", {{"X-Long", std::string(1'000'000, 'x')}}));
  try {
    const int status = huge.readAnswer().status;
    EXPECT_TRUE(status == 431 || status == 413) << status;
  } catch (const std::runtime_error&) {
    // The client was still sending: the connection's end came before the answer.
    SUCCEED();
  }
  HttpConnection target(server.port());
  EXPECT_EQ(target.ask(httpRequest("GET", "/" + std::string(5000, 'x'))).status, 431);
}

TEST_F(Requests, ThatAreBrokenAreRefused) {
  std::atomic<int> served = 0;
  Server server(settings_, [&](const Request&, Answer& answer) {
    ++served;
    beginText(answer);
  });
  const std::vector<std::string> broken = {
      "GET / HTTP/1.1\r\n\r\n",                                                  // no host
      "GET / HTTP/1.1\r\nHost: x\r\nNo colon here\r\n\r\n",                      //
      "POST / HTTP/1.1\r\nHost: x\r\nContent-Length: many\r\n\r\n",              //
      "POST / HTTP/1.1\r\nHost: x\r\nContent-Length: -1\r\n\r\n",                //
      "POST / HTTP/1.1\r\nHost: x\r\nTransfer-Encoding: chunked\r\n\r\nzz\r\n",  //
      "POST / HTTP/1.1\r\nHost: x\r\nTransfer-Encoding: chunked\r\nContent-Length: 4\r\n\r\n0\r\n\r\n",
      "GET / HTTP/9.9\r\nHost: x\r\n\r\n",
      "\x16\x03\x01\x02garbage that is no HTTP\r\n\r\n",
      std::string("GET ") + '\0' + "/ HTTP/1.1\r\nHost: x\r\n\r\n",
  };
  for (const std::string& request : broken) {
    HttpConnection client(server.port());
    client.send(request);
    client.finishSending();
    const std::string reply = client.receive();
    const bool refused = reply.empty() || reply.starts_with("HTTP/1.1 4") || reply.starts_with("HTTP/1.1 5");
    EXPECT_TRUE(refused) << request << "\n" << reply;
  }
  EXPECT_EQ(served, 0);
  EXPECT_TRUE(eventually([&] { return server.requestsUnderWay() == 0; }));
}

TEST_F(Requests, ThatAreHalfSentAreCut) {
  settings_.bounds.idle = std::chrono::milliseconds(500);
  settings_.bounds.stall = std::chrono::milliseconds(500);
  Server server(settings_, echo);
  HttpConnection silent(server.port());
  HttpConnection line(server.port());
  HttpConnection headers(server.port());
  HttpConnection body(server.port());
  line.send("POST / HT");
  headers.send("POST / HTTP/1.1\r\nHost: x\r\n");
  body.send("POST / HTTP/1.1\r\nHost: x\r\nContent-Length: 10\r\n\r\nhalf");
  EXPECT_TRUE(silent.isClosed());
  EXPECT_TRUE(line.isClosed());
  EXPECT_TRUE(headers.isClosed());
  EXPECT_TRUE(body.isClosed());
  EXPECT_TRUE(eventually([&] { return server.requestsUnderWay() == 0; }));
}

TEST_F(Requests, ThatDripAreCut) {
  settings_.bounds.idle = std::chrono::milliseconds(200);
  settings_.bounds.request = std::chrono::milliseconds(300);
  settings_.bounds.stall = std::chrono::seconds(30);  // which keeps MHD's own timeout out of this
  Server server(settings_, echo);
  HttpConnection line(server.port());
  HttpConnection headers(server.port());
  HttpConnection body(server.port());
  headers.send("GET / HTTP/1.1\r\nHost: x\r\nX-Long: ");
  body.send("POST / HTTP/1.1\r\nHost: x\r\nContent-Length: 100000\r\n\r\n");
  const auto drips = [](HttpConnection& client) {
    return [&client] {
      std::this_thread::sleep_for(std::chrono::milliseconds(10));
      return !client.send("x");
    };
  };
  EXPECT_TRUE(eventually(drips(line)));
  EXPECT_TRUE(eventually(drips(headers)));
  EXPECT_TRUE(eventually(drips(body)));
  EXPECT_TRUE(log_.waitFor("no whole request came in time"));
}

TEST_F(Requests, ThatTakeLongToHandleAreNotCut) {
  settings_.bounds.idle = std::chrono::milliseconds(100);
  settings_.bounds.request = std::chrono::milliseconds(100);
  settings_.bounds.stall = std::chrono::milliseconds(100);
  Server server(settings_, [](const Request& request, Answer& answer) {
    std::this_thread::sleep_for(std::chrono::milliseconds(1500));
    echo(request, answer);
  });
  HttpConnection client(server.port());
  EXPECT_EQ(client.ask(httpRequest("GET", "/")).body, "GET /");
}

TEST_F(Requests, OnTwoHundredConnectionsAreServed) {
  constexpr int many = 200;
  settings_.bounds.workers = 4;
  Server server(settings_, echo);
  std::vector<HttpConnection> clients;
  clients.reserve(many);
  for (int next = 0; next < many; ++next) {
    clients.emplace_back(server.port());
  }
  for (int round = 0; round < 3; ++round) {
    for (int next = 0; next < many; ++next) {
      EXPECT_TRUE(
          clients[static_cast<std::size_t>(next)].send(httpRequest("GET", "/" + std::to_string(next))));
    }
    for (int next = 0; next < many; ++next) {
      EXPECT_EQ(clients[static_cast<std::size_t>(next)].readAnswer().body, "GET /" + std::to_string(next));
    }
  }
}

TEST_F(Requests, OnTooManyConnectionsAreRefused) {
  settings_.bounds.connections = 3;
  Server server(settings_, echo);
  std::vector<HttpConnection> clients;
  for (int next = 0; next < 3; ++next) {
    EXPECT_EQ(clients.emplace_back(server.port()).ask(httpRequest("GET", "/")).status, 200);
  }
  HttpConnection fourth(server.port());
  EXPECT_TRUE(fourth.isClosed());
  EXPECT_TRUE(log_.waitFor("connection refused: there are 3 connections"));
  clients.pop_back();
  EXPECT_TRUE(eventually([&] {
    HttpConnection next(server.port());
    next.send(httpRequest("GET", "/"));
    return next.receive().starts_with("HTTP/1.1 200");
  }));
}

TEST_F(Requests, FromOneAddressAreBounded) {
  settings_.bounds.connectionsPerAddress = 2;
  settings_.listeners.push_back({"[::1]:0", false, -1});
  Server server(settings_, echo);
  HttpConnection first(server.port());
  HttpConnection second(server.port());
  EXPECT_EQ(first.ask(httpRequest("GET", "/")).status, 200);
  EXPECT_EQ(second.ask(httpRequest("GET", "/")).status, 200);
  HttpConnection third(server.port());
  EXPECT_TRUE(third.isClosed());
  HttpConnection other(server.port(1), true);
  EXPECT_EQ(other.ask(httpRequest("GET", "/")).status, 200);
  EXPECT_TRUE(log_.waitFor("its address has 2 connections"));
}

TEST_F(Requests, AreHandledAtOnceUpToABound) {
  settings_.bounds.workers = 3;
  settings_.bounds.keptWorkers = 0;
  std::atomic<int> working = 0;
  std::atomic<int> most = 0;
  Server server(settings_, [&](const Request& request, Answer& answer) {
    const int now = ++working;
    int before = most;
    while (before < now && !most.compare_exchange_weak(before, now)) {
    }
    EXPECT_TRUE(eventually([&] { return most >= 3; }));
    --working;
    echo(request, answer);
  });
  std::vector<HttpConnection> clients;
  for (int next = 0; next < 12; ++next) {
    clients.emplace_back(server.port()).send(httpRequest("GET", "/"));
  }
  for (HttpConnection& client : clients) {
    EXPECT_EQ(client.readAnswer().status, 200);
  }
  EXPECT_EQ(most, 3);
}

}  // namespace
}  // namespace tests
