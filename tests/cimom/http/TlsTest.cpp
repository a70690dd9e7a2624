// TLS and client certificates.
#include <gtest/gtest.h>
#include <tests/support/Certificates.h>

#include <cimom/http/Passwords.h>

#include "TestServer.h"

namespace tests {
namespace {

using cimom::http::setPassword;

class Tls : public testing::Test {
 protected:
  Tls() {
    settings_.listeners = {{"127.0.0.1:0", true, -1}};
    settings_.certificateFile = folder_.write("server.pem", server_.certificate, 0644);
    settings_.keyFile = folder_.write("server.key", server_.key);
  }

  void askForCertificates() {
    settings_.clientCaFile = folder_.write("clients.pem", clients_.certificate, 0644);
  }

  [[nodiscard]] HttpTls trusting() const { return {authority_.certificate, "", "", "NORMAL"}; }
  [[nodiscard]] HttpTls showing(const Certificate& own) const {
    return {authority_.certificate, own.certificate, own.key, "NORMAL"};
  }

  static void tellUser(const Request& request, Answer& answer) {
    beginText(answer);
    answer.write("user " + request.user);
  }

  Folder folder_;
  Log log_;
  Settings settings_ = loopback(log_);
  Certificate authority_ = makeCertificate("Servers", CertificateUse::authority);
  Certificate server_ = makeCertificate("localhost", CertificateUse::server, &authority_);
  Certificate clients_ = makeCertificate("Clients", CertificateUse::authority);
};

TEST_F(Tls, CarriesRequests) {
  Server server(settings_, echo);
  HttpConnection client(server.port(), trusting());
  const std::string body = pattern(500'000);
  EXPECT_TRUE(client.ask(httpRequest("POST", "/", {}, body)).body == body);
  EXPECT_EQ(client.ask(httpRequest("GET", "/again")).body, "GET /again");
}

TEST_F(Tls, StreamsWithTrailers) {
  Signal received;
  Server server(settings_, [&](const Request&, Answer& answer) {
    beginText(answer);
    answer.write("some");
    EXPECT_TRUE(received.wait());
    answer.fail({{"X-Why", "broken"}});
  });
  HttpConnection client(server.port(), trusting());
  client.send(httpRequest("GET", "/", {{"TE", "trailers"}}));
  HttpAnswer answer = client.readHead();
  EXPECT_EQ(client.readPart(answer), "some");
  received.set();
  EXPECT_EQ(client.readPart(answer), "");
  EXPECT_EQ(answer.trailer("X-Why"), "broken");
}

TEST_F(Tls, OldVersionsAreRefused) {
  Server server(settings_, echo);
  const auto with = [&](const std::string& versions) {
    HttpTls tls = trusting();
    tls.priorities = "NORMAL:-VERS-ALL:" + versions + ":%COMPAT";
    return tls;
  };
  EXPECT_EQ(HttpConnection(server.port(), with("+VERS-TLS1.3")).ask(httpRequest("GET", "/")).status, 200);
  EXPECT_EQ(HttpConnection(server.port(), with("+VERS-TLS1.2")).ask(httpRequest("GET", "/")).status, 200);
  EXPECT_THROW(HttpConnection(server.port(), with("+VERS-TLS1.1")), std::runtime_error);
  EXPECT_THROW(HttpConnection(server.port(), with("+VERS-TLS1.0")), std::runtime_error);
}

TEST_F(Tls, PlainRequestsAreNotServed) {
  Server server(settings_, echo);
  HttpConnection client(server.port());
  client.send(httpRequest("GET", "/"));
  EXPECT_EQ(client.receive().find("GET /"), std::string::npos);
}

TEST_F(Tls, OpenAddressIsListenedAtWithTlsAndLogin) {
  settings_.listeners = {{"0.0.0.0:0", true, -1}};
  askForCertificates();
  Server server(settings_, echo);
  const auto own = makeCertificate("console", CertificateUse::client, &clients_);
  EXPECT_EQ(HttpConnection(server.port(), showing(own)).ask(httpRequest("GET", "/")).status, 200);
}

TEST_F(Tls, CertificateIsALogin) {
  askForCertificates();
  Server server(settings_, tellUser);
  HttpConnection client(server.port(),
                        showing(makeCertificate("console", CertificateUse::client, &clients_)));
  EXPECT_EQ(client.ask(httpRequest("GET", "/")).body, "user CN=console");
  EXPECT_EQ(client.ask(httpRequest("GET", "/")).body, "user CN=console");
}

TEST_F(Tls, OtherCertificatesAreNone) {
  askForCertificates();
  Server server(settings_, tellUser);
  const auto status = [&](const HttpTls& tls) {
    return HttpConnection(server.port(), tls).ask(httpRequest("GET", "/")).status;
  };
  EXPECT_EQ(status(trusting()), 403);
  EXPECT_EQ(status(showing(makeCertificate("stranger", CertificateUse::client))), 403);
  EXPECT_EQ(status(showing(makeCertificate("of servers", CertificateUse::client, &authority_))), 403);
  EXPECT_EQ(status(showing(makeCertificate("server", CertificateUse::server, &clients_))), 403);
  EXPECT_EQ(
      status(showing(makeCertificate("old", CertificateUse::client, &clients_, std::chrono::seconds(-60)))),
      403);
  EXPECT_TRUE(log_.waitFor("client certificate refused: "));
  EXPECT_EQ(HttpConnection(server.port(), trusting()).ask(httpRequest("GET", "/healthz")).status, 200);
}

TEST_F(Tls, EitherLoginWillDo) {
  askForCertificates();
  settings_.passwordFile = folder_.path("passwords");
  setPassword(settings_.passwordFile, "anna", "secret");
  Server server(settings_, tellUser);
  HttpConnection by(server.port(), trusting());
  EXPECT_EQ(by.ask(httpRequest("GET", "/")).status, 401);
  EXPECT_EQ(by.ask(httpRequest("GET", "/", {basicLogin("anna", "secret")})).body, "user anna");
  HttpConnection shown(server.port(), showing(makeCertificate("console", CertificateUse::client, &clients_)));
  EXPECT_EQ(shown.ask(httpRequest("GET", "/")).body, "user CN=console");
}

TEST_F(Tls, PlainListenerBesideItNeedsTheLoginToo) {
  askForCertificates();
  settings_.listeners.push_back({"127.0.0.1:0", false, -1});
  Server server(settings_, tellUser);
  EXPECT_EQ(HttpConnection(server.port(1)).ask(httpRequest("GET", "/")).status, 403);
}

TEST_F(Tls, ReloadKeepsWhatIsUnderWay) {
  Signal arrived;
  Signal go;
  Server server(settings_, [&](const Request& request, Answer& answer) {
    beginText(answer);
    answer.write("first ");
    if (request.target == "/slow") {
      arrived.set();
      EXPECT_TRUE(go.wait());
    }
    answer.write("last");
  });
  HttpConnection slow(server.port(), trusting());
  HttpConnection idle(server.port(), trusting());
  EXPECT_EQ(idle.ask(httpRequest("GET", "/")).body, "first last");
  slow.send(httpRequest("GET", "/slow"));
  ASSERT_TRUE(arrived.wait());

  const Certificate authority = makeCertificate("Other servers", CertificateUse::authority);
  const Certificate other = makeCertificate("localhost", CertificateUse::server, &authority);
  folder_.write("server.pem", other.certificate, 0644);
  folder_.write("server.key", other.key);
  EXPECT_TRUE(server.reload().empty());

  EXPECT_THROW(HttpConnection(server.port(), trusting()), std::runtime_error);
  HttpConnection fresh(server.port(), HttpTls{authority.certificate, "", "", "NORMAL"});
  EXPECT_EQ(fresh.ask(httpRequest("GET", "/")).body, "first last");
  go.set();
  EXPECT_EQ(slow.readAnswer().body, "first last");
  const HttpAnswer last = idle.ask(httpRequest("GET", "/"));
  EXPECT_EQ(last.body, "first last");
  EXPECT_EQ(last.field("Connection"), "close");
  EXPECT_TRUE(idle.isClosed());
}

TEST_F(Tls, ReloadChangesTheAuthoritiesOfClients) {
  askForCertificates();
  Server server(settings_, tellUser);
  const Certificate own = makeCertificate("console", CertificateUse::client, &clients_);
  EXPECT_EQ(HttpConnection(server.port(), showing(own)).ask(httpRequest("GET", "/")).status, 200);
  folder_.write("clients.pem", makeCertificate("Others", CertificateUse::authority).certificate, 0644);
  EXPECT_TRUE(server.reload().empty());
  EXPECT_EQ(HttpConnection(server.port(), showing(own)).ask(httpRequest("GET", "/")).status, 403);
}

TEST_F(Tls, ReloadKeepsTheOldWhereTheNewIsBroken) {
  Server server(settings_, echo);
  folder_.write("server.key", makeCertificate("other", CertificateUse::server).key);
  auto broken = server.reload();
  ASSERT_EQ(broken.size(), 1U);
  EXPECT_NE(broken[0].find("cannot be used together"), std::string::npos) << broken[0];
  folder_.write("server.key", server_.key, 0644);
  broken = server.reload();
  ASSERT_EQ(broken.size(), 1U);
  EXPECT_NE(broken[0].find("server.key: others than its owner"), std::string::npos) << broken[0];
  EXPECT_EQ(HttpConnection(server.port(), trusting()).ask(httpRequest("GET", "/")).status, 200);
  folder_.write("server.key", server_.key, 0600);
  EXPECT_TRUE(server.reload().empty());
}

TEST_F(Tls, ReloadMayComeOften) {
  Server server(settings_, echo);
  for (int round = 0; round < 10; ++round) {
    EXPECT_EQ(HttpConnection(server.port(), trusting()).ask(httpRequest("GET", "/")).status, 200);
    EXPECT_TRUE(server.reload().empty());
  }
}

TEST_F(Tls, BrokenFilesAreRefused) {
  const auto refusal = [&] {
    try {
      const Server server(settings_, echo);
      return std::string("it started");
    } catch (const std::runtime_error& error) {
      return std::string(error.what());
    }
  };
  folder_.write("server.pem", "no certificate", 0644);
  EXPECT_NE(refusal().find("cannot be used together"), std::string::npos) << refusal();
  folder_.write("server.pem", server_.certificate, 0644);
  settings_.clientCaFile = folder_.write("clients.pem", "nothing in it", 0644);
  EXPECT_NE(refusal().find("there is no certificate in it"), std::string::npos) << refusal();
}

}  // namespace
}  // namespace tests
