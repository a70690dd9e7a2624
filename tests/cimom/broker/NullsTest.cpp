// Every function that takes a handle, called with none: a status, and no crash, with and without a place for
// it.
#include "Fixture.h"

#include <cimom/broker/Context.h>
#include <cimom/broker/Enumeration.h>
#include <cimom/broker/Result.h>

#include <cimom/broker/Tables.h>

namespace cimom {
namespace {

class NullsTest : public BrokerTest {
 protected:
  /// Calls twice: once for the status, once without asking for it.
  template <class Function, class... Arguments>
  void expectStatus(CMPIrc expected, Function function, Arguments... arguments) {
    CMPIStatus status{CMPI_RC_ERROR, nullptr};
    (void)function(arguments..., &status);
    EXPECT_EQ(status.rc, expected);
    (void)function(arguments..., nullptr);
  }

  template <class Handle, class Table>
  void expectCloneAndReleaseRefused(const Table& table) {
    const Handle empty{};
    for (const Handle* const handle : {static_cast<const Handle*>(nullptr), &empty}) {
      expectStatus(CMPI_RC_ERR_INVALID_HANDLE, table.clone, handle);
      EXPECT_EQ(table.release(const_cast<Handle*>(handle)).rc, CMPI_RC_ERR_INVALID_HANDLE);
    }
  }

