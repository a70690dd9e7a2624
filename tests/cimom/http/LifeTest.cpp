// Where a server listens, and how it ends.
#include <arpa/inet.h>
#include <fcntl.h>
#include <gtest/gtest.h>
#include <netinet/in.h>
#include <sys/socket.h>
#include <unistd.h>

#include <atomic>
#include <future>
#include <thread>

#include "TestServer.h"

namespace tests {
namespace {

class Life : public testing::Test {
 protected:
  /// The message of the refusal to start with these settings.
  [[nodiscard]] std::string refusal() const {
    try {
      const Server server(settings_, echo);
      return "it started";
    } catch (const std::runtime_error& error) {
      return error.what();
    }
  }

  Log log_;
  Settings settings_ = loopback(log_);
};

int listeningSocket(std::uint32_t host) {
  const int descriptor = ::socket(AF_INET, SOCK_STREAM | SOCK_CLOEXEC, 0);
  sockaddr_in address{};
  address.sin_family = AF_INET;
  address.sin_addr.s_addr = htonl(host);
  EXPECT_EQ(::bind(descriptor, reinterpret_cast<sockaddr*>(&address), sizeof address), 0);
  EXPECT_EQ(::listen(descriptor, 16), 0);
  return descriptor;
}

TEST_F(Life, OpenAddressNeedsTls) {
  settings_.listeners = {{"0.0.0.0:0", false, -1}};
  EXPECT_NE(refusal().find("which other machines reach, without TLS"), std::string::npos) << refusal();
  settings_.listeners = {{"[::]:0", false, -1}};
  EXPECT_NE(refusal().find("which other machines reach, without TLS"), std::string::npos) << refusal();
}

TEST_F(Life, OpenInheritedSocketNeedsTls) {
  const int inherited = listeningSocket(INADDR_ANY);
  settings_.listeners = {{"", false, inherited}};
  EXPECT_NE(refusal().find("which other machines reach, without TLS"), std::string::npos) << refusal();
  ::close(inherited);
}

TEST_F(Life, OpenAddressNeedsALogin) {
  settings_.listeners = {{"0.0.0.0:0", true, -1}};
  settings_.certificateFile = "/does/not/exist.pem";
  settings_.keyFile = "/does/not/exist.key";
  EXPECT_NE(refusal().find("without a login"), std::string::npos) << refusal();
}

TEST_F(Life, TlsNeedsACertificate) {
  settings_.listeners = {{"127.0.0.1:0", true, -1}};
  EXPECT_NE(refusal().find("TLS needs a certificate"), std::string::npos) << refusal();
  settings_.certificateFile = "/does/not/exist.pem";
  settings_.keyFile = "/does/not/exist.key";
  EXPECT_NE(refusal().find("/does/not/exist.pem: does not exist"), std::string::npos) << refusal();
}

TEST_F(Life, ClientCertificatesNeedTls) {
  settings_.clientCaFile = "/does/not/exist.pem";
  EXPECT_NE(refusal().find("client certificates need TLS"), std::string::npos) << refusal();
}

TEST_F(Life, NothingToListenAt) {
  settings_.listeners.clear();
  EXPECT_NE(refusal().find("no address to listen at"), std::string::npos) << refusal();
}

TEST_F(Life, AddressInUse) {
  const Server server(settings_, echo);
  settings_.listeners[0].address = server.addresses().front();
  EXPECT_NE(refusal().find("cannot listen at " + server.addresses().front()), std::string::npos) << refusal();
}

TEST_F(Life, InheritedSocketIsUsedAndLeftOpen) {
  const int inherited = listeningSocket(INADDR_LOOPBACK);
  settings_.listeners = {{"", false, inherited}};
  for (int start = 0; start < 2; ++start) {
    Server server(settings_, echo);
    HttpConnection client(server.port());
    EXPECT_EQ(client.ask(httpRequest("GET", "/x")).body, "GET /x");
  }
  EXPECT_EQ(::close(inherited), 0);
}

TEST_F(Life, WhatIsNoListeningSocketIsRefused) {
  const int other = ::socket(AF_INET, SOCK_STREAM | SOCK_CLOEXEC, 0);
  settings_.listeners = {{"", false, other}};
  EXPECT_NE(refusal().find("no listening TCP socket"), std::string::npos) << refusal();
  ::close(other);
}

TEST_F(Life, StopFinishesWhatIsUnderWay) {
  Signal arrived;
  Signal go;
  const std::string rest = pattern(2'000'000);
  Server server(settings_, [&](const Request&, Answer& answer) {
    beginText(answer);
    answer.write("first ");
    arrived.set();
    EXPECT_TRUE(go.wait());
    EXPECT_TRUE(answer.write(rest));
  });
  HttpConnection idle(server.port());
  HttpConnection client(server.port());
  client.send(httpRequest("GET", "/"));
  ASSERT_TRUE(arrived.wait());
  auto stopped = std::async(std::launch::async, [&] { return server.stop(patience); });
  EXPECT_TRUE(eventually([&] {
    try {
      const HttpConnection late(server.port());
      return false;
    } catch (const std::runtime_error&) {
      return true;
    }
  }));
  go.set();
  const HttpAnswer answer = client.readAnswer();
  EXPECT_TRUE(answer.isComplete);
  EXPECT_TRUE(answer.body == "first " + rest);
  EXPECT_TRUE(client.isClosed());
  EXPECT_TRUE(idle.isClosed());
  EXPECT_TRUE(stopped.get());
  EXPECT_TRUE(server.stop(patience));
}

TEST_F(Life, StopCutsWhatTakesTooLong) {
  Signal arrived;
  std::atomic<bool> told = false;
  Server server(settings_, [&](const Request&, Answer& answer) {
    beginText(answer);
    arrived.set();
    while (answer.write("more ")) {
      std::this_thread::sleep_for(std::chrono::milliseconds(5));
    }
    told = true;
  });
  HttpConnection client(server.port());
  client.send(httpRequest("GET", "/"));
  ASSERT_TRUE(arrived.wait());
  HttpAnswer answer = client.readHead();
  EXPECT_FALSE(server.stop(std::chrono::milliseconds(100)));
  EXPECT_TRUE(eventually([&] { return told.load(); }));
  EXPECT_TRUE(server.stop(patience));
  EXPECT_THROW(
      {
        while (!client.readPart(answer).empty()) {
        }
      },
      std::runtime_error);
  EXPECT_TRUE(log_.waitFor("1 requests were not finished in time and were cut"));
}

TEST_F(Life, DestructorEndsWhatIsThere) {
  Signal arrived;
  Signal go;
  std::atomic<int> ended = 0;
  std::vector<HttpConnection> clients;
  {
    settings_.bounds.workers = 1;
    Server server(settings_, [&](const Request&, Answer& answer) {
      arrived.set();
      EXPECT_TRUE(go.wait());
      beginText(answer);
      answer.write("late");
      ++ended;
    });
    // One is handled, one waits for a worker, one is half sent.
    for (int next = 0; next < 2; ++next) {
      clients.emplace_back(server.port()).send(httpRequest("GET", "/"));
    }
    clients.emplace_back(server.port()).send("GET / HT");
    ASSERT_TRUE(arrived.wait());
    ASSERT_TRUE(eventually([&] { return server.requestsUnderWay() == 2; }));
    EXPECT_FALSE(server.stop(std::chrono::milliseconds(10)));
    EXPECT_EQ(ended, 0);
    go.set();
  }
  EXPECT_EQ(ended, 1) << "what nobody waits for any more is not begun";
  for (HttpConnection& client : clients) {
    EXPECT_TRUE(client.isClosed());
  }
}

}  // namespace
}  // namespace tests
