// What the provider does not answer, and what it answers when the object manager fails, over
// machines/several.json.
#include <gmock/gmock.h>

#include <dlfcn.h>

#include <utility>
#include <vector>

#include "Requests.h"

namespace {

using testing::HasSubstr;
using testing::IsEmpty;
using tests::FakeCmpi;
using Refusals = Requests;

TEST_F(Refusals, GetInstanceOfWhatIsNotThereIsNotFound) {
  const Answer noPort = get(ports, {{"SystemCreationClassName", "KELVO_ComputerSystem"},
                                    {"SystemName", "boreas"},
                                    {"CreationClassName", "KELVO_NetworkPort"},
                                    {"DeviceID", "0000:02:00.0/2"}});
  EXPECT_EQ(noPort.status, CMPI_RC_ERR_NOT_FOUND) << "it is one of another computer";
  EXPECT_THAT(noPort.message, HasSubstr("there is no KELVO_NetworkPort"));
  EXPECT_THAT(noPort.message, HasSubstr(R"(SystemName="boreas")"));
  EXPECT_THAT(noPort.message, HasSubstr(R"(DeviceID="0000:02:00.0/2")"));
  EXPECT_THAT(noPort.instances, IsEmpty());
  EXPECT_EQ(noPort.done, 0);

  EXPECT_EQ(get(controllers, {{"CreationClassName", "KELVO_SPComputerSystem"}, {"Name", "boreas"}}).status,
            CMPI_RC_ERR_NOT_FOUND);
  EXPECT_EQ(get(computers, {{"CreationClassName", "KELVO_SPComputerSystem"}, {"Name", "atlas"}}).status,
            CMPI_RC_ERR_NOT_FOUND);
}

TEST_F(Refusals, GetInstanceNeedsEveryKey) {
  const Answer noName = get(computers, {{"CreationClassName", "KELVO_ComputerSystem"}});
  EXPECT_EQ(noName.status, CMPI_RC_ERR_INVALID_PARAMETER);
  EXPECT_THAT(noName.message, HasSubstr("lacks the key Name"));
  const Answer deviceAlone = get(ports, {{"DeviceID", "0000:02:00.0/1"}});
  EXPECT_EQ(deviceAlone.status, CMPI_RC_ERR_INVALID_PARAMETER);
  EXPECT_THAT(deviceAlone.message, HasSubstr("lacks the key SystemCreationClassName"));
}

TEST_F(Refusals, OtherClassesAreInvalid) {
  for (const char* className : {"KELVO_SoftwareIdentity", "CIM_ComputerSystem", "Nonsense", ""}) {
    for (const Answer& answer : {enumerateNames(className), enumerate(className), get(className, {})}) {
      EXPECT_EQ(answer.status, CMPI_RC_ERR_INVALID_CLASS) << className;
      EXPECT_THAT(answer.message,
                  HasSubstr("KELVO_ComputerSystem, KELVO_SPComputerSystem, KELVO_NetworkPort"));
      EXPECT_EQ(answer.done, 0);
    }
  }
}

TEST_F(Refusals, NothingCanBeWrittenOrQueried) {
  Answer delivered;
  const CMPIResult result{&delivered, &resultTable};
  const CMPIObjectPath* where = path(computers);
  const CMPIInstance* what = cmpi.instance("root/cimv2", computers);
  const auto* functions = provider->ft;
  const std::vector<std::pair<const char*, Answer>> answers{
      {"CreateInstance", answerOf(functions->createInstance(provider, nullptr, &result, where, what))},
      {"ModifyInstance",
       answerOf(functions->modifyInstance(provider, nullptr, &result, where, what, nullptr))},
      {"DeleteInstance", answerOf(functions->deleteInstance(provider, nullptr, &result, where))},
      {"ExecQuery", answerOf(functions->execQuery(provider, nullptr, &result, where, "select *", "WQL"))},
  };
  for (const auto& [operation, answer] : answers) {
    EXPECT_EQ(answer.status, CMPI_RC_ERR_NOT_SUPPORTED);
    EXPECT_THAT(answer.message, HasSubstr(operation));
  }
  EXPECT_EQ(delivered.done, 0);
}

// ---- The object manager fails.

class ObjectManagerFault : public Requests,
                           public testing::WithParamInterface<std::pair<const char*, FakeCmpi::Fault>> {};

TEST_P(ObjectManagerFault, IsAStatusWithAMessage) {
  const CMPIObjectPath* whole =
      path(computers, {{"CreationClassName", "KELVO_ComputerSystem"}, {"Name", "atlas"}});
  cmpi.faults[GetParam().first] = GetParam().second;
  for (const Answer& answer : {enumerate(whole), get(whole)}) {
    EXPECT_NE(answer.status, CMPI_RC_OK);
    EXPECT_NE(answer.message, "(none)");
    EXPECT_NE(answer.message, "");
    EXPECT_THAT(answer.instances, IsEmpty());
    EXPECT_EQ(answer.done, 0);
  }
  cmpi.faults.clear();
  EXPECT_EQ(get(whole).status, CMPI_RC_OK) << "the next request is answered as ever";
}

using Fault = FakeCmpi::Fault;

std::string nameOf(const testing::TestParamInfo<std::pair<const char*, Fault>>& info) {
  const auto& [call, fault] = info.param;
  return std::string(call) + (fault == Fault::Status ? "Status" : fault == Fault::Null ? "Null" : "Both");
}

INSTANTIATE_TEST_SUITE_P(
    Calls, ObjectManagerFault,
    testing::Values(std::pair("newObjectPath", Fault::Null), std::pair("newObjectPath", Fault::Both),
                    std::pair("newInstance", Fault::Null), std::pair("newInstance", Fault::Both),
                    std::pair("newArray", Fault::Null), std::pair("newArray", Fault::Both),
                    std::pair("setElementAt", Fault::Status), std::pair("addKey", Fault::Status),
                    std::pair("setProperty", Fault::Status), std::pair("getKeyCount", Fault::Status),
                    std::pair("getNameSpace", Fault::Both), std::pair("getClassName", Fault::Both)),
    nameOf);

// Object managers count keys of a path that nobody has set, and fail to read them.
TEST_F(Refusals, AKeyThatCannotBeReadIsNotSet) {
  const CMPIObjectPath* whole =
      path(computers, {{"CreationClassName", "KELVO_ComputerSystem"}, {"Name", "atlas"}});
  cmpi.faults["getKeyAt"] = FakeCmpi::Fault::Both;
  EXPECT_EQ(get(whole).status, CMPI_RC_ERR_INVALID_PARAMETER);
  EXPECT_EQ(enumerate(whole).instances.size(), enumerate(computers).instances.size());
}

TEST_F(Refusals, WhatAClientSentIsCleanInAMessage) {
  const Answer answer =
      get(computers, {{"CreationClassName", "KELVO_ComputerSystem"}, {"Name", "a\xFF\n\xEF\xBF\xBFz"}});
  EXPECT_EQ(answer.status, CMPI_RC_ERR_NOT_FOUND);
  EXPECT_THAT(answer.message, HasSubstr("Name=\"a\xEF\xBF\xBD \xEF\xBF\xBDz\""));
}

TEST_F(Refusals, NamesFailWhereAKeyCannotBeSet) {
  cmpi.faults["addKey"] = FakeCmpi::Fault::Status;
  const Answer answer = enumerateNames(ports);
  EXPECT_EQ(answer.status, CMPI_RC_ERR_FAILED);
  EXPECT_THAT(answer.message, HasSubstr("set the key SystemCreationClassName of KELVO_NetworkPort"));
  EXPECT_THAT(answer.paths, IsEmpty());
}

TEST_F(Refusals, ResultThatTakesNoMoreEndsTheWalkWithItsStatus) {
  const auto refuse = CMPIStatus{CMPI_RC_ERR_ACCESS_DENIED, nullptr};
  static int calls = 0;
  calls = 0;
  resultTable.returnObjectPath = [](const CMPIResult*, const CMPIObjectPath*) {
    ++calls;
    return CMPIStatus{CMPI_RC_ERR_ACCESS_DENIED, nullptr};
  };
  const Answer names = enumerateNames(ports);
  EXPECT_EQ(names.status, refuse.rc);
  EXPECT_THAT(names.message, HasSubstr("take a path of KELVO_NetworkPort"));
  EXPECT_EQ(calls, 1);
  EXPECT_EQ(names.done, 0);

  resultTable.returnInstance = [](const CMPIResult*, const CMPIInstance*) {
    return CMPIStatus{CMPI_RC_ERR_ACCESS_DENIED, nullptr};
  };
  EXPECT_EQ(enumerate(ports).status, refuse.rc);
  EXPECT_EQ(get(computers, {{"CreationClassName", "KELVO_ComputerSystem"}, {"Name", "atlas"}}).status,
            refuse.rc);
}

TEST_F(Refusals, ResultThatTakesNoEndIsAFailure) {
  resultTable.returnDone = [](const CMPIResult*) { return CMPIStatus{CMPI_RC_ERR_FAILED, nullptr}; };
  EXPECT_EQ(enumerate(ports).status, CMPI_RC_ERR_FAILED);
}

TEST_F(Refusals, StatusStandsWithoutAMessageWhereNoneCanBeMade) {
  cmpi.faults["newString"] = FakeCmpi::Fault::Both;
  const Answer answer = enumerate("Nonsense");
  EXPECT_EQ(answer.status, CMPI_RC_ERR_INVALID_CLASS);
  EXPECT_EQ(answer.message, "(none)");
}

// Several object managers in one process: each interface has its own broker.
TEST_F(Refusals, EachInterfaceUsesTheBrokerThatItsFactoryWasGiven) {
  FakeCmpi other;
  void* library = dlopen(PROVIDER_LIBRARY, RTLD_NOW | RTLD_LOCAL);
  using Factory = CMPIInstanceMI* (*)(const CMPIBroker*, const CMPIContext*, CMPIStatus*);
  const auto factory = reinterpret_cast<Factory>(dlsym(library, "KelvoEndpointProvider_Create_InstanceMI"));
  CMPIInstanceMI* second = factory(other.broker(), nullptr, nullptr);
  enumerate(computers);
  EXPECT_THAT(other.calls, IsEmpty());
  EXPECT_EQ(second->ft->cleanup(second, nullptr, 1).rc, CMPI_RC_OK);
  EXPECT_EQ(enumerate(computers).status, CMPI_RC_OK) << "the other's end is not this one's";
  dlclose(library);
}

}  // namespace
