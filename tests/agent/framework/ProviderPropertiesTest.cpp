// The CMPI helpers that read and set properties of instances, and those between monikers and paths.
#include "tests/support/FakeCmpi.h"

#include <Oru/Moniker.h>
#include <Oru/ProviderUtilities.h>
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <string>
#include <utility>
#include <vector>

namespace {

using Oru::Moniker;
using Oru::ProviderUtilities;
using ::testing::Each;
using ::testing::ElementsAre;
using ::testing::IsEmpty;
using ::testing::Pair;
using tests::FakeCmpi;
using Fault = FakeCmpi::Fault;

class ProviderPropertiesTest : public ::testing::Test {
 protected:
  CMPIData set(const char* name) const {
    const auto data = FakeCmpi::property(instance, name);
    EXPECT_TRUE(data.has_value()) << name;
    return data.value_or(CMPIData{});
  }
  bool isSet(const char* name) const { return FakeCmpi::property(instance, name).has_value(); }

  FakeCmpi cmpi;
  CMPIInstance* instance = cmpi.instance("root/kelvo", "KELVO_SoftwareIdentity");
  std::string date = "20101231000000.000000+000";
};

TEST_F(ProviderPropertiesTest, readsStrings) {
  cmpi.setProperty(instance, "Name", cmpi.stringData("eth0"));
  for (const bool caseMatters : {false, true}) {
    cmpi.caseMatters = caseMatters;
    for (const bool flag : {false, true}) {
      std::string value;
      EXPECT_TRUE(ProviderUtilities::getProperty(instance, "Name", value, flag));
      EXPECT_EQ(value, "eth0");
      value.clear();
      EXPECT_TRUE(ProviderUtilities::getProperty(instance, "NAME", value, flag));
      EXPECT_EQ(value, "eth0");
    }
  }
}

TEST_F(ProviderPropertiesTest, whatIsNoStringReadsAsFalse) {
  // The state decides, also where the value looks like one.
  CMPIData data = cmpi.stringData("text");
  data.state = CMPI_nullValue;
  cmpi.setProperty(instance, "Null", data);
  data.state = CMPI_badValue;
  cmpi.setProperty(instance, "Bad", data);
  cmpi.setProperty(instance, "NullText", cmpi.stringData(nullptr));
  cmpi.setProperty(instance, "Number", CMPIData{CMPI_uint16, CMPI_goodValue, {}});
  std::string value = "before";
  for (const char* name : {"Null", "Bad", "NullText", "Number", "Missing"}) {
    EXPECT_FALSE(ProviderUtilities::getProperty(instance, name, value, false)) << name;
  }
  EXPECT_FALSE(ProviderUtilities::getProperty(instance, nullptr, value, false));
  EXPECT_FALSE(ProviderUtilities::getProperty(nullptr, "Null", value, false));
  EXPECT_EQ(value, "before");
}

TEST_F(ProviderPropertiesTest, readsThatFailReadAsFalse) {
  cmpi.setProperty(instance, "Name", cmpi.stringData("eth0"));
  std::string value;
  cmpi.faults = {{"getProperty", Fault::Both}, {"getPropertyAt", Fault::Both}};
  EXPECT_FALSE(ProviderUtilities::getProperty(instance, "Name", value, false));
  cmpi.faults.clear();
  cmpi.instanceTable.getProperty = nullptr;
  cmpi.instanceTable.getPropertyCount = nullptr;
  EXPECT_FALSE(ProviderUtilities::getProperty(instance, "Name", value, false));
  instance->ft = nullptr;
  EXPECT_FALSE(ProviderUtilities::getProperty(instance, "Name", value, false));
}

TEST_F(ProviderPropertiesTest, simpleValuesAreOneCallEach) {
  std::string text = "1.2.3";
  CMPIObjectPath* end = cmpi.path("root", "KELVO_ComputerSystem");
  ProviderUtilities::setProperty(instance, "VersionString", text);
  ProviderUtilities::setProperty(instance, "MajorVersion", static_cast<unsigned short>(65535));
  ProviderUtilities::setProperty(instance, "IsEntity", true);
  ProviderUtilities::setProperty(instance, "IsNot", false);
  ProviderUtilities::setProperty(instance, "System", end);
  ProviderUtilities::setProperty(cmpi.broker(), instance, "Caption", text, false);
  EXPECT_THAT(cmpi.calls, Each("setProperty"));
  EXPECT_EQ(cmpi.calls.size(), 6U);
  EXPECT_EQ(FakeCmpi::text(set("VersionString")), "1.2.3");
  EXPECT_EQ(set("MajorVersion").type, CMPI_uint16);
  EXPECT_EQ(set("MajorVersion").value.uint16, 65535);
  EXPECT_EQ(set("IsEntity").type, CMPI_boolean);
  EXPECT_EQ(set("IsEntity").value.boolean, 1);
  EXPECT_EQ(set("IsNot").value.boolean, 0);
  EXPECT_EQ(set("System").type, CMPI_ref);
  EXPECT_EQ(set("System").value.ref, end);
  EXPECT_EQ(FakeCmpi::text(set("Caption")), "1.2.3");
}

TEST_F(ProviderPropertiesTest, datetimes) {
  ProviderUtilities::setProperty(cmpi.broker(), instance, "ReleaseDate", date, true);
  EXPECT_THAT(cmpi.calls, ElementsAre("newDateTimeFromChars", "setProperty"));
  EXPECT_EQ(set("ReleaseDate").type, CMPI_dateTime);
  EXPECT_EQ(FakeCmpi::text(set("ReleaseDate").value.dateTime), date);
}

TEST_F(ProviderPropertiesTest, whatIsNoDatetimeStaysUnset) {
  std::string text = "12/31/2010";
  ProviderUtilities::setProperty(cmpi.broker(), instance, "ReleaseDate", text, true);
  EXPECT_FALSE(isSet("ReleaseDate"));
  for (const Fault fault : {Fault::Null, Fault::Status, Fault::Both}) {
    cmpi.faults = {{"newDateTimeFromChars", fault}};
    ProviderUtilities::setProperty(cmpi.broker(), instance, "ReleaseDate", date, true);
    EXPECT_FALSE(isSet("ReleaseDate"));
  }
  cmpi.factory.newDateTimeFromChars = nullptr;
  ProviderUtilities::setProperty(cmpi.broker(), instance, "ReleaseDate", date, true);
  ProviderUtilities::setProperty(nullptr, instance, "ReleaseDate", date, true);
  EXPECT_FALSE(isSet("ReleaseDate"));
}

TEST_F(ProviderPropertiesTest, numberArrays) {
  std::vector<unsigned short> numbers{10, 65535};
  ProviderUtilities::setProperty(cmpi.broker(), instance, "Classifications", numbers);
  EXPECT_THAT(cmpi.calls, ElementsAre("newArray", "setElementAt", "setElementAt", "setProperty"));
  ASSERT_EQ(set("Classifications").type, CMPI_uint16A);
  const auto elements = FakeCmpi::elements(set("Classifications").value.array);
  ASSERT_EQ(elements.size(), 2U);
  EXPECT_EQ(elements[0].value.uint16, 10);
  EXPECT_EQ(elements[1].value.uint16, 65535);
}

TEST_F(ProviderPropertiesTest, stringArrays) {
  std::vector<std::string> texts{"BIOS/FCode", ""};
  ProviderUtilities::setProperty(cmpi.broker(), instance, "ClassificationDescriptions", texts);
  ASSERT_EQ(set("ClassificationDescriptions").type, CMPI_stringA);
  const auto elements = FakeCmpi::elements(set("ClassificationDescriptions").value.array);
  ASSERT_EQ(elements.size(), 2U);
  EXPECT_EQ(FakeCmpi::text(elements[0]), "BIOS/FCode");
  EXPECT_EQ(FakeCmpi::text(elements[1]), "");
}

TEST_F(ProviderPropertiesTest, emptyArraysAreSetEmpty) {
  std::vector<unsigned short> numbers;
  std::vector<std::string> texts;
  ProviderUtilities::setProperty(cmpi.broker(), instance, "Numbers", numbers);
  ProviderUtilities::setProperty(cmpi.broker(), instance, "Texts", texts);
  EXPECT_THAT(FakeCmpi::elements(set("Numbers").value.array), IsEmpty());
  EXPECT_THAT(FakeCmpi::elements(set("Texts").value.array), IsEmpty());
}

TEST_F(ProviderPropertiesTest, arraysThatCannotBeMadeStayUnset) {
  std::vector<unsigned short> numbers{10};
  std::vector<std::string> texts{"text"};
  const auto setBoth = [&](const CMPIBroker* broker) {
    ProviderUtilities::setProperty(broker, instance, "Numbers", numbers);
    ProviderUtilities::setProperty(broker, instance, "Texts", texts);
    EXPECT_FALSE(isSet("Numbers"));
    EXPECT_FALSE(isSet("Texts"));
  };
  for (const Fault fault : {Fault::Null, Fault::Status, Fault::Both}) {
    cmpi.faults = {{"newArray", fault}};
    setBoth(cmpi.broker());
  }
  cmpi.faults = {{"setElementAt", Fault::Status}};
  setBoth(cmpi.broker());
  cmpi.faults.clear();
  cmpi.arrayTable.setElementAt = nullptr;
  setBoth(cmpi.broker());
  cmpi.factory.newArray = nullptr;
  setBoth(cmpi.broker());
  setBoth(nullptr);
}

TEST_F(ProviderPropertiesTest, settingOnNothingHasNoEffect) {
  std::string text = "text";
  std::vector<unsigned short> numbers{1};
  std::vector<std::string> texts{"text"};
  ProviderUtilities::setProperty(nullptr, "A", text);
  ProviderUtilities::setProperty(nullptr, "A", static_cast<unsigned short>(1));
  ProviderUtilities::setProperty(nullptr, "A", true);
  ProviderUtilities::setProperty(nullptr, "A", cmpi.path("root", "A"));
  ProviderUtilities::setProperty(cmpi.broker(), nullptr, "A", text, false);
  ProviderUtilities::setProperty(cmpi.broker(), nullptr, "A", date, true);
  ProviderUtilities::setProperty(cmpi.broker(), nullptr, "A", numbers);
  ProviderUtilities::setProperty(cmpi.broker(), nullptr, "A", texts);
  ProviderUtilities::setProperty(instance, "A", static_cast<CMPIObjectPath*>(nullptr));
  ProviderUtilities::setProperty(instance, nullptr, text);
  cmpi.instanceTable.setProperty = nullptr;
  ProviderUtilities::setProperty(instance, "A", text);
  EXPECT_FALSE(isSet("A"));
}

TEST_F(ProviderPropertiesTest, aRefusedPropertyIsLeftOut) {
  std::string text = "text";
  cmpi.faults = {{"setProperty", Fault::Status}};
  ProviderUtilities::setProperty(instance, "A", text);
  EXPECT_THAT(cmpi.calls, ElementsAre("setProperty"));
}

// Monikers.

std::vector<std::pair<std::string, std::string>> keysOf(Moniker& moniker) {
  std::vector<std::pair<std::string, std::string>> keys;
  for (unsigned int index = 0; moniker.selectKey(index); ++index) {
    auto& [name, value] = keys.emplace_back();
    moniker.getName(name);
    moniker.getValue(value);
  }
  return keys;
}

class MonikerTransformTest : public ::testing::Test {
 protected:
  FakeCmpi cmpi;
  CMPIObjectPath* path = cmpi.path("root/kelvo", "KELVO_NetworkPort");
  Moniker moniker;
};

TEST_F(MonikerTransformTest, stringKeysAreAppendedInOrder) {
  moniker.addKey("Before", "0");
  cmpi.setKey(path, "SystemName", cmpi.stringData("host"));
  cmpi.setKey(path, "Number", CMPIData{CMPI_uint16, CMPI_goodValue, {}});
  cmpi.setKey(path, "Null", CMPIData{CMPI_string, CMPI_nullValue, {}});
  cmpi.setKey(path, "DeviceID", cmpi.stringData("0000:01:00.0/0"));
  ProviderUtilities::transformObjectPathToMoniker(path, moniker);
  EXPECT_THAT(keysOf(moniker), ElementsAre(Pair("Before", "0"), Pair("SystemName", "host"),
                                           Pair("DeviceID", "0000:01:00.0/0")));
}

TEST_F(MonikerTransformTest, knownKeysGetTheContractsSpelling) {
  cmpi.setKey(path, "deviceid", cmpi.stringData("1"));
  cmpi.setKey(path, "NAME", cmpi.stringData("2"));
  cmpi.setKey(path, "instanceId", cmpi.stringData("3"));
  cmpi.setKey(path, "systemNAME", cmpi.stringData("4"));
  ProviderUtilities::transformObjectPathToMoniker(path, moniker);
  EXPECT_THAT(keysOf(moniker), ElementsAre(Pair("DeviceID", "1"), Pair("Name", "2"), Pair("InstanceID", "3"),
                                           Pair("systemNAME", "4")));
}

TEST_F(MonikerTransformTest, unreadablePathsAppendNothing) {
  cmpi.setKey(path, "Name", cmpi.stringData("host"));
  ProviderUtilities::transformObjectPathToMoniker(nullptr, moniker);
  for (const char* member : {"getKeyAt", "getKeyCount", "getCharPtr"}) {
    cmpi.faults = {{member, Fault::Both}};
    ProviderUtilities::transformObjectPathToMoniker(path, moniker);
  }
  cmpi.faults.clear();
  cmpi.pathTable.getKeyAt = nullptr;
  ProviderUtilities::transformObjectPathToMoniker(path, moniker);
  EXPECT_EQ(moniker.getKeyCount(), 0U);
}

TEST_F(MonikerTransformTest, aKeyWithoutReadableNameIsLeftOut) {
  cmpi.pathTable.getKeyCount = [](const CMPIObjectPath*, CMPIStatus*) -> CMPICount { return 1; };
  cmpi.pathTable.getKeyAt = [](const CMPIObjectPath*, CMPICount, CMPIString**, CMPIStatus*) {
    return CMPIData{CMPI_string, CMPI_goodValue, {}};
  };
  ProviderUtilities::transformObjectPathToMoniker(path, moniker);
  EXPECT_EQ(moniker.getKeyCount(), 0U);
}

TEST_F(MonikerTransformTest, monikersAreWrittenIntoPaths) {
  moniker.addKey("Name", "host");
  moniker.addKey("DeviceID", "0000:01:00.0/0");
  ProviderUtilities::transformMonikerToObjectPath(moniker, &path);
  EXPECT_EQ(FakeCmpi::text(FakeCmpi::key(path, "Name").value()), "host");
  EXPECT_EQ(FakeCmpi::text(FakeCmpi::key(path, "DeviceID").value()), "0000:01:00.0/0");
  EXPECT_EQ(ProviderUtilities::getKeyCount(path), 2);
}

TEST_F(MonikerTransformTest, writingIntoNoPathHasNoEffect) {
  moniker.addKey("Name", "host");
  CMPIObjectPath* none = nullptr;
  ProviderUtilities::transformMonikerToObjectPath(moniker, nullptr);
  ProviderUtilities::transformMonikerToObjectPath(moniker, &none);
  EXPECT_EQ(none, nullptr);
}

TEST_F(MonikerTransformTest, aPathSurvivesTheWayThroughAMoniker) {
  cmpi.setKey(path, "DeviceID", cmpi.stringData("a\"b\\c"));
  ProviderUtilities::transformObjectPathToMoniker(path, moniker);
  CMPIObjectPath* copy = cmpi.path("root/kelvo", "KELVO_NetworkPort");
  ProviderUtilities::transformMonikerToObjectPath(moniker, &copy);
  std::string value;
  EXPECT_TRUE(ProviderUtilities::getKeyProperty(copy, "DeviceID", value));
  EXPECT_EQ(value, "a\"b\\c");
}

}  // namespace
