#include "Fixture.h"

namespace cimom {
namespace {

class InstanceTest : public BrokerTest {
 protected:
  static CMPIrc set(CMPIInstance* instance, const char* name, CMPIValue value, CMPIType type) {
    return instance->ft->setProperty(instance, name, &value, type).rc;
  }
  static CMPIrc set(CMPIInstance* instance, const char* name, const char* text) {
    return instance->ft->setProperty(instance, name, chars(text), CMPI_chars).rc;
  }
  static CMPIData get(const CMPIInstance* instance, const char* name) {
    CMPIStatus status{CMPI_RC_ERROR, nullptr};
    const CMPIData data = instance->ft->getProperty(instance, name, &status);
    EXPECT_EQ(status.rc, CMPI_RC_OK) << name;
    return data;
  }
};

std::map<std::string, CMPIType> allProperties() {
  std::map<std::string, CMPIType> all = propertyTypes();
  for (const auto& [name, type] : propertyTypes()) {
    all[name + "s"] = static_cast<CMPIType>(type | CMPI_ARRAY);
  }
  return all;
}

// Each property with a value of each type: only its own is taken.
TEST_F(InstanceTest, TakesItsOwnTypesAlone) {
  for (const auto& [name, declared] : allProperties()) {
    for (const auto& entry : allProperties()) {
      const CMPIType given = entry.second;
      CMPIInstance* const instance = newThing();
      const CMPIrc expected = given == declared ? CMPI_RC_OK : CMPI_RC_ERR_TYPE_MISMATCH;
      EXPECT_EQ(set(instance, name.c_str(), sample(given), given), expected) << name << " " << given;
      EXPECT_EQ(instance->ft->getPropertyCount(instance, nullptr), given == declared ? 1U : 0U);
    }
  }
}

TEST_F(InstanceTest, GivesBackWhatWasSet) {
  for (const auto& [name, type] : allProperties()) {
    CMPIInstance* const instance = newThing();
    const CMPIValue value = sample(type);
    ASSERT_EQ(set(instance, name.c_str(), value, type), CMPI_RC_OK) << name;
    const CMPIData data = get(instance, name.c_str());
    EXPECT_EQ(data.type, type) << name;
    EXPECT_EQ(data.state, CMPI_goodValue) << name;
    EXPECT_TRUE(sameValue(data, dataOf(type, value))) << name;
  }
}

// The bytes of a value's union beyond the member that the type names are the caller's rubbish.
TEST_F(InstanceTest, ReadsNoMoreOfAValueThanItsType) {
  CMPIInstance* const instance = newThing();
  EXPECT_EQ(set(instance, "Uint8", number(0xffffffffffffff05U), CMPI_uint8), CMPI_RC_OK);
  EXPECT_EQ(get(instance, "Uint8").value.uint64, 5U);
  EXPECT_EQ(set(instance, "Boolean", number(0xffffffffffffff04U), CMPI_boolean), CMPI_RC_OK);
  EXPECT_EQ(get(instance, "Boolean").value.uint64, 1U);
}

TEST_F(InstanceTest, TakesTextsInThreeForms) {
  CMPIInstance* const instance = newThing();
  EXPECT_EQ(set(instance, "String", "plain"), CMPI_RC_OK);
  EXPECT_EQ(text(get(instance, "String")), "plain");
  CMPIValue value{};
  value.string = newString("string");
  EXPECT_EQ(set(instance, "string", value, CMPI_string), CMPI_RC_OK);
  EXPECT_EQ(text(get(instance, "String")), "string");
  char buffer[] = "counted and more";
  value.dataPtr = {buffer, 7};
  EXPECT_EQ(set(instance, "STRING", value, CMPI_charsptr), CMPI_RC_OK);
  EXPECT_EQ(get(instance, "String").type, CMPI_string);
  EXPECT_EQ(text(get(instance, "String")), "counted");
  value.dataPtr = {buffer, 1000};  // not past the zero byte
  EXPECT_EQ(set(instance, "String", value, CMPI_charsptr), CMPI_RC_OK);
  EXPECT_EQ(text(get(instance, "String")), "counted and more");
}

TEST_F(InstanceTest, ATextIsNoDateTime) {
  CMPIInstance* const instance = newThing();
  EXPECT_EQ(set(instance, "Time", "20240229123456.123456+060"), CMPI_RC_ERR_TYPE_MISMATCH);
  EXPECT_EQ(set(instance, "String", sample(CMPI_dateTime), CMPI_dateTime), CMPI_RC_ERR_TYPE_MISMATCH);
}

TEST_F(InstanceTest, RefusesWhatItsClassLacks) {
  CMPIInstance* const instance = newThing();
  EXPECT_EQ(set(instance, "NoSuch", "text"), CMPI_RC_ERR_NO_SUCH_PROPERTY);
  EXPECT_EQ(set(instance, "", "text"), CMPI_RC_ERR_NO_SUCH_PROPERTY);
  CMPIStatus status{};
  EXPECT_NE(instance->ft->getProperty(instance, "NoSuch", &status).state & CMPI_notFound, 0);
  EXPECT_EQ(status.rc, CMPI_RC_ERR_NO_SUCH_PROPERTY);
}

TEST_F(InstanceTest, RefusesWhatIsNoType) {
  CMPIInstance* const instance = newThing();
  for (const CMPIType type : {CMPI_args, CMPI_class, CMPI_filter, CMPI_enumeration, CMPI_ptr,
                              CMPI_dateTimeString, CMPIType{0x0777}, CMPI_ARRAY, CMPIType{0x4000}}) {
    EXPECT_EQ(set(instance, "String", CMPIValue{}, type), CMPI_RC_ERR_INVALID_DATA_TYPE) << type;
  }
}

TEST_F(InstanceTest, RefusesForeignObjects) {
  CMPIInstance* const instance = newThing();
  CMPIStringFT otherTable = *newString("x")->ft;
  CMPIString foreign{instance, &otherTable};
  CMPIString empty{nullptr, newString("x")->ft};
  CMPIValue value{};
  value.string = &foreign;
  EXPECT_EQ(set(instance, "String", value, CMPI_string), CMPI_RC_ERR_INVALID_HANDLE);
  value.string = &empty;
  EXPECT_EQ(set(instance, "String", value, CMPI_string), CMPI_RC_ERR_INVALID_HANDLE);
  EXPECT_EQ(instance->ft->getPropertyCount(instance, nullptr), 0U);
}

TEST_F(InstanceTest, AnArrayMustBeOfTheTypeThatIsSaid) {
  CMPIInstance* const instance = newThing();
  EXPECT_EQ(set(instance, "Uint16s", sample(CMPI_uint32A), CMPI_uint16A), CMPI_RC_ERR_TYPE_MISMATCH);
  CMPIValue value{};
  value.array = eft_->newArray(mb_, 1, CMPI_chars, nullptr);
  EXPECT_EQ(set(instance, "Strings", value, CMPI_charsA), CMPI_RC_OK);
  EXPECT_EQ(get(instance, "Strings").type, CMPI_stringA);
}

TEST_F(InstanceTest, NullsKeepTheDeclaredType) {
  for (const auto& [name, type] : allProperties()) {
    CMPIInstance* const instance = newThing();
    EXPECT_EQ(get(instance, name.c_str()).state, CMPI_nullValue) << name;  // nothing was set
    EXPECT_EQ(instance->ft->setProperty(instance, name.c_str(), nullptr, type).rc, CMPI_RC_OK);
    EXPECT_EQ(get(instance, name.c_str()).type, type);
    EXPECT_EQ(get(instance, name.c_str()).state, CMPI_nullValue);
    EXPECT_EQ(set(instance, name.c_str(), sample(type), type), CMPI_RC_OK);
    EXPECT_EQ(instance->ft->setProperty(instance, name.c_str(), nullptr, CMPI_null).rc, CMPI_RC_OK);
    EXPECT_EQ(get(instance, name.c_str()).type, type);
    EXPECT_EQ(get(instance, name.c_str()).state, CMPI_nullValue);
    EXPECT_EQ(instance->ft->getPropertyCount(instance, nullptr), 1U);
  }
  CMPIInstance* const instance = newThing();
  EXPECT_EQ(instance->ft->setProperty(instance, "String", nullptr, CMPI_uint8).rc, CMPI_RC_ERR_TYPE_MISMATCH);
}

TEST_F(InstanceTest, NullObjectsAreNulls) {
  for (const auto& [name, type] : allProperties()) {
    if ((type & (CMPI_ENC | CMPI_ARRAY)) != 0) {
      CMPIInstance* const instance = newThing();
      EXPECT_EQ(set(instance, name.c_str(), CMPIValue{}, type), CMPI_RC_OK) << name;
      EXPECT_EQ(get(instance, name.c_str()).state, CMPI_nullValue) << name;
    }
  }
  CMPIInstance* const instance = newThing();
  EXPECT_EQ(set(instance, "String", nullptr), CMPI_RC_OK);
  EXPECT_EQ(set(instance, "Caption", CMPIValue{}, CMPI_charsptr), CMPI_RC_OK);
  EXPECT_FALSE(text(get(instance, "Caption")));
}

TEST_F(InstanceTest, ListsWhatWasSetInThatOrder) {
  CMPIInstance* const instance = newThing();
  set(instance, "sint8", number(3), CMPI_sint8);
  set(instance, "CAPTION", "caption");
  set(instance, "Sint8", number(4), CMPI_sint8);
  EXPECT_EQ(instance->ft->getPropertyCount(instance, nullptr), 2U);
  CMPIString* name = nullptr;
  EXPECT_EQ(instance->ft->getPropertyAt(instance, 0, &name, nullptr).value.sint8, 4);
  EXPECT_EQ(textOf(name), "Sint8");
  instance->ft->getPropertyAt(instance, 1, &name, nullptr);
  EXPECT_EQ(textOf(name), "Caption");
  CMPIStatus status{};
  EXPECT_NE(instance->ft->getPropertyAt(instance, 2, &name, &status).state & CMPI_notFound, 0);
  EXPECT_EQ(status.rc, CMPI_RC_ERR_NO_SUCH_PROPERTY);
}

TEST_F(InstanceTest, HoldsEveryPropertyOfItsClass) {
  CMPIInstance* const instance = newThing();
  for (const auto& [name, type] : allProperties()) {
    EXPECT_EQ(set(instance, name.c_str(), sample(type), type), CMPI_RC_OK);
  }
  EXPECT_EQ(instance->ft->getPropertyCount(instance, nullptr), allProperties().size());
  for (const auto& [name, type] : allProperties()) {
    EXPECT_EQ(get(instance, name.c_str()).type, type);
  }
}

TEST_F(InstanceTest, TakesItsKeysFromItsPath) {
  const CMPIInstance* const instance = eft_->newInstance(mb_, newKeyedPath("id"), nullptr);
  EXPECT_EQ(text(get(instance, "InstanceID")), "id");
}

TEST_F(InstanceTest, LeavesKeysOfOtherTypesInThePath) {
  CMPIObjectPath* const path = newPath();
  const CMPIValue seven = number(7);
  path->ft->addKey(path, "InstanceID", &seven, CMPI_uint8);
  path->ft->addKey(path, "Caption", &seven, CMPI_uint8);
  const CMPIInstance* const instance = eft_->newInstance(mb_, path, nullptr);
  EXPECT_EQ(instance->ft->getPropertyCount(instance, nullptr), 0U);
  const CMPIObjectPath* const again = instance->ft->getObjectPath(instance, nullptr);
  EXPECT_EQ(again->ft->getKeyCount(again, nullptr), 2U);
}

TEST_F(InstanceTest, KeysThatAreSetReachThePath) {
  CMPIObjectPath* const path = newKeyedPath("before");
  CMPIInstance* const instance = eft_->newInstance(mb_, path, nullptr);
  EXPECT_EQ(set(instance, "INSTANCEID", "after"), CMPI_RC_OK);
  const CMPIObjectPath* const now = instance->ft->getObjectPath(instance, nullptr);
  EXPECT_EQ(text(now->ft->getKey(now, "InstanceID", nullptr)), "after");
  EXPECT_EQ(text(path->ft->getKey(path, "InstanceID", nullptr)), "before");
  CMPIInstance* const fresh = newThing();
  set(fresh, "InstanceID", "set");
  EXPECT_EQ(Instance::from(fresh)->path().keys().size(), 1U);
}

TEST_F(InstanceTest, ItsPathIsItsOwn) {
  CMPIInstance* const instance = eft_->newInstance(mb_, newKeyedPath("id"), nullptr);
  CMPIObjectPath* const path = instance->ft->getObjectPath(instance, nullptr);
  const CMPIValue* const other = chars("other");
  path->ft->addKey(path, "InstanceID", other, CMPI_chars);
  path->ft->setNameSpace(path, "root/other");
  EXPECT_EQ(Instance::from(instance)->path().nameSpace(), "root/test");
  EXPECT_EQ(text(Instance::from(instance)->path().find("InstanceID")->data), "id");
}

TEST_F(InstanceTest, ItsPathCanBeReplaced) {
  CMPIInstance* const instance = newThing();
  CMPIObjectPath* const path = newKeyedPath("new");
  path->ft->setHostname(path, "host");
  EXPECT_EQ(instance->ft->setObjectPath(instance, path).rc, CMPI_RC_OK);
  EXPECT_EQ(Instance::from(instance)->path().hostName(), "host");
  EXPECT_EQ(text(get(instance, "InstanceID")), "new");
  EXPECT_EQ(instance->ft->setObjectPath(instance, newPath("Test_Base")).rc, CMPI_RC_ERR_INVALID_PARAMETER);
  EXPECT_EQ(instance->ft->setObjectPath(instance, newPath("Unknown")).rc, CMPI_RC_ERR_INVALID_PARAMETER);
}

TEST_F(InstanceTest, AFilterIgnoresWhatItDoesNotName) {
  CMPIInstance* const instance = newThing();
  const char* names[] = {"string", "NoSuch", nullptr};
  const char* keys[] = {"Uint8", nullptr};
  EXPECT_EQ(instance->ft->setPropertyFilter(instance, names, keys).rc, CMPI_RC_OK);
  EXPECT_EQ(set(instance, "Caption", "ignored"), CMPI_RC_OK);
  EXPECT_EQ(set(instance, "Caption", number(1), CMPI_uint8), CMPI_RC_ERR_TYPE_MISMATCH);
  EXPECT_EQ(set(instance, "Unknown", "x"), CMPI_RC_ERR_NO_SUCH_PROPERTY);
  EXPECT_EQ(set(instance, "String", "kept"), CMPI_RC_OK);
  EXPECT_EQ(set(instance, "Uint8", number(1), CMPI_uint8), CMPI_RC_OK);
  EXPECT_EQ(set(instance, "InstanceID", "key"), CMPI_RC_OK);
  EXPECT_EQ(instance->ft->getPropertyCount(instance, nullptr), 3U);
  EXPECT_EQ(get(instance, "Caption").state, CMPI_nullValue);
  EXPECT_EQ(instance->ft->setPropertyFilter(instance, nullptr, nullptr).rc, CMPI_RC_OK);
  EXPECT_EQ(set(instance, "Caption", "no longer"), CMPI_RC_OK);
  EXPECT_EQ(text(get(instance, "Caption")), "no longer");
}

TEST_F(InstanceTest, AnEmptyFilterLeavesTheKeys) {
  CMPIInstance* const instance = newThing();
  const char* none[] = {nullptr};
  instance->ft->setPropertyFilter(instance, none, nullptr);
  set(instance, "Caption", "ignored");
  set(instance, "InstanceID", "key");
  EXPECT_EQ(instance->ft->getPropertyCount(instance, nullptr), 1U);
}

TEST_F(InstanceTest, TheHostRemovesWhatNobodyAskedFor) {
  CMPIInstance* const handle = newThing();
  set(handle, "Caption", "caption");
  set(handle, "InstanceID", "key");
  set(handle, "String", "string");
  Instance& instance = *Instance::from(handle);
  const std::string_view names[] = {"STRING", "Real32"};
  instance.restrictTo(names);
  ASSERT_EQ(instance.properties().size(), 2U);
  EXPECT_EQ(instance.properties()[0].name, "InstanceID");
  EXPECT_EQ(instance.properties()[1].name, "String");
  EXPECT_EQ(instance.find("Caption"), nullptr);
  EXPECT_EQ(text(instance.find("string")->data), "string");
  EXPECT_EQ(set(handle, "Real32", sample(CMPI_real32), CMPI_real32), CMPI_RC_OK);
  EXPECT_EQ(instance.properties().size(), 3U);
}

TEST_F(InstanceTest, AnOriginChangesNothing) {
  CMPIInstance* const instance = newThing();
  const CMPIValue* const value = chars("text");
  EXPECT_EQ(instance->ft->setPropertyWithOrigin(instance, "String", value, CMPI_chars, "Test_Base").rc,
            CMPI_RC_OK);
  EXPECT_EQ(text(get(instance, "String")), "text");
}

TEST_F(InstanceTest, ArraysAreCopiedInAndOut) {
  CMPIInstance* const instance = newThing();
  CMPIValue value{};
  value.array = eft_->newArray(mb_, 1, CMPI_uint8, nullptr);
  CMPIValue element = number(1);
  value.array->ft->setElementAt(value.array, 0, &element, CMPI_uint8);
  set(instance, "Uint8s", value, CMPI_uint8A);
  element = number(2);
  value.array->ft->setElementAt(value.array, 0, &element, CMPI_uint8);
  CMPIArray* const read = get(instance, "Uint8s").value.array;
  EXPECT_EQ(read->ft->getElementAt(read, 0, nullptr).value.uint8, 1);
  read->ft->setElementAt(read, 0, &element, CMPI_uint8);
  EXPECT_EQ(elements(get(instance, "Uint8s"))[0].value.uint8, 1);
}

}  // namespace
}  // namespace cimom
