// The convenience names: each calls the table member that it is named after, with its arguments in their
// order.
#include "tests/support/FakeCmpi.h"

#include <cmpi/cmpimacs.h>
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <sstream>
#include <string>

namespace {

using ::testing::ElementsAre;
using tests::FakeCmpi;

const CMPIBroker* stubBroker = nullptr;
int hookCalls = 0;

CMPIStatus CMStubCleanup(CMPIInstanceMI*, const CMPIContext*, CMPIBoolean) {
  CMReturn(CMPI_RC_OK);
}
CMPIStatus CMStubEnumInstanceNames(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*,
                                   const CMPIObjectPath*) {
  CMReturn(CMPI_RC_ERR_ACCESS_DENIED);
}
CMPIStatus CMStubEnumInstances(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath*,
                               const char**) {
  CMReturn(CMPI_RC_ERR_INVALID_NAMESPACE);
}
CMPIStatus CMStubGetInstance(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath*,
                             const char**) {
  CMReturnWithChars(stubBroker, CMPI_RC_ERR_NOT_FOUND, "no such instance");
}
CMPIStatus CMStubCreateInstance(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath*,
                                const CMPIInstance*) {
  CMReturn(CMPI_RC_ERR_ALREADY_EXISTS);
}
CMPIStatus CMStubModifyInstance(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath*,
                                const CMPIInstance*, const char**) {
  CMReturn(CMPI_RC_ERR_NO_SUCH_PROPERTY);
}
CMPIStatus CMStubDeleteInstance(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*,
                                const CMPIObjectPath*) {
  CMReturn(CMPI_RC_ERR_INVALID_CLASS);
}
CMPIStatus CMStubExecQuery(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath*,
                           const char*, const char*) {
  CMReturn(CMPI_RC_ERR_INVALID_QUERY);
}
CMPIStatus CMStubAssociationCleanup(CMPIAssociationMI*, const CMPIContext*, CMPIBoolean) {
  CMReturn(CMPI_RC_OK);
}
CMPIStatus CMStubAssociators(CMPIAssociationMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath*,
                             const char*, const char*, const char*, const char*, const char**) {
  CMReturn(CMPI_RC_OK);
}
CMPIStatus CMStubAssociatorNames(CMPIAssociationMI*, const CMPIContext*, const CMPIResult*,
                                 const CMPIObjectPath*, const char*, const char*, const char*, const char*) {
  CMReturn(CMPI_RC_OK);
}
CMPIStatus CMStubReferences(CMPIAssociationMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath*,
                            const char*, const char*, const char**) {
  CMReturn(CMPI_RC_OK);
}
CMPIStatus CMStubReferenceNames(CMPIAssociationMI*, const CMPIContext*, const CMPIResult*,
                                const CMPIObjectPath*, const char*, const char*) {
  CMReturn(CMPI_RC_OK);
}
CMInstanceMIStub(CMStub, CMStubProvider, stubBroker, CMNoHook)
    CMAssociationMIStub(CMStub, CMStubProvider, stubBroker, ++hookCalls)

