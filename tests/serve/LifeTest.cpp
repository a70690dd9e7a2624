// How a server starts, is told to read its files again, and ends.
#include "CimClient.h"
#include "Machines.h"
#include "Secrets.h"
#include "Served.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <array>
#include <csignal>
#include <fstream>
#include <optional>

#include <arpa/inet.h>
#include <sys/socket.h>
#include <sys/un.h>
#include <unistd.h>

namespace {

using cli_test::Result;
using serve_test::bigInventory;
using serve_test::CimClient;
using serve_test::classParameter;
using serve_test::eventually;
using serve_test::InventoryFile;
using serve_test::post;
using serve_test::readCim;
using serve_test::Secrets;
using serve_test::Served;
using serve_test::ServeStart;
using testing::AllOf;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::SizeIs;
using testing::StartsWith;
using tests::HttpAnswer;
using tests::HttpConnection;
using tests::HttpTls;

constexpr std::size_t many = 1500;
const std::string example = cli_test::testFile("examples/server.json");

std::string wholeInventory(const tests::HttpFields& fields = {}) {
  return post("EnumerateInstances", "root/cimv2", classParameter("ClassName", "KELVO_SoftwareIdentity"),
              fields);
}

/// A server with TLS and passwords.
ServeStart secured(const Secrets& secrets) {
  ServeStart start;
  const std::vector<std::string> options = secrets.options();
  start.arguments.insert(start.arguments.end(), options.begin(), options.end());
  return start;
}

HttpTls trustIn(const tests::Certificate& authority) {
  HttpTls tls;
  tls.authorities = authority.certificate;
  return tls;
}

/// The status that a login gets.
int loginStatus(const Served& served, const HttpTls& tls, const std::string& password) {
  HttpConnection connection(served.port(), tls);
  return connection.ask(wholeInventory({tests::basicLogin("ada", password)})).status;
}

TEST(ServeEnd, FinishesWhatIsUnderWay) {
  const InventoryFile inventory(bigInventory(many));
  Served served({{"--inventory", inventory.path(), "--log-level", "error"}});
  HttpConnection connection(served.port(), false, 4096);
  ASSERT_TRUE(connection.send(wholeInventory()));
  HttpAnswer answer = connection.readHead();
  ASSERT_EQ(answer.status, 200);
  served.signal(SIGTERM);
  ASSERT_TRUE(served.logs("stopping")) << served.log();
  EXPECT_TRUE(eventually([&] {
    try {
      HttpConnection late(served.port());
      return false;
    } catch (const std::runtime_error&) {
      return true;  // nobody listens any more
    }
  }));
  while (!connection.readPart(answer).empty()) {
  }
  EXPECT_THAT(readCim(answer).keys("InstanceID"), SizeIs(many));
  EXPECT_EQ(served.wait(), 0) << served.log();
}

TEST(ServeEnd, ASecondSignalDoesNotWait) {
  const InventoryFile inventory(bigInventory(many));
  Served served({{"--inventory", inventory.path(), "--log-level", "error"}});
  HttpConnection stalled(served.port(), false, 4096);
  ASSERT_TRUE(stalled.send(wholeInventory()));
  stalled.readHead();
  served.signal(SIGTERM);
  ASSERT_TRUE(served.logs("stopping"));
  served.signal(SIGTERM);
  EXPECT_EQ(served.wait(), -SIGTERM);
}

TEST(ServeEnd, AnInterruptIsTheSame) {
  Served served;
  served.signal(SIGINT);
  EXPECT_EQ(served.wait(), 0) << served.log();
}

TEST(ServeReload, TakesNewPasswords) {
  const Secrets secrets;
  Served served(secured(secrets));
  const HttpTls tls = trustIn(secrets.authority());
  EXPECT_EQ(loginStatus(served, tls, "analytical"), 200);
  ASSERT_EQ(Secrets::setPassword(secrets.file("passwords"), "ada", "differential").exitCode, 0);
  EXPECT_EQ(loginStatus(served, tls, "analytical"), 200) << "nobody has told the server";
  served.signal(SIGHUP);
  ASSERT_TRUE(served.logs("were read again")) << served.log();
  EXPECT_EQ(loginStatus(served, tls, "differential"), 200);
  EXPECT_EQ(loginStatus(served, tls, "analytical"), 401);
  EXPECT_EQ(served.end(), 0);
}

TEST(ServeReload, TakesANewCertificateAndKeepsAnOldOneThatIsBetterThanNone) {
  const Secrets secrets;
  Served served(secured(secrets));
  const tests::Certificate other =
      tests::makeCertificate("another authority", tests::CertificateUse::authority);
  const HttpTls trusting = trustIn(secrets.authority());
  const HttpTls trustingOther = trustIn(other);
  EXPECT_THROW(HttpConnection(served.port(), trustingOther), std::runtime_error);
  secrets.renewCertificate("localhost", &other);
  served.signal(SIGHUP);
  ASSERT_TRUE(served.logs("were read again")) << served.log();
  EXPECT_EQ(loginStatus(served, trustingOther, "analytical"), 200);
  EXPECT_THROW(HttpConnection(served.port(), trusting), std::runtime_error);

  std::ofstream(secrets.file("cert.pem")) << "no certificate";
  std::ofstream(secrets.file("passwords")) << "no line of a password file";
  served.signal(SIGHUP);
  ASSERT_TRUE(served.logs("the old stays in use")) << served.log();
  EXPECT_EQ(loginStatus(served, trustingOther, "analytical"), 200);
  EXPECT_EQ(served.end(), 0);
}

TEST(ServeReload, LooksAtTheMachineAnew) {
  const InventoryFile inventory(bigInventory(2));
  Served served({{"--inventory", inventory.path()}});
  CimClient client(served.port());
  EXPECT_EQ(client.countIdentities(), 2U);
  inventory.replace(bigInventory(5));
  EXPECT_EQ(client.countIdentities(), 2U) << "what was read stands for a minute";
  served.signal(SIGHUP);
  const auto begin = std::chrono::steady_clock::now();
  EXPECT_TRUE(eventually([&] { return client.countIdentities() == 5; })) << served.log();
  EXPECT_LT(std::chrono::steady_clock::now() - begin, std::chrono::seconds(45)) << "not by its age";
  EXPECT_EQ(served.end(), 0);
}

void expectRefused(std::vector<std::string> arguments, const testing::Matcher<std::string>& message,
                   int exitCode = 1) {
  arguments.insert(arguments.begin(), "serve");
  arguments.insert(arguments.end(), {"--inventory", example});
  const Result result = cli_test::swinv(arguments);
  EXPECT_EQ(result.exitCode, exitCode);
  EXPECT_EQ(result.standardOutput, "");
  EXPECT_THAT(result.standardError, message);
}

TEST(ServeStartUp, IsRefusedForOtherMachinesWithoutTlsAndALogin) {
  const Secrets secrets;
  const std::string certificate = secrets.file("cert.pem").string();
  const std::string key = secrets.file("key.pem").string();
  const std::string passwords = secrets.file("passwords").string();
  expectRefused({"--listen", "0.0.0.0:0"}, AllOf(HasSubstr("without TLS"), HasSubstr("--tls-certificate")));
  expectRefused({"--listen", "[::]:0", "--passwords", passwords}, HasSubstr("without TLS"));
  expectRefused({"--listen", "*:0", "--tls-certificate", certificate, "--tls-key", key},
                AllOf(HasSubstr("without a login"), HasSubstr("--passwords")));
  expectRefused({"--listen", "http://0.0.0.0:0", "--tls-certificate", certificate, "--tls-key", key,
                 "--passwords", passwords},
                HasSubstr("without TLS"));
  expectRefused({"--listen", "127.0.0.1:0", "--listen", "0.0.0.0:0"}, HasSubstr("without TLS"));
}

TEST(ServeStartUp, SaysWhichFileOrAddressCannotBeUsed) {
  const Secrets secrets;
  const std::string key = secrets.file("key.pem").string();
  expectRefused({"--tls-certificate", "/nothing/cert.pem", "--tls-key", key}, HasSubstr("/nothing/cert.pem"));
  expectRefused({"--passwords", "/nothing/passwords"}, HasSubstr("/nothing/passwords"));
  expectRefused({"--provider", "/nothing/my.reg"}, HasSubstr("/nothing/my.reg"));
  expectRefused({"--schema", "/nothing/my.mof"}, HasSubstr("/nothing/my.mof"));
  expectRefused({"--listen", "server:5988"}, HasSubstr("write it as 127.0.0.1:5988"), 2);
  Served served;
  const std::string place = "127.0.0.1:" + std::to_string(served.port());
  expectRefused({"--listen", place}, AllOf(HasSubstr(place), HasSubstr("Another server listens there")));
  EXPECT_EQ(served.end(), 0);
}

TEST(ServeStartUp, ListensAtSeveralPlaces) {
  const Secrets secrets;
  ServeStart start = secured(secrets);
  start.arguments.insert(start.arguments.end(), {"--listen", "http://127.0.0.1:0"});
  Served served(start);
  ASSERT_THAT(served.urls(), ElementsAre(StartsWith("https://127.0.0.1:"), StartsWith("http://127.0.0.1:")));
  EXPECT_EQ(loginStatus(served, trustIn(secrets.authority()), "analytical"), 200);
  HttpConnection plain(served.port(1));
  EXPECT_EQ(plain.ask(wholeInventory({tests::basicLogin("ada", "analytical")})).status, 200);
  EXPECT_EQ(served.end(), 0);
}

TEST(ServeStartUp, LetsInWhoHasACertificateOrAPassword) {
  const Secrets secrets;
  ServeStart start = secured(secrets);
  start.arguments.insert(start.arguments.end(), {"--client-ca", secrets.file("ca.pem").string()});
  Served served(start);
  const tests::Certificate known =
      tests::makeCertificate("console", tests::CertificateUse::client, &secrets.authority());
  HttpTls tls = trustIn(secrets.authority());
  HttpConnection nobody(served.port(), tls);
  EXPECT_EQ(nobody.ask(wholeInventory()).status, 401);
  EXPECT_EQ(loginStatus(served, tls, "analytical"), 200);
  tls.certificate = known.certificate;
  tls.key = known.key;
  HttpConnection console(served.port(), tls);
  EXPECT_EQ(console.ask(wholeInventory()).status, 200);
  EXPECT_EQ(served.end(), 0);
}

/// A socket of the test's own.
class Socket {
 public:
  explicit Socket(int number) : number_(number) {}
  ~Socket() { close(number_); }
  Socket(const Socket&) = delete;
  Socket& operator=(const Socket&) = delete;
  [[nodiscard]] int number() const { return number_; }

