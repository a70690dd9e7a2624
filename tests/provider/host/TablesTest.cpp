// What object managers lack, and how they end what they gave: tables that are missing or short, results that
// refuse nulls, objects that live until the call returns.
#include <gmock/gmock.h>

#include "HostTest.h"

namespace {

using host::Answer;
using testing::Contains;

class HostTables : public HostTest {};

TEST_F(HostTables, OfTheFirstStandardAreEnough) {
  const std::vector<std::string> before = everything();
  cmpi.endFactoryEarly();
  ASSERT_EQ(cmpi.broker()->mft, nullptr) << "no memory table either";
  ASSERT_EQ(cmpi.broker()->xft, nullptr);
  EXPECT_EQ(everything(), before);
}

TEST_F(HostTables, WithoutStringsForMessagesAreEnough) {
  cmpi.factory.newString = nullptr;
  cmpi.endFactoryEarly();
  EXPECT_EQ(providers.enumerate(path(host::ports)).status, CMPI_RC_OK);
}

// A null among the answers gets a status, which changes nothing.
TEST_F(HostTables, OfResultsMayRefuseNulls) {
  for (const Answer& answer : {providers.names(softwareOf("193@d2"), host::installed),
                               providers.associators(softwareOf("193@d2"), host::installed)}) {
    EXPECT_EQ(answer.status, CMPI_RC_OK);
    EXPECT_EQ(answer.done, 1);
    EXPECT_THAT(answer.paths(), Contains("KELVO_ComputerSystem(beta)"));
    EXPECT_EQ(answer.nulls, 1);
  }
}

TEST_F(HostTables, OfTheSmallFootprintBrokerGetNoNulls) {
  cmpi.upcalls.brokerName = "RequestHandler";
  const host::Host sfcb(cmpi.broker());
  for (const Answer& answer :
       {sfcb.names(softwareOf("193@d2"), host::installed),
        sfcb.associators(softwareOf("193@d2"), host::installed), sfcb.names(path(host::bmc), host::bmc),
        sfcb.enumerate(path(host::installed))}) {
    EXPECT_EQ(answer.nulls, 0);
  }
}

TEST_F(HostTables, OfObjectsMayEndWithTheCall) {
  const std::vector<std::string> before = everything();
  for (int round = 0; round < 3; ++round) {
    cmpi.dropObjects();
    EXPECT_EQ(everything(), before);
  }
}

TEST_F(HostTables, OfUpcallsAreNoneOfTheEndpointProviders) {
  cmpi.upcalls.enumerateInstances = nullptr;  // whoever calls it ends the program
  for (const char* className : {host::computers, host::controllers, host::ports}) {
    const Answer names = providers.enumerateNames(path(className));
    EXPECT_EQ(names.status, CMPI_RC_OK);
    EXPECT_EQ(providers.enumerate(path(className)).paths(), names.paths());
  }
  EXPECT_EQ(providers.get(computer(host::computers, "alpha")).status, CMPI_RC_OK);
}

// The class's own library is another one than that of the classes that it asks for: an upcall never comes
// back to where it was made.
TEST_F(HostTables, OfUpcallsLeadToAnotherLibrary) {
  for (const char* className : {host::computers, host::controllers, host::ports}) {
    for (const char* asking : {host::software, host::installed, host::network, host::bmc, host::bios}) {
      EXPECT_NE(providers.instances.at(className)->ft, providers.instances.at(asking)->ft);
    }
  }
}

TEST_F(HostTables, OfUpcallsMayAnswerWithNothing) {
  cmpi.faults["enumerateInstances"] = tests::FakeCmpi::Fault::Both;
  for (const char* association : associationClasses) {
    const Answer answer = providers.names(softwareOf("26@f3"), association);
    EXPECT_EQ(answer.status, CMPI_RC_OK) << association;
    EXPECT_EQ(answer.done, 1);
  }
}

}  // namespace
