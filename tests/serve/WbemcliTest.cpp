// Debian's wbemcli asks a live endpoint, over HTTP and over HTTPS with a login. What it must print was read
// off examples/server.json by hand.
#include "Secrets.h"
#include "Served.h"
#include "Wbemcli.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <memory>

namespace {

using serve_test::Printed;
using serve_test::Secrets;
using serve_test::Served;
using serve_test::ServeStart;
using serve_test::WbemServer;
using testing::Contains;
using testing::Each;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::IsSupersetOf;
using testing::Not;
using testing::Pair;
using testing::SizeIs;
using testing::StartsWith;
using testing::UnorderedElementsAre;

const std::string identities = "root/cimv2:KELVO_SoftwareIdentity";
const std::string atlas =
    R"(root/cimv2:KELVO_ComputerSystem.CreationClassName="KELVO_ComputerSystem",Name="atlas")";
const std::string controller =
    R"(root/cimv2:KELVO_SPComputerSystem.CreationClassName="KELVO_SPComputerSystem",Name="atlas")";

std::string identity(const std::string& id) {
  return identities + ".InstanceID=\"" + id + "\"";
}

std::string port(const std::string& id) {
  return R"(root/cimv2:KELVO_NetworkPort.SystemCreationClassName="KELVO_ComputerSystem",SystemName="atlas",)"
         R"(CreationClassName="KELVO_NetworkPort",DeviceID=")" +
         id + "\"";
}

/// What every software identity conforms to.
const std::string profile =
    R"(root/interop:CIM_RegisteredProfile.InstanceID="KELVO:DSP1023-SoftwareInventory-1.0.1")";

// As the README lists them.
const std::string bios = identity("1@a1f98e803e58ca6");
const std::string bmc = identity("1@b3512e37f41e292");
const std::string networkFirmware = identity("86975819633663267@607fc77bab724a2");

/// The parameter: with TLS and a login.
class Wbemcli : public testing::TestWithParam<bool> {
 protected:
  void SetUp() override {
    ServeStart start;
    if (GetParam()) {
      secrets_ = std::make_unique<Secrets>();
      const std::vector<std::string> options = secrets_->options();
      start.arguments.insert(start.arguments.end(), options.begin(), options.end());
    }
    served_ = std::make_unique<Served>(start);
    const std::string place = "127.0.0.1:" + std::to_string(served_->port());
    if (GetParam()) {
      server = {"https://ada:analytical@" + place, {"-cacert", secrets_->file("ca.pem").string()}};
    } else {
      server = {"http://any:one@" + place};
    }
  }

  void TearDown() override { EXPECT_EQ(served_->end(), 0) << served_->log(); }

  [[nodiscard]] Printed ask(const std::string& operation, const std::string& object) const {
    return server.ask(operation, object);
  }

  void expectError(const std::string& operation, const std::string& object, const std::string& error) const {
    const Printed printed = ask(operation, object);
    EXPECT_NE(printed.exitCode, 0) << operation << " " << object;
    EXPECT_THAT(printed.error, HasSubstr(error)) << operation << " " << object;
    EXPECT_THAT(printed.objects, IsEmpty());
  }

  WbemServer server;

 private:
  std::unique_ptr<Secrets> secrets_;
  std::unique_ptr<Served> served_;
};

TEST_P(Wbemcli, ClassNamesAndClasses) {
  EXPECT_THAT(
      ask("ecn", "root/cimv2:").paths(),
      IsSupersetOf({"root/cimv2:CIM_ManagedElement", "root/cimv2:KELVO_SoftwareIdentity",
                    "root/cimv2:KELVO_NetworkSoftwareIdentity", "root/cimv2:KELVO_SPComputerSystem"}));
  EXPECT_THAT(ask("ecn", "root/cimv2:CIM_System").paths(),
              UnorderedElementsAre("root/cimv2:CIM_ComputerSystem", "root/cimv2:KELVO_ComputerSystem",
                                   "root/cimv2:KELVO_SPComputerSystem"));
  const Printed classes = ask("ec", "root/cimv2:CIM_SoftwareIdentity");
  ASSERT_THAT(classes.objects, SizeIs(1)) << classes.error;
  EXPECT_THAT(classes.objects[0].path, StartsWith(identities));
  EXPECT_THAT(classes.objects[0].properties,
              IsSupersetOf({Pair("InstanceID", ""), Pair("VersionString", "")}));
  const Printed one = ask("gc", identities);
  ASSERT_THAT(one.objects, SizeIs(1)) << one.error;
  EXPECT_THAT(one.objects[0].path, StartsWith(identities));
}

