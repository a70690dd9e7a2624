// The options around the WBEM endpoint.
#include <cli/Options.h>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace {

using cli::ListenAddress;
using cli::parseListenAddress;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;

cli::Options parsed(const std::vector<std::string>& arguments) {
  const cli::CommandLine line = cli::parseCommandLine(arguments);
  EXPECT_TRUE(line.options.has_value()) << line.standardError;
  return line.options.value_or(cli::Options());
}

void expectUsageError(const std::vector<std::string>& arguments, const std::string& message) {
  const cli::CommandLine line = cli::parseCommandLine(arguments);
  EXPECT_FALSE(line.options.has_value());
  EXPECT_EQ(line.exitCode, 2);
  EXPECT_THAT(line.standardError, HasSubstr(message));
}

TEST(ListenAddress, TakesAddressesInDigits) {
  EXPECT_EQ(parseListenAddress("127.0.0.1:5988"), (ListenAddress{"127.0.0.1", 5988, {}}));
  EXPECT_EQ(parseListenAddress("127.0.0.1"), (ListenAddress{"127.0.0.1", {}, {}}));
  EXPECT_EQ(parseListenAddress("[::1]:0"), (ListenAddress{"::1", 0, {}}));
  EXPECT_EQ(parseListenAddress("[fe80::1]"), (ListenAddress{"fe80::1", {}, {}}));
  EXPECT_EQ(parseListenAddress("http://10.0.0.1:65535"), (ListenAddress{"10.0.0.1", 65535, false}));
  EXPECT_EQ(parseListenAddress("https://[::]:5989"), (ListenAddress{"::", 5989, true}));
  EXPECT_EQ(parseListenAddress("localhost:80"), (ListenAddress{"127.0.0.1", 80, {}}));
  EXPECT_EQ(parseListenAddress("*:80"), (ListenAddress{"0.0.0.0", 80, {}}));
}

TEST(ListenAddress, RefusesEverythingElse) {
  for (const char* text :
       {"", ":5988", "5988", "atlas:5988", "127.0.0.1:", "127.0.0.1:65536", "127.0.0.1:-1", "127.0.0.1:5988x",
        "127.0.0.1 :5988", "127.1:5988", "::1", "::1:5988", "[::1", "[::1]5988", "[127.0.0.1]:5988",
        "ftp://127.0.0.1:21", "http://127.0.0.1:5988/cimom", "[]:1"}) {
    EXPECT_FALSE(parseListenAddress(text)) << text;
  }
}

TEST(ServeOptions, NeedNothing) {
  const cli::Options options = parsed({"serve"});
  EXPECT_EQ(options.command, cli::Command::Serve);
  EXPECT_THAT(options.serve.listen, IsEmpty());
  EXPECT_FALSE(options.serve.certificate || options.serve.key || options.serve.clientCa ||
               options.serve.passwords || options.serve.maxConnections || options.serve.stallTime);
  EXPECT_EQ(options.logLevel, cli::LogLevel::Error) << "a server says what goes wrong";
}

TEST(ServeOptions, AllOfThem) {
  const cli::Options options = parsed({"serve",
                                       "--listen",
                                       "127.0.0.1:1",
                                       "--listen",
                                       "https://0.0.0.0:2",
                                       "--tls-certificate",
                                       "c.pem",
                                       "--tls-key",
                                       "k.pem",
                                       "--client-ca",
                                       "ca.pem",
                                       "--passwords",
                                       "p",
                                       "--max-connections",
                                       "7",
                                       "--stall-time",
                                       "9",
                                       "--inventory",
                                       "i.json",
                                       "--provider",
                                       "d.reg",
                                       "--schema",
                                       "a.mof",
                                       "--schema",
                                       "b.mof",
                                       "--log-level",
                                       "off"});
  EXPECT_THAT(options.serve.listen,
              ElementsAre(ListenAddress{"127.0.0.1", 1, {}}, ListenAddress{"0.0.0.0", 2, true}));
  EXPECT_EQ(options.serve.certificate, "c.pem");
  EXPECT_EQ(options.serve.key, "k.pem");
  EXPECT_EQ(options.serve.clientCa, "ca.pem");
  EXPECT_EQ(options.serve.passwords, "p");
  EXPECT_EQ(options.serve.maxConnections, 7U);
  EXPECT_EQ(options.serve.stallTime, std::chrono::seconds(9));
  EXPECT_EQ(options.inventory, "i.json");
  EXPECT_EQ(options.provider, "d.reg");
  EXPECT_THAT(options.schema, ElementsAre("a.mof", "b.mof"));
  EXPECT_EQ(options.logLevel, cli::LogLevel::Off);
}

TEST(ServeOptions, WhatMakesNoSenseIsAUsageError) {
  expectUsageError({"serve", "--listen", "atlas:5988"}, "write it as 127.0.0.1:5988");
  expectUsageError({"serve", "--tls-key", "k.pem"}, "both --tls-certificate and --tls-key");
  expectUsageError({"serve", "--tls-certificate", "c.pem"}, "both --tls-certificate and --tls-key");
  expectUsageError({"serve", "--client-ca", "ca.pem"}, "--client-ca needs TLS");
  expectUsageError({"serve", "--listen", "https://127.0.0.1:1"}, "needs --tls-certificate");
  for (const char* number : {"0", "-1", "x", "", "100001", "1.5", "4294967297"}) {
    expectUsageError({"serve", "--max-connections", number}, "from 1 to 100000");
  }
  expectUsageError({"serve", "--stall-time", "0"}, "from 1 to 86400");
  expectUsageError({"serve", "--passwords", ""}, "--passwords needs a name");
  expectUsageError({"serve", "--schema", ""}, "--schema needs a name");
  expectUsageError({"serve", "--format", "json"}, "'swinv serve' takes no --format");
  expectUsageError({"serve", "--delete"}, "'swinv serve' takes no --delete");
  expectUsageError({"serve", "now"}, "'now' is one argument too many");
  expectUsageError({"list", "--listen", "127.0.0.1:1"}, "'swinv list' takes no --listen");
}

TEST(PasswdOptions, NameAFileAndAUser) {
  const cli::Options options = parsed({"passwd", "etc/passwords", "ada"});
  EXPECT_EQ(options.command, cli::Command::Passwd);
  EXPECT_EQ(options.passwd.file, "etc/passwords");
  EXPECT_EQ(options.passwd.user, "ada");
  EXPECT_FALSE(options.passwd.remove);
  EXPECT_TRUE(parsed({"passwd", "f", "ada", "--delete"}).passwd.remove);
}

TEST(PasswdOptions, WhatMakesNoSenseIsAUsageError) {
  expectUsageError({"passwd"}, "needs the password file and the name of a user");
  expectUsageError({"passwd", "f"}, "needs the password file and the name of a user");
  expectUsageError({"passwd", "f", ""}, "needs the password file and the name of a user");
  expectUsageError({"passwd", "f", "ada", "secret"}, "'secret' is one argument too many");
  expectUsageError({"passwd", "f", "ada", "--inventory", "i"}, "'swinv passwd' takes no --inventory");
  expectUsageError({"passwd", "f", "ada", "--log-level", "off"}, "'swinv passwd' takes no --log-level");
}

}  // namespace
