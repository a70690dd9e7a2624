// What WBEM clients send that no packaged one here does, and what broken ones send, to a live endpoint.
#include "CimClient.h"
#include "Machines.h"
#include "Served.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <thread>

namespace {

using serve_test::bigInventory;
using serve_test::CimAnswer;
using serve_test::CimClient;
using serve_test::classParameter;
using serve_test::eventually;
using serve_test::instanceName;
using serve_test::instanceParameter;
using serve_test::listParameter;
using serve_test::post;
using serve_test::readCim;
using serve_test::Served;
using serve_test::valueParameter;
using testing::AnyOf;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::Not;
using testing::SizeIs;
using testing::StartsWith;
using testing::UnorderedElementsAre;
using tests::HttpAnswer;
using tests::HttpConnection;

constexpr const char* cimv2 = "root/cimv2";
const std::string identities = classParameter("ClassName", "KELVO_SoftwareIdentity");
const std::string atlas =
    instanceName("KELVO_ComputerSystem", {{"CreationClassName", "KELVO_ComputerSystem"}, {"Name", "atlas"}});

constexpr int invalidContext = 21;

class Client : public testing::Test {
 protected:
  void TearDown() override { EXPECT_EQ(served.end(), 0) << served.log(); }

  Served served;
  CimClient client{served.port()};
};

/// Pulls the rest in batches of that size; gives the keys of all, the first batch's included.
std::vector<std::string> pullAll(CimClient& client, CimAnswer answer, const std::string& pull,
                                 std::size_t batch) {
  std::vector<std::string> keys = answer.keys("InstanceID");
  while (answer.error == 0 && answer.parameter("EndOfSequence") == "FALSE") {
    const std::string context = answer.parameter("EnumerationContext");
    EXPECT_THAT(context, Not(IsEmpty()));
    answer = client.call(pull, cimv2,
                         valueParameter("EnumerationContext", context) +
                             valueParameter("MaxObjectCount", std::to_string(batch)));
    const std::vector<std::string> more = answer.keys("InstanceID");
    EXPECT_LE(more.size(), batch);
    keys.insert(keys.end(), more.begin(), more.end());
  }
  EXPECT_EQ(answer.error, 0) << answer.description;
  EXPECT_EQ(answer.parameter("EndOfSequence"), "TRUE");
  return keys;
}

TEST_F(Client, OpensAndPullsInSmallBatches) {
  const std::vector<std::string> whole =
      client.call("EnumerateInstances", cimv2, identities).keys("InstanceID");
  ASSERT_THAT(whole, SizeIs(19));
  for (const std::size_t batch : {1U, 4U, 19U, 100U}) {
    const CimAnswer open =
        client.call("OpenEnumerateInstances", cimv2, identities + valueParameter("MaxObjectCount", "3"));
    EXPECT_THAT(open.keys("InstanceID"), SizeIs(3)) << open.description;
    EXPECT_EQ(pullAll(client, open, "PullInstancesWithPath", batch), whole);
    const CimAnswer paths = client.call("OpenEnumerateInstancePaths", cimv2, identities);
    EXPECT_THAT(paths.keys("InstanceID"), IsEmpty()) << "a first batch that is not asked for is none";
    EXPECT_EQ(pullAll(client, paths, "PullInstancePaths", batch), whole);
  }
  const std::string source = instanceParameter("InstanceName", atlas);
  const CimAnswer near =
      client.call("OpenAssociatorInstances", cimv2, source + valueParameter("MaxObjectCount", "2"));
  EXPECT_THAT(pullAll(client, near, "PullInstancesWithPath", 5), SizeIs(19)) << near.description;
  const CimAnswer paths = client.call("OpenAssociatorInstancePaths", cimv2, source);
  EXPECT_THAT(pullAll(client, paths, "PullInstancePaths", 5), SizeIs(19)) << paths.description;
}

TEST_F(Client, ClosesAnEnumerationEarly) {
  const CimAnswer open =
      client.call("OpenEnumerateInstances", cimv2, identities + valueParameter("MaxObjectCount", "1"));
  const std::string context = valueParameter("EnumerationContext", open.parameter("EnumerationContext"));
  EXPECT_EQ(client.call("CloseEnumeration", cimv2, context).error, 0);
  const std::string pull = context + valueParameter("MaxObjectCount", "1");
  EXPECT_EQ(client.call("PullInstancesWithPath", cimv2, pull).error, invalidContext);
  EXPECT_EQ(client.call("CloseEnumeration", cimv2, context).error, invalidContext);
}

TEST_F(Client, NamesIgnoreCase) {
  const std::string name = instanceParameter(
      "INSTANCENAME", instanceName("KELVO_SOFTWAREIDENTITY", {{"INSTANCEID", "1@b3512e37f41e292"}}));
  const CimAnswer answer = client.call("GetInstance", "ROOT/CIMV2",
                                       name + listParameter("PROPERTYLIST", {"VERSIONSTRING", "NAME"}));
  ASSERT_EQ(answer.error, 0) << answer.description;
  std::vector<std::string> names;
  for (const serve_test::Element* property : answer.root.all("PROPERTY")) {
    names.push_back(property->attribute("NAME"));
  }
  EXPECT_THAT(names, UnorderedElementsAre("VersionString", "Name")) << "in the schema's own spelling";
  EXPECT_THAT(
      client.call("EnumerateInstanceNames", "/Root/CimV2", classParameter("CLASSNAME", "cim_computersystem"))
          .keys("CreationClassName"),
      UnorderedElementsAre("KELVO_ComputerSystem", "KELVO_SPComputerSystem"));
}

TEST_F(Client, EveryOperationsAnswerIsValid) {
  const std::string bmc = instanceName("KELVO_SoftwareIdentity", {{"InstanceID", "1@b3512e37f41e292"}});
  const std::string origins =
      valueParameter("IncludeQualifiers", "TRUE") + valueParameter("IncludeClassOrigin", "TRUE");
  const std::string everything = valueParameter("LocalOnly", "FALSE") + origins;
  const std::vector<std::pair<std::string, std::string>> calls{
      {"GetClass", identities + everything},
      {"EnumerateClasses", valueParameter("DeepInheritance", "TRUE") + everything},
      {"EnumerateClassNames", valueParameter("DeepInheritance", "TRUE")},
      {"GetInstance", instanceParameter("InstanceName", bmc) + everything},
      {"EnumerateInstances", classParameter("ClassName", "CIM_ManagedElement") + everything},
      {"EnumerateInstances", classParameter("ClassName", "KELVO_InstalledSoftwareIdentity") + everything},
      {"EnumerateInstanceNames", classParameter("ClassName", "KELVO_NetworkSoftwareIdentity")},
      {"Associators", instanceParameter("ObjectName", atlas) + origins},
      {"AssociatorNames", instanceParameter("ObjectName", bmc)},
      {"Associators", classParameter("ObjectName", "KELVO_SoftwareIdentity") + origins},
      {"AssociatorNames", classParameter("ObjectName", "KELVO_SoftwareIdentity")},
      {"References", classParameter("ObjectName", "KELVO_SoftwareIdentity") + origins},
      {"ReferenceNames", classParameter("ObjectName", "KELVO_SoftwareIdentity")}};
  for (const auto& [method, parameters] : calls) {
    const CimAnswer answer = client.call(method, cimv2, parameters);  // throws where it is not valid
    EXPECT_EQ(answer.error, 0) << method << ": " << answer.description;
    EXPECT_THAT(answer.root.first("IRETURNVALUE").children, Not(IsEmpty())) << method;
  }
  EXPECT_EQ(client.call("References", cimv2, instanceParameter("ObjectName", bmc)).error, 7);
  EXPECT_EQ(client
                .call("ExecQuery", cimv2,
                      valueParameter("QueryLanguage", "WQL") +
                          valueParameter("Query", "SELECT * FROM KELVO_SoftwareIdentity"))
                .error,
            7);
  EXPECT_EQ(client.call("SetProperty", cimv2, "").error, 7);
}

TEST_F(Client, HttpAsOtherClientsSpeakIt) {
  HttpConnection connection(served.port());
  const std::string request = post("EnumerateInstances", cimv2, identities, {{"Expect", "100-continue"}});
  const std::size_t body = request.find("\r\n\r\n") + 4;
  ASSERT_TRUE(connection.send(request.substr(0, body)));
  EXPECT_THAT(connection.receive(), StartsWith("HTTP/1.1 100 "));
  ASSERT_TRUE(connection.send(request.substr(body)));
  EXPECT_THAT(readCim(connection.readAnswer()).keys("InstanceID"), SizeIs(19));

  const std::string mandatory =
      tests::httpRequest("M-POST", "/cimom",
                         {{"Content-Type", "text/xml"},
                          {"Man", "http://www.dmtf.org/cim/mapping/http/v1.0 ; ns=73"},
                          {"73-CIMOperation", "MethodCall"},
                          {"73-CIMMethod", "EnumerateInstanceNames"},
                          {"73-CIMObject", "root%2Fcimv2"}},
                         serve_test::message("EnumerateInstanceNames", cimv2, identities));
  const HttpAnswer answer = connection.ask(mandatory);
  EXPECT_THAT(readCim(answer).keys("InstanceID"), SizeIs(19));
  EXPECT_TRUE(answer.field("Ext").has_value());
}

TEST_F(Client, AnHttp10ClientGetsAWholeAnswer) {
  HttpConnection connection(served.port());
  const HttpAnswer answer = connection.ask(post("EnumerateInstances", cimv2, identities, {}, "HTTP/1.0"));
  EXPECT_FALSE(answer.isChunked);
  EXPECT_THAT(readCim(answer).keys("InstanceID"), SizeIs(19));
  EXPECT_TRUE(connection.isClosed());
}

TEST_F(Client, TheHealthOfTheServer) {
  HttpConnection connection(served.port());
  const HttpAnswer answer = connection.ask(tests::httpRequest("GET", "/healthz"));
  EXPECT_EQ(answer.status, 200);
  EXPECT_EQ(answer.body, "ok\n");
  EXPECT_EQ(connection.ask(tests::httpRequest("GET", "/other")).status, 405);
}

TEST_F(Client, BrokenRequestsAreRefusedAndHarmNobody) {
  const auto statusOf = [this](const std::string& request) {
    HttpConnection connection(served.port());
    return connection.ask(request).status;
  };
  std::string broken = post("EnumerateInstances", cimv2, identities);
  broken.replace(broken.find("</CIM>"), 6, "<!CIM>");
  EXPECT_EQ(statusOf(broken), 400);
  EXPECT_EQ(statusOf(tests::httpRequest("POST", "/cimom", {{"Content-Type", "application/xml"}},
                                        R"(<!DOCTYPE a [<!ENTITY b "c">]><CIM>&b;</CIM>)")),
            400);
  EXPECT_EQ(statusOf("\x16\x03\x01 is what TLS begins with\r\n\r\n"), 400);
  EXPECT_THAT(statusOf(tests::httpRequest("GET", "/healthz", {{"Filler", std::string(100000, 'x')}})),
              AnyOf(400, 431));
  HttpConnection huge(served.port());
  huge.send(
      "POST /cimom HTTP/1.1\r\nHost: h\r\nContent-Type: application/xml\r\nContent-Length: "
      "1000000000000\r\n\r\n");
  EXPECT_EQ(huge.readAnswer().status, 413);
  for (const std::size_t part : {1U, 30U, 200U, 400U}) {
    HttpConnection half(served.port());
    ASSERT_TRUE(half.send(post("EnumerateInstances", cimv2, identities).substr(0, part)));
  }
  EXPECT_EQ(client.countIdentities(), 19U);
}

TEST_F(Client, AMultipleRequestIsRefused) {
  std::string text = serve_test::message("EnumerateInstances", cimv2, identities);
  text.replace(text.find("<SIMPLEREQ>"), 11, "<MULTIREQ><SIMPLEREQ>");
  const std::size_t end = text.find("</SIMPLEREQ>");
  const std::string one = text.substr(text.find("<SIMPLEREQ>"), end + 12 - text.find("<SIMPLEREQ>"));
  text.replace(end, 12, "</SIMPLEREQ>" + one + "</MULTIREQ>");
  HttpConnection connection(served.port());
  const HttpAnswer answer = connection.ask(tests::httpRequest(
      "POST", "/cimom",
      {{"Content-Type", "application/xml"}, {"CIMOperation", "MethodCall"}, {"CIMBatch", ""}}, text));
  EXPECT_EQ(answer.status, 501);
  EXPECT_EQ(answer.field("CIMError"), "multiple-requests-unsupported");
}

TEST_F(Client, TwoHundredConnectionsAtOnce) {
  std::vector<HttpConnection> connections;
  for (int i = 0; i < 200; ++i) {
    connections.emplace_back(served.port());
  }
  const std::string request = post("EnumerateInstanceNames", cimv2, identities);
  for (HttpConnection& connection : connections) {
    ASSERT_TRUE(connection.send(request));
  }
  for (HttpConnection& connection : connections) {
    EXPECT_THAT(readCim(connection.readAnswer()).keys("InstanceID"), SizeIs(19));
  }
  EXPECT_EQ(client.countIdentities(), 19U);
}

constexpr std::size_t many = 1500;

TEST(ClientOfALargeMachine, GetsTheAnswerInChunksAsItIsMade) {
  const serve_test::InventoryFile inventory(bigInventory(many));
  Served served({{"--inventory", inventory.path(), "--log-level", "error"}});
  HttpConnection connection(served.port());
  const HttpAnswer answer =
      connection.ask(post("EnumerateInstances", cimv2, identities, {{"TE", "trailers"}}));
  EXPECT_TRUE(answer.isChunked);
  EXPECT_THAT(readCim(answer).keys("InstanceID"), SizeIs(many));
  EXPECT_EQ(served.end(), 0);
}

TEST(ClientOfALargeMachine, ThatStopsReadingIsCutAndKeepsNobodyWaiting) {
  const serve_test::InventoryFile inventory(bigInventory(many));
  Served served({{"--inventory", inventory.path(), "--log-level", "error", "--stall-time", "1"}});
  std::vector<HttpConnection> stalled;
  for (int i = 0; i < 32; ++i) {  // more than there are workers
    stalled.emplace_back(served.port(), false, 4096);
    ASSERT_TRUE(stalled.back().send(post("EnumerateInstances", cimv2, identities)));
  }
  CimClient client(served.port());
  EXPECT_EQ(client.countIdentities(), many);
  EXPECT_TRUE(eventually([&] {
    HttpConnection connection(served.port());
    return connection.ask(tests::httpRequest("GET", "/healthz")).status == 200;
  }));
  EXPECT_EQ(served.end(), 0) << served.log();
}

TEST(SlowClient, IsCutInTheMiddleOfARequest) {
  Served served({{"--inventory", cli_test::testFile("examples/server.json"), "--stall-time", "1"}});
  HttpConnection connection(served.port());
  ASSERT_TRUE(connection.send("POST /cimom HTTP/1.1\r\nHost: h\r\nContent-Le"));
  EXPECT_TRUE(connection.isClosed());
  EXPECT_EQ(served.end(), 0);
}

/// From nothing but the address.
TEST_F(Client, FindsTheProfileAndFromItTheComputer) {
  const CimAnswer spaces =
      client.call("EnumerateInstances", "interop", classParameter("ClassName", "CIM_Namespace"));
  ASSERT_EQ(spaces.error, 0) << spaces.description;
  std::vector<std::string> names;
  for (const serve_test::Element* property : spaces.root.all("PROPERTY")) {
    if (property->attribute("NAME") == "Name") {
      names.push_back(property->first("VALUE").text);
    }
  }
  EXPECT_THAT(names, UnorderedElementsAre("root/cimv2", "root/interop"));

  const CimAnswer profiles =
      client.call("EnumerateInstances", "root/interop", classParameter("ClassName", "CIM_RegisteredProfile"));
  ASSERT_EQ(profiles.error, 0) << profiles.description;
  ASSERT_THAT(profiles.root.all("VALUE.NAMEDINSTANCE"), SizeIs(1));
  EXPECT_THAT(profiles.root.xml(), HasSubstr("<VALUE>Software Inventory</VALUE>"));
  const std::string profile = profiles.root.first("INSTANCENAME").xml();

  const CimAnswer central = client.call("AssociatorNames", "root/interop",
                                        instanceParameter("ObjectName", profile) +
                                            classParameter("AssocClass", "CIM_ElementConformsToProfile"));
  ASSERT_EQ(central.error, 0) << central.description;
  EXPECT_THAT(central.keys("InstanceID"), SizeIs(19));
  for (const serve_test::Element* path : central.root.all("LOCALNAMESPACEPATH")) {
    EXPECT_EQ(path->children.back().attribute("NAME"), "cimv2")
        << "where the instance is, not where it was asked for";
  }

  const CimAnswer computer =
      client.call("AssociatorNames", cimv2,
                  instanceParameter("ObjectName", central.root.first("INSTANCENAME").xml()) +
                      classParameter("AssocClass", "CIM_InstalledSoftwareIdentity"));
  ASSERT_EQ(computer.error, 0) << computer.description;
  EXPECT_THAT(computer.keys("Name"), ElementsAre("atlas"));
}

}  // namespace