TEST_P(Wbemcli, InstancesAndTheirNames) {
  const Printed names = ask("ein", identities);
  EXPECT_EQ(names.exitCode, 0) << names.error;
  // 15 firmware nodes, the backup BIOS and three drivers.
  EXPECT_THAT(names.paths(), SizeIs(19));
  EXPECT_THAT(names.paths(), IsSupersetOf({bios, bmc, networkFirmware, identity("1@fd953a9a0e53b1c")}));

  const Printed instances = ask("ei", identities);
  EXPECT_EQ(instances.exitCode, 0) << instances.error;
  EXPECT_EQ(instances.paths(), names.paths());
  EXPECT_THAT(instances.values("VersionString"),
              UnorderedElementsAre("\"2.14.1\"", "\"2.09.0\"", "\"SH-17 rev 4\"", "\"7.31\"", "\"1.08\"",
                                   "\"0x4F12\"", "\"10.3\"", "\"1.22\"", "\"Q18-0419\"", "\"4.62-OT\"",
                                   "\"8.02.17\"", "\"HD31C\"", "\"HV31A\"", "\"12.47-V25\"", "\"3.08\"",
                                   "\"6.13 KLV613F\"", "\"6.13.4\"", "\"8.02-d5\"", "\"12.46-d3\""));
  EXPECT_THAT(instances.values("IsEntity"), Each("")) << "never set";
}

TEST_P(Wbemcli, ASuperclassHasTheInstancesOfAllBelow) {
  EXPECT_THAT(ask("ein", "root/cimv2:CIM_ComputerSystem").paths(), UnorderedElementsAre(atlas, controller));
  EXPECT_THAT(ask("ein", "root/cimv2:kelvo_networkport").paths(),
              ElementsAre(port("0000:3b:00.0/1"), port("0000:3b:00.0/2"), port("0000:af:00.0/1"),
                          port("0000:18:00.0/1")));
  EXPECT_THAT(ask("ein", "ROOT/CIMV2:KELVO_NETWORKPORT").objects, SizeIs(4));
}

TEST_P(Wbemcli, OneInstance) {
  const Printed printed = ask("gi", bmc);
  ASSERT_THAT(printed.objects, SizeIs(1)) << printed.error;
  EXPECT_EQ(printed.objects[0].path, bmc);
  EXPECT_THAT(
      printed.objects[0].properties,
      IsSupersetOf({Pair("InstanceID", "\"1@b3512e37f41e292\""), Pair("Description", "\"BMC Firmware\""),
                    Pair("Name", "\"Service Processor\""), Pair("Manufacturer", "\"Kelvo\""),
                    Pair("MajorVersion", "7"), Pair("MinorVersion", "31"), Pair("VersionString", "\"7.31\""),
                    Pair("BuildID", "\"KLV731C\""), Pair("Classifications", "10"),
                    Pair("ClassificationDescriptions", "\"Firmware\""),
                    Pair("ReleaseDate", "20250115000000.000000+000"), Pair("Caption", "")}));
  const Printed some = server.ask("gi", bmc, {"Name,VersionString"});
  ASSERT_THAT(some.objects, SizeIs(1)) << some.error;
  EXPECT_THAT(some.objects[0].properties, Contains(Pair("VersionString", "\"7.31\"")));
  EXPECT_THAT(some.objects[0].properties, Not(Contains(Pair("Manufacturer", testing::_))));
}

TEST_P(Wbemcli, AssociatorsInBothDirections) {
  EXPECT_THAT(ask("ain", bmc).paths(), UnorderedElementsAre(profile, atlas, controller));
  EXPECT_THAT(ask("ain", bios).paths(), UnorderedElementsAre(profile, atlas))
      << "the computer once, though two associations lead there";
  EXPECT_THAT(ask("ain", networkFirmware).paths(),
              UnorderedElementsAre(profile, atlas, port("0000:3b:00.0/1")));
  EXPECT_THAT(ask("ain", controller).paths(), ElementsAre(bmc));
  EXPECT_THAT(ask("ain", port("0000:3b:00.0/2")).paths(),
              UnorderedElementsAre(networkFirmware, identity("86975819633663267@83c1823c6090d0a")));

  EXPECT_THAT(ask("ai", atlas).values("VersionString"), SizeIs(19));
  const Printed ports = ask("ai", networkFirmware);
  EXPECT_THAT(ports.paths(), UnorderedElementsAre(profile, atlas, port("0000:3b:00.0/1")));
  EXPECT_THAT(ports.values("PermanentAddress"), Contains(HasSubstr("02005e100001")))
      << "as KELVO_NetworkPort has it";
}

