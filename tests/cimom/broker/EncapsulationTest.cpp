#include "Fixture.h"

#include <cimom/broker/Context.h>
#include <cimom/broker/Enumeration.h>

namespace cimom {
namespace {

class EncapsulationTest : public BrokerTest {
 protected:
  std::string shown(const void* object) { return textOf(eft_->toString(mb_, object, nullptr)); }
};

TEST_F(EncapsulationTest, TheBrokerSaysWhatItIs) {
  EXPECT_STREQ(mb_->bft->brokerName, "test broker");
  EXPECT_EQ(mb_->bft->brokerVersion, static_cast<unsigned>(CMPIVersion200));
  const unsigned expected = CMPI_MB_BasicRead | CMPI_MB_AssociationTraversal |
                            CMPI_MB_OSEncapsulationSupport | CMPI_MB_Supports_MemEnhancements;
  EXPECT_EQ(mb_->bft->brokerCapabilities, expected);
  EXPECT_EQ(mb_->eft->ftVersion, CMPIVersion200);
  EXPECT_EQ(mb_->xft->ftVersion, CMPIVersion200);
  EXPECT_EQ(mb_->mft->ftVersion, CMPIVersion200);
}

// Every member of a table is a function, whatever it answers: a null would end the provider's process.
template <class Table>
void expectFull(const Table& table, std::size_t firstFunction) {
  const auto* const members = reinterpret_cast<void* const*>(&table);
  for (std::size_t member = firstFunction; member < sizeof(Table) / sizeof(void*); ++member) {
    EXPECT_NE(members[member], nullptr) << "member " << member;
  }
}

TEST_F(EncapsulationTest, NoTableHasAGap) {
  expectFull(*mb_->bft, 1);
  expectFull(*mb_->eft, 1);
  expectFull(*mb_->xft, 1);
  expectFull(*mb_->mft, 1);
  expectFull(*newPath()->ft, 1);
  expectFull(*newThing()->ft, 1);
  expectFull(*newString("")->ft, 1);
  expectFull(*sample(CMPI_dateTime).dateTime->ft, 1);
  expectFull(*sample(CMPI_stringA).array->ft, 1);
  expectFull(*eft_->newArgs(mb_, nullptr)->ft, 1);
  expectFull(*Context::create(request_.held())->ft, 1);
  expectFull(*Enumeration::create(request_.held(), CMPI_ref, {})->ft, 1);
}

TEST_F(EncapsulationTest, AnInstanceNeedsAKnownClass) {
  CMPIStatus status{};
  EXPECT_EQ(eft_->newInstance(mb_, newPath("Unknown"), &status), nullptr);
  EXPECT_EQ(status.rc, CMPI_RC_ERR_INVALID_CLASS);
  EXPECT_EQ(eft_->newInstance(mb_, nullptr, &status), nullptr);
  EXPECT_EQ(status.rc, CMPI_RC_ERR_INVALID_PARAMETER);
}

TEST_F(EncapsulationTest, APathNeedsAClassName) {
  CMPIStatus status{};
  EXPECT_EQ(eft_->newObjectPath(mb_, "root/test", nullptr, &status), nullptr);
  EXPECT_EQ(status.rc, CMPI_RC_ERR_INVALID_PARAMETER);
  const CMPIObjectPath* const path = eft_->newObjectPath(mb_, nullptr, "Test_Thing", &status);
  EXPECT_EQ(status.rc, CMPI_RC_OK);
  EXPECT_EQ(textOf(path->ft->getNameSpace(path, nullptr)), "");
}

TEST_F(EncapsulationTest, KnowsWhichPathsAreOfAClass) {
  CMPIStatus status{CMPI_RC_ERROR, nullptr};
  EXPECT_EQ(eft_->classPathIsA(mb_, newPath(), "TEST_BASE", &status), 1);
  EXPECT_EQ(status.rc, CMPI_RC_OK);
  EXPECT_EQ(eft_->classPathIsA(mb_, newPath(), "test_thing", nullptr), 1);
  EXPECT_EQ(eft_->classPathIsA(mb_, newPath("Test_Base"), "Test_Thing", nullptr), 0);
  EXPECT_EQ(eft_->classPathIsA(mb_, newPath(), "Unknown", &status), 0);
  EXPECT_EQ(status.rc, CMPI_RC_OK);
  EXPECT_EQ(eft_->classPathIsA(mb_, newPath("Unknown"), "Test_Base", nullptr), 0);
  EXPECT_EQ(eft_->classPathIsA(mb_, nullptr, "Test_Base", &status), 0);
  EXPECT_EQ(status.rc, CMPI_RC_ERR_INVALID_PARAMETER);
  EXPECT_EQ(eft_->classPathIsA(mb_, newPath(), nullptr, &status), 0);
  EXPECT_EQ(status.rc, CMPI_RC_ERR_INVALID_PARAMETER);
}

TEST_F(EncapsulationTest, ShowsObjectsAsText) {
  EXPECT_EQ(shown(newString("text")), "text");
  EXPECT_EQ(shown(newString("")), "");
  EXPECT_EQ(shown(sample(CMPI_dateTime).dateTime), "20240229123456.123456+060");
  EXPECT_EQ(shown(newKeyedPath("id")), "root/test:Test_Thing.InstanceID=\"id\"");
  EXPECT_EQ(shown(sample(CMPI_stringA).array), R"({"text", NULL})");
  EXPECT_EQ(shown(sample(CMPI_real64A).array), "{-2.5, NULL}");
  EXPECT_EQ(shown(eft_->newArgs(mb_, nullptr)), "CMPIArgs");
  CMPIInstance* const instance = eft_->newInstance(mb_, newKeyedPath("a\"b"), nullptr);
  const CMPIValue minus = number(static_cast<unsigned long long>(-5));
  instance->ft->setProperty(instance, "Sint16", &minus, CMPI_sint16);
  EXPECT_EQ(shown(instance), R"(instance of Test_Thing { InstanceID = "a\"b"; Sint16 = -5; })");
}

TEST_F(EncapsulationTest, KnowsTheTypesOfObjects) {
  const std::vector<std::pair<const void*, std::string>> objects = {
      {newString("x"), "CMPIString"},
      {sample(CMPI_dateTime).dateTime, "CMPIDateTime"},
      {sample(CMPI_stringA).array, "CMPIArray"},
      {newPath(), "CMPIObjectPath"},
      {newThing(), "CMPIInstance"},
      {static_cast<CMPIContext*>(Context::create(request_.held())), "CMPIContext"},
      {eft_->newArgs(mb_, nullptr), "CMPIArgs"},
      {static_cast<CMPIEnumeration*>(Enumeration::create(request_.held(), CMPI_ref, {})), "CMPIEnumeration"}};
  for (const auto& [object, type] : objects) {
    CMPIStatus status{CMPI_RC_ERROR, nullptr};
    EXPECT_EQ(textOf(eft_->getType(mb_, object, &status)), type);
    EXPECT_EQ(status.rc, CMPI_RC_OK);
    for (const auto& other : objects) {
      EXPECT_EQ(eft_->isOfType(mb_, object, other.second.c_str(), nullptr), type == other.second ? 1 : 0);
    }
  }
}

TEST_F(EncapsulationTest, DoesNotKnowForeignObjects) {
  CMPIString foreign{&foreign, nullptr};
  CMPIStatus status{};
  EXPECT_EQ(eft_->getType(mb_, &foreign, &status), nullptr);
  EXPECT_EQ(status.rc, CMPI_RC_ERR_INVALID_HANDLE);
  EXPECT_EQ(eft_->toString(mb_, &foreign, &status), nullptr);
  EXPECT_EQ(status.rc, CMPI_RC_ERR_INVALID_HANDLE);
  EXPECT_EQ(eft_->isOfType(mb_, &foreign, "CMPIString", &status), 0);
  EXPECT_EQ(status.rc, CMPI_RC_ERR_INVALID_HANDLE);
  EXPECT_EQ(eft_->isOfType(mb_, newString("x"), nullptr, &status), 0);
  EXPECT_EQ(status.rc, CMPI_RC_ERR_INVALID_PARAMETER);
}

TEST_F(EncapsulationTest, MessagesTakeInsertsOfEveryKind) {
  CMPIStatus status{CMPI_RC_ERROR, nullptr};
  const CMPIString* const message = eft_->getMessage(
      mb_, "id", "$0 $1 $2 $3 $4 $5 $6 $7", &status, 8, static_cast<int>(CMPI_chars), "chars",
      static_cast<int>(CMPI_string), newString("string"), static_cast<int>(CMPI_boolean), 1,
      static_cast<int>(CMPI_sint32), -3, static_cast<int>(CMPI_uint32), 4000000000U,
      static_cast<int>(CMPI_sint64), -5LL, static_cast<int>(CMPI_uint64), 18446744073709551615ULL,
      static_cast<int>(CMPI_real64), 0.5);
  EXPECT_EQ(status.rc, CMPI_RC_OK);
  EXPECT_EQ(textOf(message), "chars string true -3 4000000000 -5 18446744073709551615 0.500000");
}

TEST_F(EncapsulationTest, MessagesKeepPlaceholdersWithoutInserts) {
  EXPECT_EQ(textOf(eft_->getMessage(mb_, "id", "$1$0$ $x$", nullptr, 1, static_cast<int>(CMPI_chars), "a")),
            "$1a$ $x$");
  EXPECT_EQ(textOf(eft_->getMessage2(mb_, "id", nullptr, "$0", nullptr, 1, static_cast<int>(CMPI_chars),
                                     static_cast<const char*>(nullptr))),
            "(null)");
  EXPECT_EQ(textOf(eft_->getMessage(mb_, "id", "$0", nullptr, 1, static_cast<int>(CMPI_ptr), nullptr)), "$0");
  CMPIStatus status{};
  EXPECT_EQ(eft_->getMessage(mb_, "id", nullptr, &status, 0), nullptr);
  EXPECT_EQ(status.rc, CMPI_RC_ERR_INVALID_PARAMETER);
}

TEST_F(EncapsulationTest, WritesToTheLog) {
  EXPECT_EQ(eft_->logMessage(mb_, CMPI_SEV_WARNING, "part", "text", nullptr).rc, CMPI_RC_OK);
  EXPECT_EQ(eft_->trace(mb_, CMPI_LEV_VERBOSE, nullptr, nullptr, newString("string")).rc, CMPI_RC_OK);
  EXPECT_EQ(eft_->trace(mb_, CMPI_LEV_VERBOSE, "part", nullptr, nullptr).rc, CMPI_RC_ERR_INVALID_PARAMETER);
  EXPECT_EQ(log_, (std::vector<std::string>{"message 3 part: text", "trace 3 : string"}));
}

TEST_F(EncapsulationTest, SaysWhatItDoesNotOffer) {
  CMPIStatus status{};
  CMPIArray* projection = sample(CMPI_stringA).array;
  EXPECT_EQ(eft_->newSelectExp(mb_, "SELECT * FROM C", "WQL", &projection, &status), nullptr);
  EXPECT_EQ(status.rc, CMPI_RC_ERR_NOT_SUPPORTED);
  EXPECT_EQ(projection, nullptr);
  EXPECT_EQ(eft_->newCMPIError(mb_, "o", "i", "m", ErrorSevHigh, CMPIErrorProbableCause{}, CMPI_RC_ERR_FAILED,
                               &status),
            nullptr);
  EXPECT_EQ(status.rc, CMPI_RC_ERR_NOT_SUPPORTED);
  EXPECT_EQ(eft_->openMessageFile(mb_, "file", nullptr).rc, CMPI_RC_ERR_NOT_SUPPORTED);
  EXPECT_EQ(eft_->closeMessageFile(mb_, nullptr).rc, CMPI_RC_ERR_NOT_SUPPORTED);
  const CMPIContext* const context = Context::create(request_.held());
  EXPECT_EQ(mb_->bft->deliverIndication(mb_, context, "root/test", newThing()).rc, CMPI_RC_ERR_NOT_SUPPORTED);
}

// A thread without a request has nowhere to put an object.
TEST_F(EncapsulationTest, MakesNothingOutsideARequest) {
  CMPIObjectPath* const path = newPath();
  const RequestScope outside(nullptr);
  CMPIStatus status{};
  const auto expectFailure = [&status](const void* object) {
    EXPECT_EQ(object, nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_FAILED);
    EXPECT_EQ(status.msg, nullptr);
    status = {};
  };
  expectFailure(eft_->newInstance(mb_, path, &status));
  expectFailure(eft_->newObjectPath(mb_, "root/test", "Test_Thing", &status));
  expectFailure(eft_->newArgs(mb_, &status));
  expectFailure(eft_->newString(mb_, "text", &status));
  expectFailure(eft_->newArray(mb_, 1, CMPI_uint8, &status));
  expectFailure(eft_->newDateTime(mb_, &status));
  expectFailure(eft_->newDateTimeFromBinary(mb_, 0, 0, &status));
  expectFailure(eft_->newDateTimeFromChars(mb_, "20240229123456.123456+060", &status));
  expectFailure(eft_->toString(mb_, path, &status));
  expectFailure(eft_->getMessage(mb_, "id", "text", &status, 0));
  expectFailure(mb_->mft->mark(mb_, &status));
  EXPECT_EQ(mb_->mft->cmpiMalloc(mb_, 1), nullptr);
  EXPECT_EQ(eft_->classPathIsA(mb_, path, "Test_Base", nullptr), 1);
  EXPECT_EQ(path->ft->getKeyCount(path, nullptr), 0U);
}

}  // namespace
}  // namespace cimom