 private:
  int number_;
};

TEST(ServiceManager, HandsOverASocketThatListens) {
  const Socket listening(socket(AF_INET, SOCK_STREAM, 0));
  sockaddr_in address{};
  address.sin_family = AF_INET;
  address.sin_addr.s_addr = htonl(INADDR_LOOPBACK);
  socklen_t length = sizeof(address);
  ASSERT_EQ(bind(listening.number(), reinterpret_cast<const sockaddr*>(&address), length), 0);
  ASSERT_EQ(listen(listening.number(), 8), 0);
  ASSERT_EQ(getsockname(listening.number(), reinterpret_cast<sockaddr*>(&address), &length), 0);

  ServeStart start;
  start.socket = listening.number();
  start.socketName = "http";
  Served served(start);
  EXPECT_THAT(served.urls(), ElementsAre("http://127.0.0.1:" + std::to_string(ntohs(address.sin_port))))
      << "and at no other place";
  EXPECT_EQ(CimClient(ntohs(address.sin_port)).countIdentities(), 19U);
  EXPECT_EQ(served.end(), 0);
}

TEST(ServiceManager, IsToldOfTheServersState) {
  const cli_test::TemporaryFolder folder;
  const std::string path = folder.at("notify").string();
  const Socket channel(socket(AF_UNIX, SOCK_DGRAM | SOCK_CLOEXEC, 0));
  sockaddr_un address{};
  address.sun_family = AF_UNIX;
  path.copy(address.sun_path, sizeof(address.sun_path) - 1);
  ASSERT_EQ(bind(channel.number(), reinterpret_cast<const sockaddr*>(&address), sizeof(address)), 0);
  const timeval patience{60, 0};
  setsockopt(channel.number(), SOL_SOCKET, SO_RCVTIMEO, &patience, sizeof(patience));
  const auto next = [&channel] {
    std::array<char, 256> bytes{};
    const ssize_t got = recv(channel.number(), bytes.data(), bytes.size(), 0);
    return std::string(bytes.data(), got > 0 ? static_cast<std::size_t>(got) : 0);
  };

  ServeStart start;
  start.environment = {{"NOTIFY_SOCKET", path}};
  Served served(start);
  EXPECT_EQ(next(), "READY=1");
  served.signal(SIGHUP);
  EXPECT_THAT(next(), StartsWith("RELOADING=1\nMONOTONIC_USEC="));
  EXPECT_EQ(next(), "READY=1");
  served.signal(SIGTERM);
  EXPECT_EQ(next(), "STOPPING=1");
  EXPECT_EQ(served.wait(), 0);
}

}  // namespace