TEST_P(Wbemcli, AssociatorsNarrowed) {
  EXPECT_THAT(server.ask({"-ac", "KELVO_BIOSSoftwareIdentity"}, "ain", atlas).paths(), ElementsAre(bios));
  EXPECT_THAT(server.ask({"-arc", "KELVO_NetworkPort"}, "ain", networkFirmware).paths(),
              ElementsAre(port("0000:3b:00.0/1")));
  EXPECT_THAT(server.ask({"-ar", "Antecedent"}, "ain", networkFirmware).paths(),
              ElementsAre(port("0000:3b:00.0/1")));
  EXPECT_THAT(server.ask({"-arr", "System"}, "ain", networkFirmware).paths(), ElementsAre(atlas));
  EXPECT_THAT(server.ask({"-ac", "KELVO_BMCSoftwareIdentity"}, "ai", bios).objects, IsEmpty());
}

TEST_P(Wbemcli, ReferencesAreRefused) {
  expectError("rin", atlas, "(7) CIM_ERR_NOT_SUPPORTED");
  expectError("ri", bmc, "(7) CIM_ERR_NOT_SUPPORTED");
}

TEST_P(Wbemcli, WhatIsNotThereHasTheStandardsStatus) {
  expectError("ei", "root/cimv2:KELVO_Nothing", "(5) CIM_ERR_INVALID_CLASS");
  expectError("ein", "root/cimv2:KELVO_Nothing", "(5) CIM_ERR_INVALID_CLASS");
  expectError("gc", "root/cimv2:KELVO_Nothing", "(6) CIM_ERR_NOT_FOUND");
  expectError("ei", "root/nowhere:KELVO_SoftwareIdentity", "(3) CIM_ERR_INVALID_NAMESPACE");
  expectError("ecn", "root/nowhere:", "(3) CIM_ERR_INVALID_NAMESPACE");
  expectError("gi", identity("1@beef"), "(6) CIM_ERR_NOT_FOUND");
  expectError("gi", identities + ".Wrong=\"1@b3512e37f41e292\"", "(4) CIM_ERR_INVALID_PARAMETER");
  expectError("ain", "root/cimv2:KELVO_Nothing.Name=\"x\"", "(4) CIM_ERR_INVALID_PARAMETER");
}

TEST_P(Wbemcli, NothingChanges) {
  EXPECT_EQ(server.ask("mi", bmc, {"Name=other"}).exitCode, 0) << "answered OK";
  EXPECT_THAT(ask("gi", bmc).values("Name"), ElementsAre("\"Service Processor\""));
  expectError("di", bmc, "(7) CIM_ERR_NOT_SUPPORTED");
  EXPECT_THAT(server.ask("ci", identity("1@new"), {"Name=new"}).error,
              HasSubstr("(7) CIM_ERR_NOT_SUPPORTED"));
}

INSTANTIATE_TEST_SUITE_P(Over, Wbemcli, testing::Bool(), [](const testing::TestParamInfo<bool>& over) {
  return over.param ? std::string("HttpsWithALogin") : std::string("Http");
});

TEST(WbemcliLogin, IsNeededAndMustBeRight) {
  const Secrets secrets;
  ServeStart start;
  const std::vector<std::string> options = secrets.options();
  start.arguments.insert(start.arguments.end(), options.begin(), options.end());
  Served served(start);
  const std::string place = "127.0.0.1:" + std::to_string(served.port());
  const std::vector<std::string> trusting{"-cacert", secrets.file("ca.pem").string()};
  EXPECT_THAT((WbemServer{"https://ada:analytical@" + place, trusting}.ask("ein", identities).objects),
              SizeIs(19));
  EXPECT_THAT((WbemServer{"https://ada:analytical@" + place, {"-noverify"}}.ask("ein", identities).objects),
              SizeIs(19));
  for (const char* login : {"ada:wrong@", "bob:analytical@", ""}) {
    const Printed refused =
        WbemServer{std::string("https://") + login + place, trusting}.ask("ein", identities);
    EXPECT_NE(refused.exitCode, 0) << login;
    EXPECT_THAT(refused.objects, IsEmpty()) << login;
  }
  EXPECT_TRUE(served.logs("bob")) << served.log();
  EXPECT_EQ(served.end(), 0);
}

}  // namespace
