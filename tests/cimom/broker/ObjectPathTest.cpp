#include "Fixture.h"

namespace cimom {
namespace {

class ObjectPathTest : public BrokerTest {
 protected:
  static CMPIStatus add(CMPIObjectPath* path, const char* name, const char* text) {
    const CMPIValue* const value = chars(text);
    return path->ft->addKey(path, name, value, CMPI_chars);
  }
  static std::string key(const CMPIObjectPath* path, const char* name) {
    CMPIStatus status{};
    const CMPIData data = path->ft->getKey(path, name, &status);
    return status.rc == CMPI_RC_OK ? textOf(data.value.string) : "status " + std::to_string(status.rc);
  }
};

TEST_F(ObjectPathTest, HasWhatItWasMadeWith) {
  CMPIStatus status{CMPI_RC_ERROR, nullptr};
  const CMPIObjectPath* const path = eft_->newObjectPath(mb_, "root/test", "TEST_thing", &status);
  EXPECT_EQ(status.rc, CMPI_RC_OK);
  EXPECT_EQ(textOf(path->ft->getNameSpace(path, &status)), "root/test");
  EXPECT_EQ(textOf(path->ft->getClassName(path, &status)), "Test_Thing");
  EXPECT_EQ(textOf(path->ft->getHostname(path, &status)), "");
  EXPECT_EQ(path->ft->getKeyCount(path, &status), 0U);
  EXPECT_EQ(status.rc, CMPI_RC_OK);
}

TEST_F(ObjectPathTest, MayNameAClassThatTheSchemaLacks) {
  const CMPIObjectPath* const path = newPath("Other_Class");
  EXPECT_EQ(textOf(path->ft->getClassName(path, nullptr)), "Other_Class");
  EXPECT_EQ(ObjectPath::from(path)->classInfo(), nullptr);
}

TEST_F(ObjectPathTest, NamesCanBeChanged) {
  CMPIObjectPath* const path = newPath();
  EXPECT_EQ(path->ft->setNameSpace(path, "root/other").rc, CMPI_RC_OK);
  EXPECT_EQ(path->ft->setHostname(path, "host").rc, CMPI_RC_OK);
  EXPECT_EQ(path->ft->setClassName(path, "test_link").rc, CMPI_RC_OK);
  EXPECT_EQ(textOf(path->ft->getNameSpace(path, nullptr)), "root/other");
  EXPECT_EQ(textOf(path->ft->getHostname(path, nullptr)), "host");
  EXPECT_EQ(textOf(path->ft->getClassName(path, nullptr)), "Test_Link");
}

TEST_F(ObjectPathTest, NamesComeFromOtherPaths) {
  CMPIObjectPath* const source = newPath();
  source->ft->setHostname(source, "host");
  CMPIObjectPath* const path = eft_->newObjectPath(mb_, nullptr, "Test_Link", nullptr);
  EXPECT_EQ(path->ft->setNameSpaceFromObjectPath(path, source).rc, CMPI_RC_OK);
  EXPECT_EQ(textOf(path->ft->getNameSpace(path, nullptr)), "root/test");
  EXPECT_EQ(textOf(path->ft->getHostname(path, nullptr)), "");
  EXPECT_EQ(path->ft->setHostAndNameSpaceFromObjectPath(path, source).rc, CMPI_RC_OK);
  EXPECT_EQ(textOf(path->ft->getHostname(path, nullptr)), "host");
}

TEST_F(ObjectPathTest, KeysIgnoreCaseAndTakeTheClassesSpelling) {
  CMPIObjectPath* const path = newPath();
  EXPECT_EQ(add(path, "INSTANCEid", "first").rc, CMPI_RC_OK);
  EXPECT_EQ(key(path, "instanceID"), "first");
  CMPIString* name = nullptr;
  CMPIStatus status{};
  const CMPIData data = path->ft->getKeyAt(path, 0, &name, &status);
  EXPECT_EQ(status.rc, CMPI_RC_OK);
  EXPECT_EQ(textOf(name), "InstanceID");
  EXPECT_EQ(data.type, CMPI_string);
  EXPECT_EQ(data.state, CMPI_keyValue);
}

TEST_F(ObjectPathTest, UndeclaredKeysAreKeptAsTheyCame) {
  CMPIObjectPath* const path = newPath();
  EXPECT_EQ(add(path, "noSuchKey", "value").rc, CMPI_RC_OK);
  const CMPIValue seven = number(7);
  EXPECT_EQ(path->ft->addKey(path, "InstanceID", &seven, CMPI_uint16).rc, CMPI_RC_OK);
  CMPIString* name = nullptr;
  path->ft->getKeyAt(path, 0, &name, nullptr);
  EXPECT_EQ(textOf(name), "noSuchKey");
  EXPECT_EQ(path->ft->getKeyAt(path, 1, nullptr, nullptr).value.uint16, 7);
}

TEST_F(ObjectPathTest, ASecondValueReplacesTheFirst) {
  CMPIObjectPath* const path = newKeyedPath("first");
  EXPECT_EQ(add(path, "instanceid", "second").rc, CMPI_RC_OK);
  EXPECT_EQ(path->ft->getKeyCount(path, nullptr), 1U);
  EXPECT_EQ(key(path, "InstanceID"), "second");
}

TEST_F(ObjectPathTest, HoldsManyKeys) {
  CMPIObjectPath* const path = newPath();
  for (int index = 0; index < 100; ++index) {
    EXPECT_EQ(add(path, ("Key" + std::to_string(index)).c_str(), std::to_string(index).c_str()).rc,
              CMPI_RC_OK);
  }
  EXPECT_EQ(path->ft->getKeyCount(path, nullptr), 100U);
  EXPECT_EQ(key(path, "key57"), "57");
}

TEST_F(ObjectPathTest, TakesEveryTypeThatAKeyCanHave) {
  CMPIObjectPath* const path = newPath("Test_Keyed");
  for (const auto& [name, type] : propertyTypes()) {
    const CMPIValue value = sample(type);
    const CMPIrc expected = type == CMPI_instance ? CMPI_RC_ERR_INVALID_DATA_TYPE : CMPI_RC_OK;
    EXPECT_EQ(path->ft->addKey(path, name.c_str(), &value, type).rc, expected) << name;
    const auto arrayType = static_cast<CMPIType>(type | CMPI_ARRAY);
    const CMPIValue array = sample(arrayType);
    EXPECT_EQ(path->ft->addKey(path, name.c_str(), &array, arrayType).rc, CMPI_RC_ERR_INVALID_DATA_TYPE);
  }
  EXPECT_EQ(path->ft->getKeyCount(path, nullptr), propertyTypes().size() - 1);
  EXPECT_EQ(path->ft->getKey(path, "Real64", nullptr).value.real64, -2.5);
}

TEST_F(ObjectPathTest, RefusesWhatIsNoKey) {
  CMPIObjectPath* const path = newPath();
  const CMPIValue* const value = chars("text");
  EXPECT_EQ(path->ft->addKey(path, "Key", value, CMPI_null).rc, CMPI_RC_ERR_INVALID_DATA_TYPE);
  EXPECT_EQ(path->ft->addKey(path, "Key", value, CMPI_enumeration).rc, CMPI_RC_ERR_INVALID_DATA_TYPE);
  EXPECT_EQ(path->ft->addKey(path, "Key", value, 0x777).rc, CMPI_RC_ERR_INVALID_DATA_TYPE);
  EXPECT_EQ(path->ft->addKey(path, "", value, CMPI_chars).rc, CMPI_RC_ERR_INVALID_PARAMETER);
  EXPECT_EQ(path->ft->addKey(path, nullptr, value, CMPI_chars).rc, CMPI_RC_ERR_INVALID_PARAMETER);
  EXPECT_EQ(path->ft->addKey(path, "Key", nullptr, CMPI_chars).rc, CMPI_RC_ERR_INVALID_PARAMETER);
  const CMPIValue* const none = chars(nullptr);
  EXPECT_EQ(path->ft->addKey(path, "Key", none, CMPI_chars).rc, CMPI_RC_ERR_INVALID_PARAMETER);
  EXPECT_EQ(path->ft->addKey(path, "Key", none, CMPI_string).rc, CMPI_RC_ERR_INVALID_PARAMETER);
  EXPECT_EQ(path->ft->getKeyCount(path, nullptr), 0U);
}

TEST_F(ObjectPathTest, SaysWhichKeysAreNotThere) {
  const CMPIObjectPath* const path = newKeyedPath("id");
  CMPIStatus status{};
  EXPECT_NE(path->ft->getKey(path, "Other", &status).state & CMPI_notFound, 0);
  EXPECT_EQ(status.rc, CMPI_RC_ERR_NOT_FOUND);
  EXPECT_NE(path->ft->getKeyAt(path, 1, nullptr, &status).state & CMPI_notFound, 0);
  EXPECT_EQ(status.rc, CMPI_RC_ERR_NOT_FOUND);
}

// A path inside a path is a value: what a provider does with the one it was handed changes nothing.
TEST_F(ObjectPathTest, ReferencesAreCopiedInAndOut) {
  CMPIObjectPath* const link = newPath("Test_Link");
  CMPIObjectPath* const end = newKeyedPath("before");
  CMPIValue value{};
  value.ref = end;
  EXPECT_EQ(link->ft->addKey(link, "Left", &value, CMPI_ref).rc, CMPI_RC_OK);
  add(end, "InstanceID", "after");
  CMPIObjectPath* const read = link->ft->getKey(link, "left", nullptr).value.ref;
  EXPECT_EQ(key(read, "InstanceID"), "before");
  add(read, "InstanceID", "changed");
  add(read, "Another", "key");
  const CMPIObjectPath* const again = link->ft->getKey(link, "Left", nullptr).value.ref;
  EXPECT_EQ(key(again, "InstanceID"), "before");
  EXPECT_EQ(again->ft->getKeyCount(again, nullptr), 1U);
}

TEST_F(ObjectPathTest, HasNoQualifiers) {
  const CMPIObjectPath* const path = newPath();
  const CMPIObjectPathFT& ft = *path->ft;
  CMPIStatus status{};
  (void)ft.getClassQualifier(path, "Q", &status);
  EXPECT_EQ(status.rc, CMPI_RC_ERR_NOT_SUPPORTED);
  (void)ft.getPropertyQualifier(path, "P", "Q", &status);
  EXPECT_EQ(status.rc, CMPI_RC_ERR_NOT_SUPPORTED);
  (void)ft.getMethodQualifier(path, "M", "Q", &status);
  EXPECT_EQ(status.rc, CMPI_RC_ERR_NOT_SUPPORTED);
  (void)ft.getParameterQualifier(path, "M", "P", "Q", &status);
  EXPECT_EQ(status.rc, CMPI_RC_ERR_NOT_SUPPORTED);
}

TEST_F(ObjectPathTest, PrintsAsAUri) {
  const CMPIObjectPath* const path = newKeyedPath("say \"x\"");
  EXPECT_EQ(textOf(path->ft->toString(path, nullptr)), R"(root/test:Test_Thing.InstanceID="say \"x\"")");
}

TEST_F(ObjectPathTest, ComparesByClassAndKeys) {
  CMPIObjectPath* const left = newPath("test_keyed");
  CMPIObjectPath* const right = eft_->newObjectPath(mb_, "other", "TEST_KEYED", nullptr);
  const CMPIValue seven = number(7);
  const CMPIValue minus = number(static_cast<unsigned long long>(-1));
  left->ft->addKey(left, "Uint8", &seven, CMPI_uint8);
  left->ft->addKey(left, "Sint8", &minus, CMPI_sint8);
  right->ft->addKey(right, "SINT8", &minus, CMPI_sint64);
  EXPECT_FALSE(samePath(*ObjectPath::from(left), *ObjectPath::from(right)));
  right->ft->addKey(right, "uint8", &seven, CMPI_sint64);
  EXPECT_TRUE(samePath(*ObjectPath::from(left), *ObjectPath::from(right)));
  EXPECT_EQ(pathHash(*ObjectPath::from(left)), pathHash(*ObjectPath::from(right)));
  right->ft->addKey(right, "Sint8", &minus, CMPI_uint64);
  EXPECT_FALSE(samePath(*ObjectPath::from(left), *ObjectPath::from(right)));
  add(right, "Sint8", "-1");
  EXPECT_FALSE(samePath(*ObjectPath::from(left), *ObjectPath::from(right)));
  right->ft->setClassName(right, "Test_Thing");
  EXPECT_FALSE(samePath(*ObjectPath::from(left), *ObjectPath::from(right)));
}

TEST_F(ObjectPathTest, ItsHashTellsOtherPathsApart) {
  const auto hash = [](const CMPIObjectPath* path) { return pathHash(*ObjectPath::from(path)); };
  EXPECT_EQ(hash(newKeyedPath("a")), hash(newKeyedPath("a")));
  EXPECT_NE(hash(newKeyedPath("a")), hash(newKeyedPath("b")));
  EXPECT_NE(hash(newPath("Test_Thing")), hash(newPath("Test_Link")));
  const auto link = [this](const char* left, const char* right) {
    CMPIObjectPath* const path = newPath("Test_Link");
    CMPIValue end{};
    end.ref = newKeyedPath(left);
    path->ft->addKey(path, "Left", &end, CMPI_ref);
    end.ref = newKeyedPath(right);
    path->ft->addKey(path, "Right", &end, CMPI_ref);
    return path;
  };
  EXPECT_EQ(hash(link("a", "b")), hash(link("a", "b")));
  EXPECT_NE(hash(link("a", "b")), hash(link("b", "a")));
}

}  // namespace
}  // namespace cimom
