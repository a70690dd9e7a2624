// A provider of one's own, served besides the installed ones.
#include "CimClient.h"
#include "Served.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>

namespace {

namespace fs = std::filesystem;
using cli_test::TemporaryFolder;
using serve_test::CimAnswer;
using serve_test::CimClient;
using serve_test::classParameter;
using serve_test::post;
using serve_test::Served;
using serve_test::ServeStart;
using testing::ElementsAre;
using testing::HasSubstr;
using tests::HttpAnswer;
using tests::HttpConnection;

constexpr const char* schema = R"(
[Abstract] class TEST_Element { string Caption; };
class TEST_Base : TEST_Element { [Key] string Name; uint32 Number; string Text; string Tags[]; };
class TEST_Thing : TEST_Base {};
class TEST_NoDone : TEST_Base {};
class TEST_Failing : TEST_Base {};
)";

std::string section(const std::string& className) {
  return "[" + className +
         "]\nprovider: TestProvider\nlocation: DispatchTestProvider\ntype: instance\nnamespace: root/test "
         "root/cimv2\n";
}

class OwnProvider : public testing::Test {
 protected:
  OwnProvider() {
    std::ofstream(folder_.at("own.mof")) << schema;
    std::ofstream(folder_.at("own.reg"))
        << section("TEST_Thing") + section("TEST_NoDone") + section("TEST_Failing");
    fs::create_symlink(TEST_PROVIDER, folder_.at("libDispatchTestProvider.so"));
  }

  [[nodiscard]] ServeStart start() const {
    ServeStart start;
    start.arguments.insert(start.arguments.end(), {"--provider", folder_.at("own.reg").string(), "--schema",
                                                   folder_.at("own.mof").string()});
    return start;
  }

 private:
  TemporaryFolder folder_;
};

TEST_F(OwnProvider, IsServedBesidesTheInstalledOnes) {
  Served served(start());
  CimClient client(served.port());
  EXPECT_THAT(client.call("EnumerateInstanceNames", "root/test", classParameter("ClassName", "TEST_Thing"))
                  .keys("Name"),
              ElementsAre("a", "b"));
  EXPECT_EQ(client.countIdentities(), 19U);
  const CimAnswer spaces =
      client.call("EnumerateInstanceNames", "interop", classParameter("ClassName", "CIM_Namespace"));
  EXPECT_THAT(spaces.keys("Name"), testing::UnorderedElementsAre("root/cimv2", "root/interop", "root/test"));
  EXPECT_EQ(served.end(), 0);
}

TEST_F(OwnProvider, ThatIsNotDoneIsOkWithWhatItDeliveredAndLogged) {
  Served served(start());
  const CimAnswer answer =
      CimClient(served.port())
          .call("EnumerateInstances", "root/test", classParameter("ClassName", "TEST_NoDone"));
  EXPECT_EQ(answer.error, 0);
  EXPECT_THAT(answer.keys("Name"), ElementsAre("first"));
  EXPECT_TRUE(served.logs("TEST_NoDone")) << served.log();
  EXPECT_EQ(served.end(), 0);
  EXPECT_THAT(served.log(), HasSubstr("done marker, since the start: 1"));
}

TEST_F(OwnProvider, ThatFailsInTheMiddleIsNotSwallowed) {
  Served served(start());
  HttpConnection connection(served.port());
  const HttpAnswer answer = connection.ask(post(
      "EnumerateInstances", "root/test", classParameter("ClassName", "TEST_Failing"), {{"TE", "trailers"}}));
  // Whether its one instance has left by then is a matter of milliseconds. The status is the provider's own.
  const bool isInBody = answer.body.find("<ERROR CODE=\"2\" DESCRIPTION=\"no entry\"") != std::string::npos;
  const bool isInTrailers = answer.trailer("CIMStatusCode") == "2";
  EXPECT_TRUE(isInBody || isInTrailers) << answer.body;
  EXPECT_TRUE(served.logs("breaks off with status 2")) << served.log();
  EXPECT_EQ(served.end(), 0);
}

TEST_F(OwnProvider, IsListedToo) {
  std::vector<std::string> arguments = start().arguments;
  arguments.insert(arguments.begin(), {"names", "TEST_Thing"});
  const cli_test::Result result = cli_test::swinv(arguments);
  EXPECT_EQ(result.exitCode, 0) << result.standardError;
  EXPECT_EQ(result.standardOutput, "root/cimv2:TEST_Thing.Name=\"a\"\nroot/cimv2:TEST_Thing.Name=\"b\"\n");
}

}  // namespace