  static constexpr CMPIrc noHandle = CMPI_RC_ERR_INVALID_HANDLE;
  static constexpr CMPIrc noParameter = CMPI_RC_ERR_INVALID_PARAMETER;
};

TEST_F(NullsTest, NoHandleCanBeClonedOrReleased) {
  expectCloneAndReleaseRefused<CMPIString>(stringTable);
  expectCloneAndReleaseRefused<CMPIDateTime>(dateTimeTable);
  expectCloneAndReleaseRefused<CMPIArray>(arrayTable);
  expectCloneAndReleaseRefused<CMPIObjectPath>(objectPathTable);
  expectCloneAndReleaseRefused<CMPIInstance>(instanceTable);
  expectCloneAndReleaseRefused<CMPIContext>(contextTable);
  expectCloneAndReleaseRefused<CMPIArgs>(argsTable);
  expectCloneAndReleaseRefused<CMPIEnumeration>(enumerationTable);
  expectCloneAndReleaseRefused<CMPIResult>(resultTable);
}

TEST_F(NullsTest, ObjectPath) {
  const CMPIObjectPathFT& ft = objectPathTable;
  CMPIObjectPath* const none = nullptr;
  CMPIObjectPath* const path = newPath();
  const CMPIValue* const value = chars("x");
  expectStatus(noHandle, ft.getNameSpace, none);
  expectStatus(noHandle, ft.getHostname, none);
  expectStatus(noHandle, ft.getClassName, none);
  expectStatus(noHandle, ft.getKey, none, "K");
  expectStatus(noHandle, ft.getKeyAt, none, 0U, static_cast<CMPIString**>(nullptr));
  expectStatus(noHandle, ft.getKeyCount, none);
  expectStatus(noHandle, ft.getClassQualifier, none, "Q");
  expectStatus(noHandle, ft.getPropertyQualifier, none, "P", "Q");
  expectStatus(noHandle, ft.getMethodQualifier, none, "M", "Q");
  expectStatus(noHandle, ft.getParameterQualifier, none, "M", "P", "Q");
  expectStatus(noHandle, ft.toString, none);
  expectStatus(noParameter, ft.getKey, path, static_cast<const char*>(nullptr));
  EXPECT_EQ(ft.setNameSpace(none, "x").rc, noHandle);
  EXPECT_EQ(ft.setHostname(none, "x").rc, noHandle);
  EXPECT_EQ(ft.setClassName(none, "x").rc, noHandle);
  EXPECT_EQ(ft.addKey(none, "K", value, CMPI_chars).rc, noHandle);
  EXPECT_EQ(ft.setNameSpaceFromObjectPath(none, path).rc, noHandle);
  EXPECT_EQ(ft.setHostAndNameSpaceFromObjectPath(none, path).rc, noHandle);
  EXPECT_EQ(ft.setNameSpace(path, nullptr).rc, noParameter);
  EXPECT_EQ(ft.setHostname(path, nullptr).rc, noParameter);
  EXPECT_EQ(ft.setClassName(path, nullptr).rc, noParameter);
  EXPECT_EQ(ft.setNameSpaceFromObjectPath(path, none).rc, noParameter);
  EXPECT_EQ(ft.setHostAndNameSpaceFromObjectPath(path, none).rc, noParameter);
}

TEST_F(NullsTest, Instance) {
  const CMPIInstanceFT& ft = instanceTable;
  CMPIInstance* const none = nullptr;
  CMPIInstance* const instance = newThing();
  const CMPIValue* const value = chars("x");
  expectStatus(noHandle, ft.getProperty, none, "P");
  expectStatus(noHandle, ft.getPropertyAt, none, 0U, static_cast<CMPIString**>(nullptr));
  expectStatus(noHandle, ft.getPropertyCount, none);
  expectStatus(noHandle, ft.getObjectPath, none);
  expectStatus(noParameter, ft.getProperty, instance, static_cast<const char*>(nullptr));
  EXPECT_EQ(ft.setProperty(none, "P", value, CMPI_chars).rc, noHandle);
  EXPECT_EQ(ft.setPropertyWithOrigin(none, "P", value, CMPI_chars, "C").rc, noHandle);
  EXPECT_EQ(ft.setPropertyFilter(none, nullptr, nullptr).rc, noHandle);
  EXPECT_EQ(ft.setObjectPath(none, newPath()).rc, noHandle);
  EXPECT_EQ(ft.setProperty(instance, nullptr, value, CMPI_chars).rc, noParameter);
  EXPECT_EQ(ft.setPropertyWithOrigin(instance, nullptr, value, CMPI_chars, nullptr).rc, noParameter);
  EXPECT_EQ(ft.setObjectPath(instance, nullptr).rc, noParameter);
}

TEST_F(NullsTest, Values) {
  const CMPIArray* const noArray = nullptr;
  const CMPIDateTime* const noTime = nullptr;
  const CMPIString* const noString = nullptr;
  const CMPIEnumeration* const noEnumeration = nullptr;
  const CMPIValue value = number(1);
  expectStatus(noHandle, stringTable.getCharPtr, noString);
  expectStatus(noHandle, dateTimeTable.getBinaryFormat, noTime);
  expectStatus(noHandle, dateTimeTable.getStringFormat, noTime);
  expectStatus(noHandle, dateTimeTable.isInterval, noTime);
  expectStatus(noHandle, arrayTable.getSize, noArray);
  expectStatus(noHandle, arrayTable.getSimpleType, noArray);
  expectStatus(noHandle, arrayTable.getElementAt, noArray, 0U);
  EXPECT_EQ(arrayTable.setElementAt(nullptr, 0, &value, CMPI_uint8).rc, noHandle);
  expectStatus(noHandle, enumerationTable.getNext, noEnumeration);
  expectStatus(noHandle, enumerationTable.hasNext, noEnumeration);
  expectStatus(noHandle, enumerationTable.toArray, noEnumeration);
}

TEST_F(NullsTest, ContextsAndArguments) {
  const CMPIContext* const noContext = nullptr;
  const CMPIContext* const context = Context::create(request_.held());
  const CMPIArgs* const noArgs = nullptr;
  const CMPIArgs* const args = eft_->newArgs(mb_, nullptr);
  const CMPIValue* const value = chars("x");
  const char* const noName = nullptr;
  CMPIString** const noPlace = nullptr;
  expectStatus(noHandle, contextTable.getEntry, noContext, "E");
  expectStatus(noHandle, contextTable.getEntryAt, noContext, 0U, noPlace);
  expectStatus(noHandle, contextTable.getEntryCount, noContext);
  expectStatus(noParameter, contextTable.getEntry, context, noName);
  EXPECT_EQ(contextTable.addEntry(noContext, "E", value, CMPI_chars).rc, noHandle);
  EXPECT_EQ(contextTable.addEntry(context, nullptr, value, CMPI_chars).rc, noParameter);
  expectStatus(noHandle, argsTable.getArg, noArgs, "A");
  expectStatus(noHandle, argsTable.getArgAt, noArgs, 0U, noPlace);
  expectStatus(noHandle, argsTable.getArgCount, noArgs);
  expectStatus(noParameter, argsTable.getArg, args, noName);
  EXPECT_EQ(argsTable.addArg(noArgs, "A", value, CMPI_chars).rc, noHandle);
  EXPECT_EQ(argsTable.addArg(args, nullptr, value, CMPI_chars).rc, noParameter);
}

TEST_F(NullsTest, Result) {
  const CMPIValue value = number(1);
  EXPECT_EQ(resultTable.returnInstance(nullptr, newThing()).rc, noHandle);
  EXPECT_EQ(resultTable.returnObjectPath(nullptr, newPath()).rc, noHandle);
  EXPECT_EQ(resultTable.returnData(nullptr, &value, CMPI_uint8).rc, noHandle);
  EXPECT_EQ(resultTable.returnDone(nullptr).rc, noHandle);
  EXPECT_EQ(resultTable.returnError(nullptr, nullptr).rc, noHandle);
}

TEST_F(NullsTest, Encapsulation) {
  const CMPIBroker* const none = nullptr;
  const CMPIBrokerEncFT& ft = *eft_;
  expectStatus(noHandle, ft.newInstance, none, static_cast<const CMPIObjectPath*>(newPath()));
  expectStatus(noHandle, ft.newObjectPath, none, "n", "c");
  expectStatus(noHandle, ft.newArgs, none);
  expectStatus(noHandle, ft.newString, none, "x");
  expectStatus(noHandle, ft.newArray, none, 1U, CMPI_uint8);
  expectStatus(noHandle, ft.newDateTime, none);
  expectStatus(noHandle, ft.newDateTimeFromBinary, none, 0ULL, CMPIBoolean{0});
  expectStatus(noHandle, ft.newDateTimeFromChars, none, "x");
  expectStatus(noHandle, ft.newSelectExp, none, "q", "l", static_cast<CMPIArray**>(nullptr));
  expectStatus(noHandle, ft.classPathIsA, none, static_cast<const CMPIObjectPath*>(newPath()), "c");
  expectStatus(noHandle, ft.toString, none, static_cast<const void*>(newPath()));
  expectStatus(noHandle, ft.toString, mb_, static_cast<const void*>(nullptr));
  expectStatus(noHandle, ft.isOfType, none, static_cast<const void*>(newPath()), "t");
  expectStatus(noHandle, ft.isOfType, mb_, static_cast<const void*>(nullptr), "t");
  expectStatus(noHandle, ft.getType, none, static_cast<const void*>(newPath()));
  expectStatus(noHandle, ft.getType, mb_, static_cast<const void*>(nullptr));
  expectStatus(noHandle, ft.newCMPIError, none, "o", "i", "m", ErrorSevHigh, CMPIErrorProbableCause{},
               CMPI_RC_ERR_FAILED);
  EXPECT_EQ(ft.getMessage(none, nullptr, nullptr, nullptr, 0), nullptr);
  EXPECT_EQ(ft.getMessage2(none, nullptr, nullptr, nullptr, nullptr, 0), nullptr);
  EXPECT_EQ(ft.logMessage(none, 1, "i", "t", nullptr).rc, noHandle);
  EXPECT_EQ(ft.trace(none, 1, "c", "t", nullptr).rc, noHandle);
  EXPECT_EQ(ft.openMessageFile(none, "f", nullptr).rc, noHandle);
  EXPECT_EQ(ft.closeMessageFile(none, nullptr).rc, noHandle);
}

TEST_F(NullsTest, Upcalls) {
  const CMPIBroker* const none = nullptr;
  const CMPIBrokerFT& ft = *mb_->bft;
  const CMPIContext* const context = Context::create(request_.held());
  const CMPIObjectPath* const path = newPath();
  const CMPIContext* const noContext = nullptr;
  const CMPIObjectPath* const noPath = nullptr;
  const char** const all = nullptr;
  const char* const any = nullptr;
  expectStatus(noHandle, ft.enumerateInstanceNames, none, context, path);
  expectStatus(noParameter, ft.enumerateInstanceNames, mb_, noContext, path);
  expectStatus(noParameter, ft.enumerateInstanceNames, mb_, context, noPath);
  expectStatus(noHandle, ft.enumerateInstances, none, context, path, all);
  expectStatus(noParameter, ft.enumerateInstances, mb_, context, noPath, all);
  expectStatus(noParameter, ft.getInstance, mb_, context, noPath, all);
  expectStatus(noParameter, ft.associators, mb_, context, noPath, any, any, any, any, all);
  expectStatus(noParameter, ft.associatorNames, mb_, context, noPath, any, any, any, any);
  expectStatus(noParameter, ft.references, mb_, context, noPath, any, any, all);
  expectStatus(noParameter, ft.referenceNames, mb_, context, noPath, any, any);
  expectStatus(noParameter, ft.createInstance, mb_, context, noPath,
               static_cast<const CMPIInstance*>(nullptr));
  expectStatus(noParameter, ft.execQuery, mb_, context, noPath, any, any);
  expectStatus(noParameter, ft.invokeMethod, mb_, context, noPath, any, static_cast<const CMPIArgs*>(nullptr),
               static_cast<CMPIArgs*>(nullptr));
  expectStatus(noParameter, ft.getProperty, mb_, context, noPath, any);
  EXPECT_EQ(ft.modifyInstance(none, context, path, newThing(), all).rc, noHandle);
  EXPECT_EQ(ft.modifyInstance(mb_, context, noPath, nullptr, all).rc, noParameter);
  EXPECT_EQ(ft.deleteInstance(mb_, context, noPath).rc, noParameter);
  EXPECT_EQ(ft.setProperty(mb_, context, noPath, any, nullptr, CMPI_uint8).rc, noParameter);
  EXPECT_EQ(ft.deliverIndication(none, context, "n", nullptr).rc, noHandle);
}

TEST_F(NullsTest, ThreadsAndMemory) {
  const CMPIBroker* const none = nullptr;
  const CMPIContext* const context = Context::create(request_.held());
  EXPECT_EQ(mb_->bft->prepareAttachThread(none, context), nullptr);
  EXPECT_EQ(mb_->bft->prepareAttachThread(mb_, nullptr), nullptr);
  EXPECT_EQ(mb_->bft->attachThread(none, context).rc, noHandle);
  EXPECT_EQ(mb_->bft->attachThread(mb_, nullptr).rc, noParameter);
  EXPECT_EQ(mb_->bft->detachThread(none, context).rc, noHandle);
  EXPECT_EQ(mb_->bft->detachThread(mb_, nullptr).rc, noParameter);
  const CMPIBrokerMemFT& mft = *mb_->mft;
  expectStatus(noHandle, mft.mark, none);
  EXPECT_EQ(mft.release(none, nullptr).rc, noHandle);
  EXPECT_EQ(mft.release(mb_, nullptr).rc, noHandle);
  EXPECT_EQ(mft.cmpiMalloc(none, 1), nullptr);
  EXPECT_EQ(mft.cmpiCalloc(none, 1, 1), nullptr);
  EXPECT_EQ(mft.cmpiRealloc(none, nullptr, 1), nullptr);
  EXPECT_EQ(mft.cmpiStrDup(none, "x"), nullptr);
  EXPECT_EQ(mft.cmpiStrDup(mb_, nullptr), nullptr);
  mft.cmpiFree(none, nullptr);
  mft.freeInstance(none, nullptr);
  mft.freeObjectPath(mb_, nullptr);
  mft.freeArgs(mb_, nullptr);
  mft.freeString(mb_, nullptr);
  mft.freeArray(mb_, nullptr);
  mft.freeDateTime(mb_, nullptr);
  mft.freeSelectExp(mb_, nullptr);
}

}  // namespace
}  // namespace cimom