        class CmpiStubs : public ::testing::Test {
 protected:
  void TearDown() override { stubBroker = nullptr; }
  FakeCmpi cmpi;
};

TEST_F(CmpiStubs, instanceStubMakesTheTable) {
  const CMPIInstanceMI* mi = CMStubProvider_Create_InstanceMI(cmpi.broker(), nullptr, nullptr);
  EXPECT_EQ(stubBroker, cmpi.broker());
  EXPECT_EQ(mi->hdl, nullptr);
  EXPECT_EQ(mi->ft->ftVersion, 200);
  EXPECT_EQ(mi->ft->miVersion, 200);
  EXPECT_STREQ(mi->ft->miName, "instanceCMStubProvider");
  EXPECT_EQ(mi->ft->cleanup, &CMStubCleanup);
  EXPECT_EQ(mi->ft->enumerateInstanceNames, &CMStubEnumInstanceNames);
  EXPECT_EQ(mi->ft->enumerateInstances, &CMStubEnumInstances);
  EXPECT_EQ(mi->ft->getInstance, &CMStubGetInstance);
  EXPECT_EQ(mi->ft->createInstance, &CMStubCreateInstance);
  EXPECT_EQ(mi->ft->modifyInstance, &CMStubModifyInstance);
  EXPECT_EQ(mi->ft->deleteInstance, &CMStubDeleteInstance);
  EXPECT_EQ(mi->ft->execQuery, &CMStubExecQuery);
  EXPECT_EQ(mi, CMStubProvider_Create_InstanceMI(cmpi.broker(), nullptr, nullptr));
}

TEST_F(CmpiStubs, associationStubMakesTheTableAndRunsItsHook) {
  hookCalls = 0;
  const CMPIAssociationMI* mi = CMStubProvider_Create_AssociationMI(cmpi.broker(), nullptr, nullptr);
  EXPECT_EQ(hookCalls, 1);
  EXPECT_EQ(stubBroker, cmpi.broker());
  EXPECT_EQ(mi->ft->ftVersion, 200);
  EXPECT_EQ(mi->ft->miVersion, 200);
  EXPECT_STREQ(mi->ft->miName, "associationCMStubProvider");
  EXPECT_EQ(mi->ft->cleanup, &CMStubAssociationCleanup);
  EXPECT_EQ(mi->ft->associators, &CMStubAssociators);
  EXPECT_EQ(mi->ft->associatorNames, &CMStubAssociatorNames);
  EXPECT_EQ(mi->ft->references, &CMStubReferences);
  EXPECT_EQ(mi->ft->referenceNames, &CMStubReferenceNames);
}

TEST_F(CmpiStubs, returnsCarryCodeAndText) {
  const CMPIInstanceMI* mi = CMStubProvider_Create_InstanceMI(cmpi.broker(), nullptr, nullptr);
  const CMPIStatus plain = mi->ft->deleteInstance(nullptr, nullptr, nullptr, nullptr);
  EXPECT_EQ(plain.rc, CMPI_RC_ERR_INVALID_CLASS);
  EXPECT_EQ(plain.msg, nullptr);
  const CMPIStatus withText = mi->ft->getInstance(nullptr, nullptr, nullptr, nullptr, nullptr);
  EXPECT_EQ(withText.rc, CMPI_RC_ERR_NOT_FOUND);
  ASSERT_NE(withText.msg, nullptr);
  EXPECT_STREQ(CMGetCharPtr(withText.msg), "no such instance");
}

TEST(CmpiMacs, statusMayBeNull) {
  FakeCmpi cmpi;
  CMSetStatus(nullptr, CMPI_RC_ERR_FAILED);
  CMSetStatusWithString(nullptr, CMPI_RC_ERR_FAILED, nullptr);
  CMSetStatusWithChars(cmpi.broker(), nullptr, CMPI_RC_ERR_FAILED, "text");
  EXPECT_TRUE(cmpi.calls.empty());
  CMPIStatus status{CMPI_RC_OK, cmpi.string("old")};
  CMSetStatus(&status, CMPI_RC_ERR_FAILED);
  EXPECT_EQ(status.rc, CMPI_RC_ERR_FAILED);
  EXPECT_EQ(status.msg, nullptr);
}

TEST(CmpiMacs, pathsAndInstances) {
  FakeCmpi cmpi;
  CMPIStatus status{CMPI_RC_OK, nullptr};
  CMPIObjectPath* path = CMNewObjectPath(cmpi.broker(), "root/test", "Thing", &status);
  EXPECT_STREQ(CMGetCharsPtr(CMGetNameSpace(path, &status), &status), "root/test");
  EXPECT_STREQ(CMGetCharsPtr(CMGetClassName(path, &status), &status), "Thing");
  const CMPIUint16 number = 7;
  CMAddKey(path, "Name", "one", CMPI_chars);
  CMAddKey(path, "Number", &number, CMPI_uint16);
  EXPECT_EQ(CMGetKeyCount(path, &status), 2U);
  EXPECT_EQ(FakeCmpi::text(CMGetKey(path, "Name", &status)), "one");
  CMPIString* name = nullptr;
  EXPECT_EQ(CMGetKeyAt(path, 1, &name, &status).value.uint16, 7);
  EXPECT_STREQ(CMGetCharPtr(name), "Number");

  CMPIInstance* instance = CMNewInstance(cmpi.broker(), path, &status);
  CMSetProperty(instance, "Count", &number, CMPI_uint16);
  EXPECT_EQ(CMGetProperty(instance, "Count", &status).value.uint16, 7);
  EXPECT_EQ(CMGetPropertyCount(instance, &status), 1U);
  EXPECT_EQ(CMGetPropertyAt(instance, 0, &name, &status).value.uint16, 7);
  EXPECT_STREQ(CMGetCharPtr(name), "Count");
  EXPECT_TRUE(CMIsNullValue(CMPIData{CMPI_string, CMPI_nullValue, {}}));
  EXPECT_FALSE(CMIsNullValue(CMGetProperty(instance, "Count", &status)));
  EXPECT_TRUE(CMIsArray(CMPIData{CMPI_uint16A, CMPI_goodValue, {}}));
  EXPECT_FALSE(CMIsArray(CMPIData{CMPI_uint16, CMPI_goodValue, {}}));
  EXPECT_FALSE(CMIsNullObject(instance));
  EXPECT_TRUE(CMIsNullObject(static_cast<CMPIInstance*>(nullptr)));
  const CMPIInstance nothingBehind{nullptr, nullptr};
  EXPECT_TRUE(CMIsNullObject(&nothingBehind));
}

TEST(CmpiMacs, arraysAndClasses) {
  FakeCmpi cmpi;
  cmpi.parentOf["Thing"] = "CIM_Thing";
  CMPIStatus status{CMPI_RC_OK, nullptr};
  EXPECT_EQ(CMClassPathIsA(cmpi.broker(), cmpi.path("root", "Thing"), "CIM_Thing", &status), 1);
  EXPECT_EQ(CMClassPathIsA(cmpi.broker(), cmpi.path("root", "CIM_Thing"), "Thing", &status), 0);
  CMPIArray* array = CMNewArray(cmpi.broker(), 2, CMPI_uint16, &status);
  const CMPIUint16 number = 9;
  CMSetArrayElementAt(array, 1, &number, CMPI_uint16);
  EXPECT_EQ(FakeCmpi::elements(array).at(1).value.uint16, 9);
  EXPECT_EQ(CMSetArrayElementAt(array, 2, &number, CMPI_uint16).rc, CMPI_RC_ERR_INVALID_PARAMETER);
}

// A result that keeps in its handle a record of what it was given.
std::ostringstream& record(const CMPIResult* result) {
  return *static_cast<std::ostringstream*>(result->hdl);
}

TEST(CmpiMacs, resultsTakeWhatTheyAreGiven) {
  FakeCmpi cmpi;
  CMPIResultFT table{};
  table.returnData = [](const CMPIResult* result, const CMPIValue* value, const CMPIType type) {
    record(result) << "data " << type << " " << value->uint32 << ";";
    return CMPIStatus{CMPI_RC_OK, nullptr};
  };
  table.returnInstance = [](const CMPIResult* result, const CMPIInstance* instance) {
    record(result) << "instance " << (instance->hdl != nullptr) << ";";
    return CMPIStatus{CMPI_RC_OK, nullptr};
  };
  table.returnObjectPath = [](const CMPIResult* result, const CMPIObjectPath* path) {
    record(result) << "path " << FakeCmpi::classOf(path) << ";";
    return CMPIStatus{CMPI_RC_OK, nullptr};
  };
  table.returnDone = [](const CMPIResult* result) {
    record(result) << "done";
    return CMPIStatus{CMPI_RC_ERR_FAILED, nullptr};
  };
  std::ostringstream records;
  const CMPIResult result{&records, &table};
  const CMPIUint32 number = 42;
  CMReturnData(&result, &number, CMPI_uint32);
  CMReturnInstance(&result, cmpi.instance("root", "Thing"));
  CMReturnObjectPath(&result, cmpi.path("root", "Thing"));
  EXPECT_EQ(CMReturnDone(&result).rc, CMPI_RC_ERR_FAILED);
  EXPECT_EQ(records.str(), "data 160 42;instance 1;path Thing;done");
}

/// The texts of an upcall, in the order in which the table member gets them.
std::vector<std::string> upcallTexts;

TEST(CmpiMacs, upcallsHandOnTheirArgumentsInOrder) {
  FakeCmpi cmpi;
  CMPIBrokerFT table{};
  table.associators = [](const CMPIBroker*, const CMPIContext*, const CMPIObjectPath*, const char* assocClass,
                         const char* resultClass, const char* role, const char* resultRole,
                         const char** properties, CMPIStatus* status) -> CMPIEnumeration* {
    upcallTexts = {assocClass, resultClass, role, resultRole, properties[0]};
    CMSetStatus(status, CMPI_RC_ERR_ACCESS_DENIED);
    return nullptr;
  };
  table.references = [](const CMPIBroker*, const CMPIContext*, const CMPIObjectPath*, const char* resultClass,
                        const char* role, const char** properties, CMPIStatus*) -> CMPIEnumeration* {
    upcallTexts = {resultClass, role, properties[0]};
    return nullptr;
  };
  table.enumerateInstances = [](const CMPIBroker*, const CMPIContext*, const CMPIObjectPath* path,
                                const char** properties, CMPIStatus*) -> CMPIEnumeration* {
    upcallTexts = {FakeCmpi::classOf(path), properties[0]};
    return nullptr;
  };
  CMPIBroker broker{};
  broker.bft = &table;
  const CMPIObjectPath* path = cmpi.path("root", "Thing");
  const char* properties[] = {"Name", nullptr};
  CMPIStatus status{CMPI_RC_OK, nullptr};
  CBAssociators(&broker, nullptr, path, "Assoc", "Result", "Role", "ResultRole", properties, &status);
  EXPECT_THAT(upcallTexts, ElementsAre("Assoc", "Result", "Role", "ResultRole", "Name"));
  EXPECT_EQ(status.rc, CMPI_RC_ERR_ACCESS_DENIED);
  CBReferences(&broker, nullptr, path, "Result", "Role", properties, &status);
  EXPECT_THAT(upcallTexts, ElementsAre("Result", "Role", "Name"));
  CBEnumInstances(&broker, nullptr, path, properties, &status);
  EXPECT_THAT(upcallTexts, ElementsAre("Thing", "Name"));
}

}  // namespace
