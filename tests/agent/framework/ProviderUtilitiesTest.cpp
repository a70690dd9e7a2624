// The CMPI helpers over a CMPI of the tests' own: what they read and write, and that they take calmly what an
// object manager lacks or refuses.
#include "tests/support/FakeCmpi.h"

#include <Oru/ProviderUtilities.h>
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <map>
#include <string>
#include <utility>
#include <vector>

namespace {

using Oru::ProviderUtilities;
using ::testing::ElementsAre;
using ::testing::IsEmpty;
using tests::FakeCmpi;
using Fault = FakeCmpi::Fault;

class ProviderUtilitiesTest : public ::testing::Test {
 protected:
  static CMPIData numberData(CMPIUint16 number) {
    CMPIData data{CMPI_uint16, CMPI_goodValue, {}};
    data.value.uint16 = number;
    return data;
  }
  static CMPIData referenceData(CMPIObjectPath* target) {
    CMPIData data{CMPI_ref, CMPI_goodValue, {}};
    data.value.ref = target;
    return data;
  }
  static CMPIData nullData(CMPIType type) { return {type, CMPI_nullValue, {}}; }

  FakeCmpi cmpi;
  CMPIObjectPath* path = cmpi.path("root/kelvo", "KELVO_SoftwareIdentity");
  CMPIInstance* instance = cmpi.instance("root/kelvo", "KELVO_SoftwareIdentity");
};

// Class ids.

TEST_F(ProviderUtilitiesTest, classIdsOfTheKnownClasses) {
  const std::map<std::string, unsigned short> ids{
      {"KELVO_SoftwareIdentity", 2},
      {"KELVO_InstalledSoftwareIdentity", 3},
      {"KELVO_NetworkSoftwareIdentity", 35},
      {"KELVO_BMCSoftwareIdentity", 117},
      {"KELVO_BIOSSoftwareIdentity", 118},
      {"KELVO_ComputerSystem", 1},
      {"KELVO_NetworkPort", 17},
      {"KELVO_SPComputerSystem", 119},
  };
  for (const auto& [name, id] : ids) {
    EXPECT_EQ(ProviderUtilities::getClassId(name.c_str()), id) << name;
    EXPECT_EQ(ProviderUtilities::getClassId(cmpi.path("root", name.c_str())), id) << name;
  }
}

TEST_F(ProviderUtilitiesTest, classNamesIgnoreCase) {
  EXPECT_EQ(ProviderUtilities::getClassId("kelvo_softwareidentity"), 2);
  EXPECT_EQ(ProviderUtilities::getClassId("KELVO_BMCSOFTWAREIDENTITY"), 117);
}

TEST_F(ProviderUtilitiesTest, unknownClassesAre255) {
  const CMPIObjectPath* noPath = nullptr;
  const char* noName = nullptr;
  EXPECT_EQ(ProviderUtilities::getClassId(noPath), 255);
  EXPECT_EQ(ProviderUtilities::getClassId(noName), 255);
  EXPECT_EQ(ProviderUtilities::getClassId(""), 255);
  EXPECT_EQ(ProviderUtilities::getClassId("CIM_SoftwareIdentity"), 255);
  EXPECT_EQ(ProviderUtilities::getClassId("KELVO_SoftwareIdentit"), 255);
  EXPECT_EQ(ProviderUtilities::getClassId("KELVO_SoftwareIdentityX"), 255);
}

TEST_F(ProviderUtilitiesTest, aPathWithoutReadableClassIs255) {
  cmpi.faults["getClassName"] = Fault::Null;
  EXPECT_EQ(ProviderUtilities::getClassId(path), 255);
  cmpi.faults["getClassName"] = Fault::Status;
  EXPECT_EQ(ProviderUtilities::getClassId(path), 255);
  cmpi.faults = {{"getCharPtr", Fault::Null}};
  EXPECT_EQ(ProviderUtilities::getClassId(path), 255);
  cmpi.pathTable.getClassName = nullptr;
  EXPECT_EQ(ProviderUtilities::getClassId(path), 255);
}

// Class relation.

TEST_F(ProviderUtilitiesTest, relationFollowsTheBrokersSchema) {
  cmpi.parentOf = {{"KELVO_Thing", "KELVO_Base"}, {"KELVO_Base", "CIM_Thing"}};
  const auto related = [this](const char* name, const char* other) {
    return ProviderUtilities::areClassesRelated(cmpi.broker(), "root/kelvo", name, other);
  };
  EXPECT_TRUE(related("KELVO_Thing", "CIM_Thing"));
  EXPECT_TRUE(related("KELVO_Thing", "KELVO_Base"));
  EXPECT_FALSE(related("CIM_Thing", "KELVO_Thing"));
  EXPECT_FALSE(related("CIM_Other", "CIM_Thing"));
  EXPECT_TRUE(related("CIM_Thing", "cim_thing"));
}

TEST_F(ProviderUtilitiesTest, relationAsksForAPathInTheGivenNamespace) {
  static std::string askedFor;
  cmpi.factory.classPathIsA = [](const CMPIBroker*, const CMPIObjectPath* asked, const char* name,
                                 CMPIStatus*) -> CMPIBoolean {
    askedFor = FakeCmpi::nameSpaceOf(asked) + ":" + FakeCmpi::classOf(asked) + " is a " + name;
    return 1;
  };
  EXPECT_TRUE(ProviderUtilities::areClassesRelated(cmpi.broker(), "root/kelvo", "A", "B"));
  EXPECT_EQ(askedFor, "root/kelvo:A is a B");
}

TEST_F(ProviderUtilitiesTest, aNullClassIsRelatedToEveryClass) {
  EXPECT_TRUE(ProviderUtilities::areClassesRelated(cmpi.broker(), "root", nullptr, "CIM_Thing"));
  EXPECT_TRUE(ProviderUtilities::areClassesRelated(nullptr, "", nullptr, nullptr));
  EXPECT_FALSE(ProviderUtilities::areClassesRelated(cmpi.broker(), "root", "CIM_Thing", nullptr));
}

TEST_F(ProviderUtilitiesTest, relationIsFalseWhereTheBrokerFails) {
  cmpi.parentOf = {{"A", "B"}};
  const auto related = [this] { return ProviderUtilities::areClassesRelated(cmpi.broker(), "r", "A", "B"); };
  ASSERT_TRUE(related());
  for (const Fault fault : {Fault::Null, Fault::Status, Fault::Both}) {
    cmpi.faults = {{"newObjectPath", fault}};
    EXPECT_FALSE(related());
    cmpi.faults = {{"classPathIsA", fault}};
    EXPECT_FALSE(related());
  }
  cmpi.faults.clear();
  cmpi.factory.classPathIsA = nullptr;
  EXPECT_FALSE(related());
  cmpi.factory.newObjectPath = nullptr;
  EXPECT_FALSE(related());
  EXPECT_FALSE(ProviderUtilities::areClassesRelated(nullptr, "r", "A", "B"));
}

// Namespaces and keys.

TEST_F(ProviderUtilitiesTest, namespaceOfAPath) {
  EXPECT_EQ(ProviderUtilities::getNamespace(path), "root/kelvo");
  EXPECT_EQ(ProviderUtilities::getNamespace(nullptr), "");
  cmpi.faults = {{"getNameSpace", Fault::Null}};
  EXPECT_EQ(ProviderUtilities::getNamespace(path), "");
  cmpi.faults = {{"getNameSpace", Fault::Status}};
  EXPECT_EQ(ProviderUtilities::getNamespace(path), "");
  cmpi.pathTable.getNameSpace = nullptr;
  EXPECT_EQ(ProviderUtilities::getNamespace(path), "");
  path->ft = nullptr;
  EXPECT_EQ(ProviderUtilities::getNamespace(path), "");
}

TEST_F(ProviderUtilitiesTest, keyCount) {
  EXPECT_EQ(ProviderUtilities::getKeyCount(path), 0);
  cmpi.setKey(path, "A", cmpi.stringData("1"));
  cmpi.setKey(path, "B", cmpi.stringData("2"));
  EXPECT_EQ(ProviderUtilities::getKeyCount(path), 2);
  EXPECT_EQ(ProviderUtilities::getKeyCount(nullptr), 0);
  cmpi.faults = {{"getKeyCount", Fault::Status}};
  EXPECT_EQ(ProviderUtilities::getKeyCount(path), 0);
  cmpi.faults.clear();
  cmpi.setKey(path, "Unset", {CMPI_string, CMPI_nullValue, {}});
  EXPECT_EQ(ProviderUtilities::getKeyCount(path), 2) << "a null is no key";
  cmpi.pathTable.getKeyCount = [](const CMPIObjectPath*, CMPIStatus*) -> CMPICount { return 65536; };
  EXPECT_EQ(ProviderUtilities::getKeyCount(path), 2) << "one that cannot be read neither";
  cmpi.pathTable.getKeyAt = [](const CMPIObjectPath*, CMPICount, CMPIString**, CMPIStatus*) {
    return CMPIData{CMPI_uint8, CMPI_goodValue, {}};
  };
  EXPECT_EQ(ProviderUtilities::getKeyCount(path), 65535);
  cmpi.pathTable.getKeyCount = nullptr;
  EXPECT_EQ(ProviderUtilities::getKeyCount(path), 0);
}

TEST_F(ProviderUtilitiesTest, stringKeys) {
  cmpi.setKey(path, "InstanceID", cmpi.stringData("12@ab"));
  cmpi.setKey(path, "Empty", cmpi.stringData(""));
  std::string value = "before";
  EXPECT_TRUE(ProviderUtilities::getKeyProperty(path, "InstanceID", value));
  EXPECT_EQ(value, "12@ab");
  EXPECT_TRUE(ProviderUtilities::getKeyProperty(path, "Empty", value));
  EXPECT_EQ(value, "");
}

TEST_F(ProviderUtilitiesTest, keyNamesIgnoreCaseWhateverTheBrokerDoes) {
  cmpi.setKey(path, "Other", cmpi.stringData("no"));
  cmpi.setKey(path, "instanceid", cmpi.stringData("12@ab"));
  for (const bool caseMatters : {false, true}) {
    for (const bool quiet : {false, true}) {
      cmpi.caseMatters = caseMatters;
      cmpi.findsNothingQuietly = quiet;
      std::string value;
      EXPECT_TRUE(ProviderUtilities::getKeyProperty(path, "InstanceID", value));
      EXPECT_EQ(value, "12@ab");
    }
  }
  cmpi.pathTable.getKey = nullptr;
  std::string value;
  EXPECT_TRUE(ProviderUtilities::getKeyProperty(path, "InstanceID", value));
}

TEST_F(ProviderUtilitiesTest, aKeyThatIsSpelledAsAskedCostsOneLookUp) {
  cmpi.setKey(path, "InstanceID", cmpi.stringData("12@ab"));
  std::string value;
  ProviderUtilities::getKeyProperty(path, "InstanceID", value);
  EXPECT_THAT(cmpi.calls, ElementsAre("getKey", "getCharPtr"));
}

TEST_F(ProviderUtilitiesTest, whatIsNoStringKeyReadsAsFalse) {
  cmpi.setKey(path, "Number", numberData(7));
  cmpi.setKey(path, "Null", nullData(CMPI_string));
  cmpi.setKey(path, "NullObject", CMPIData{CMPI_string, CMPI_goodValue, {}});
  cmpi.setKey(path, "NullText", cmpi.stringData(nullptr));
  cmpi.setKey(path, "Reference", referenceData(cmpi.path("root", "A")));
  cmpi.setKey(path, "Array", CMPIData{CMPI_stringA, CMPI_goodValue, {}});
  std::string value = "before";
  for (const char* name : {"Number", "Null", "NullObject", "NullText", "Reference", "Array", "Missing"}) {
    EXPECT_FALSE(ProviderUtilities::getKeyProperty(path, name, value)) << name;
  }
  EXPECT_FALSE(ProviderUtilities::getKeyProperty(path, nullptr, value));
  EXPECT_FALSE(ProviderUtilities::getKeyProperty(nullptr, "Number", value));
  EXPECT_EQ(value, "before");
}

TEST_F(ProviderUtilitiesTest, keyReadsThatFailReadAsFalse) {
  cmpi.setKey(path, "InstanceID", cmpi.stringData("12@ab"));
  std::string value;
  cmpi.faults = {{"getKey", Fault::Both}, {"getKeyAt", Fault::Both}};
  EXPECT_FALSE(ProviderUtilities::getKeyProperty(path, "InstanceID", value));
  cmpi.faults = {{"getKey", Fault::Both}, {"getKeyCount", Fault::Status}};
  EXPECT_FALSE(ProviderUtilities::getKeyProperty(path, "InstanceID", value));
  cmpi.faults = {{"getCharPtr", Fault::Null}};
  EXPECT_FALSE(ProviderUtilities::getKeyProperty(path, "InstanceID", value));
  cmpi.faults.clear();
  cmpi.pathTable.getKey = nullptr;
  cmpi.pathTable.getKeyAt = nullptr;
  EXPECT_FALSE(ProviderUtilities::getKeyProperty(path, "InstanceID", value));
  cmpi.stringTable.getCharPtr = nullptr;
  EXPECT_FALSE(ProviderUtilities::getKeyProperty(path, "InstanceID", value));
}

TEST_F(ProviderUtilitiesTest, charsKeysReadAsStrings) {
  std::string text = "plain";
  CMPIData data{CMPI_chars, CMPI_goodValue, {}};
  data.value.chars = text.data();
  cmpi.setKey(path, "Chars", data);
  std::string value;
  EXPECT_TRUE(ProviderUtilities::getKeyProperty(path, "Chars", value));
  EXPECT_EQ(value, "plain");
}

TEST_F(ProviderUtilitiesTest, referenceKeys) {
  CMPIObjectPath* end = cmpi.path("root", "KELVO_ComputerSystem");
  cmpi.setKey(path, "System", referenceData(end));
  cmpi.setKey(path, "Text", cmpi.stringData("text"));
  cmpi.setKey(path, "Null", nullData(CMPI_ref));
  cmpi.setKey(path, "NullPath", referenceData(nullptr));
  CMPIObjectPath* value = nullptr;
  EXPECT_TRUE(ProviderUtilities::getKeyProperty(path, "system", &value));
  EXPECT_EQ(value, end);
  for (const char* name : {"Text", "Null", "NullPath", "Missing"}) {
    EXPECT_FALSE(ProviderUtilities::getKeyProperty(path, name, &value)) << name;
  }
  EXPECT_EQ(value, end);
  EXPECT_FALSE(ProviderUtilities::getKeyProperty(path, "System", static_cast<CMPIObjectPath**>(nullptr)));
  EXPECT_FALSE(ProviderUtilities::getKeyProperty(nullptr, "System", &value));
}

TEST_F(ProviderUtilitiesTest, settingKeysIsOneCallEach) {
  CMPIObjectPath* end = cmpi.path("root", "KELVO_ComputerSystem");
  ProviderUtilities::setKeyProperty(path, "InstanceID", std::string("12@ab"));
  ProviderUtilities::setKeyProperty(path, "System", end);
  EXPECT_THAT(cmpi.calls, ElementsAre("addKey", "addKey"));
  EXPECT_EQ(FakeCmpi::text(FakeCmpi::key(path, "InstanceID").value()), "12@ab");
  EXPECT_EQ(FakeCmpi::key(path, "System").value().value.ref, end);
  EXPECT_EQ(FakeCmpi::key(path, "System").value().type, CMPI_ref);
}

TEST_F(ProviderUtilitiesTest, settingKeysOfNothingHasNoEffect) {
  ProviderUtilities::setKeyProperty(nullptr, "InstanceID", std::string("12@ab"));
  ProviderUtilities::setKeyProperty(path, nullptr, std::string("12@ab"));
  ProviderUtilities::setKeyProperty(path, "System", static_cast<CMPIObjectPath*>(nullptr));
  cmpi.pathTable.addKey = nullptr;
  ProviderUtilities::setKeyProperty(path, "InstanceID", std::string("12@ab"));
  EXPECT_THAT(cmpi.calls, IsEmpty());
}

// New objects.

TEST_F(ProviderUtilitiesTest, newPathsAndInstances) {
  CMPIObjectPath* made = ProviderUtilities::createObjectPath(cmpi.broker(), "KELVO_NetworkPort", "root/x");
  ASSERT_NE(made, nullptr);
  EXPECT_EQ(FakeCmpi::classOf(made), "KELVO_NetworkPort");
  EXPECT_EQ(FakeCmpi::nameSpaceOf(made), "root/x");
  EXPECT_NE(ProviderUtilities::createInstance(cmpi.broker(), made), nullptr);
  EXPECT_THAT(cmpi.calls, ElementsAre("newObjectPath", "newInstance"));
}

TEST_F(ProviderUtilitiesTest, newObjectsAreNullOnFailure) {
  EXPECT_EQ(ProviderUtilities::createObjectPath(nullptr, "A", "root"), nullptr);
  EXPECT_EQ(ProviderUtilities::createObjectPath(cmpi.broker(), nullptr, "root"), nullptr);
  EXPECT_EQ(ProviderUtilities::createInstance(nullptr, path), nullptr);
  EXPECT_EQ(ProviderUtilities::createInstance(cmpi.broker(), nullptr), nullptr);
  for (const Fault fault : {Fault::Null, Fault::Status, Fault::Both}) {
    cmpi.faults = {{"newObjectPath", fault}, {"newInstance", fault}};
    EXPECT_EQ(ProviderUtilities::createObjectPath(cmpi.broker(), "A", "root"), nullptr);
    EXPECT_EQ(ProviderUtilities::createInstance(cmpi.broker(), path), nullptr);
  }
  cmpi.factory.newObjectPath = nullptr;
  cmpi.factory.newInstance = nullptr;
  EXPECT_EQ(ProviderUtilities::createObjectPath(cmpi.broker(), "A", "root"), nullptr);
  EXPECT_EQ(ProviderUtilities::createInstance(cmpi.broker(), path), nullptr);
  const CMPIBroker bare{};
  EXPECT_EQ(ProviderUtilities::createObjectPath(&bare, "A", "root"), nullptr);
}

}  // namespace
