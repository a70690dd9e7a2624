// The properties of published instances, through the function table: each getter's cases.
#include <gmock/gmock.h>

#include <cstring>
#include <ctime>

#include "ProviderAccess.h"

namespace {

using testing::ElementsAre;

using InstanceProperties = ProviderTest;

TEST_F(InstanceProperties, MajorVersionIsTheLowSixteenBits) {
  world.nodes[3].numbers[104] = 70000;
  getInstance(pathOf("192@f2"));
  EXPECT_EQ(property(0, "MajorVersion"), "4464");
  EXPECT_EQ(property(0, "MinorVersion"), "0");
  getInstance(pathOf("26@f1"));
  EXPECT_EQ(property(1, "MajorVersion"), "(unset)");
}

TEST_F(InstanceProperties, ANodeNamedVelmor2GetsTheFixedDescription) {
  world.nodes[2].texts[108] = "The Velmor2 chip";
  getInstance(pathOf("26@f1"));
  EXPECT_EQ(property(0, "Description"), "Orsella Controller II Firmware");
  EXPECT_EQ(property(0, "Name"), "The Velmor2 chip");
  getInstance(pathOf("192@f2"));
  EXPECT_EQ(property(1, "Description"), "BIOS");
  EXPECT_EQ(property(1, "Name"), "(unset)");
}

TEST_F(InstanceProperties, BiosAndDiagnosticInOneDescriptionClassifiesAsBios) {
  world.nodes[2].description = "Diagnostic BIOS";
  getInstance(pathOf("26@f1"));
  EXPECT_EQ(property(0, "Classifications"), "[11]");
  EXPECT_EQ(property(0, "ClassificationDescriptions"), "[BIOS/FCode]");
}

TEST_F(InstanceProperties, ClassificationFollowsTypeAndDescription) {
  const std::vector<std::pair<std::string, std::string>> expected = {
      {"UEFI", "[11]"},          {"Diagnostic UEFI", "[11]"},
      {"My Diagnostics", "[7]"}, {"diagnostic", "[10]"},
      {"bios", "[10]"},          {"", "[10]"},
  };
  for (const auto& [description, classification] : expected) {
    world.forget();
    world.nodes[2].description = description;
    getInstance(pathOf("26@f1"));
    EXPECT_EQ(property(0, "Classifications"), classification) << description;
  }
  world.forget();
  enumInstances(path());
  EXPECT_EQ(property(2, "Classifications"), "[11]");
  EXPECT_EQ(property(2, "ClassificationDescriptions"), "[BIOS/FCode]");
  EXPECT_EQ(property(3, "Classifications"), "[2]");
  EXPECT_EQ(property(3, "ClassificationDescriptions"), "[Driver]");
}

TEST_F(InstanceProperties, VersionStringComesFromThePropertyOfItsKind) {
  enumInstances(path());
  EXPECT_EQ(property(0, "VersionString"), "7.1");
  EXPECT_EQ(property(2, "VersionString"), "2.1");
  EXPECT_EQ(property(3, "VersionString"), "5.10");
  EXPECT_EQ(property(4, "VersionString"), "(unset)");
  for (const char* description : {"An FPGA Firmware", "Baseboard controller"}) {
    world.forget();
    world.nodes[2].description = description;
    world.nodes[2].texts[122] = "under 122";
    getInstance(pathOf("26@f1"));
    EXPECT_EQ(property(0, "VersionString"), "under 122");
  }
}

TEST_F(InstanceProperties, AParentTextThatIsNotHexadecimalCountsAsZero) {
  world.nodes[2].parent = "xyz";
  enumInstanceNames(path());
  EXPECT_EQ(returnedNames().front(), "0@f1");
}

TEST_F(InstanceProperties, ANodeTextNeedNotBeHexadecimal) {
  world.nodes[2].text = "xyz";
  enumInstanceNames(path());
  EXPECT_EQ(returnedNames().front(), "26@xyz");
}

TEST_F(InstanceProperties, AnInstanceIdThatNamesNothingLeavesTheAdapterFalseAtOnce) {
  getInstance(pathOf("26@other"));
  EXPECT_EQ(countCalls("createObjectPath(KELVO_SoftwareIdentity)"), 0U);
  EXPECT_EQ(world.done, 1);
}

TEST_F(InstanceProperties, WithoutReleaseDateNeitherDateIsSet) {
  getInstance(pathOf("192@f2"));
  EXPECT_EQ(property(0, "InstallDate"), "(unset)");
  EXPECT_EQ(property(0, "ReleaseDate"), "(unset)");
}

TEST_F(InstanceProperties, InstallDateEqualsReleaseDate) {
  for (const char* date : {"12/31/2010", "", "1/2", "nonsense"}) {
    world.forget();
    world.nodes[2].texts[164] = date;
    getInstance(pathOf("26@f1"));
    EXPECT_EQ(property(0, "InstallDate").rfind("datetime:", 0), 0U);
    EXPECT_EQ(property(0, "InstallDate"), property(0, "ReleaseDate"));
  }
}

TEST_F(InstanceProperties, NeverPublishesCaptionElementNameOrAnyStatus) {
  enumInstances(path());
  ASSERT_EQ(world.returnedInstances.size(), 5U);
  for (std::size_t i = 0; i < 5; ++i) {
    for (const char* name : {"Caption",
                             "ElementName",
                             "OperationalStatus",
                             "StatusDescriptions",
                             "HealthState",
                             "PrimaryStatus",
                             "DetailedStatus",
                             "OperatingStatus",
                             "CommunicationStatus",
                             "RevisionNumber",
                             "BuildNumber",
                             "TargetOperatingSystems",
                             "Languages",
                             "SerialNumber",
                             "TargetTypes",
                             "IdentityInfoValue",
                             "IdentityInfoType",
                             "IsEntity",
                             "ExtendedResourceType",
                             "OtherExtendedResourceTypeDescription",
                             "MinExtendedResourceTypeMajorVersion",
                             "MinExtendedResourceTypeMinorVersion",
                             "MinExtendedResourceTypeRevisionNumber",
                             "MinExtendedResourceTypeBuildNumber",
                             "TargetOSTypes"}) {
      EXPECT_EQ(property(i, name), "(unset)") << name;
    }
  }
}

TEST_F(InstanceProperties, PropertiesAreSetInTheirOrder) {
  world.nodes[2].texts = {{108, "n"}, {307, "v"}, {171, "b"}, {36, "m"}, {164, "12/31/2010"}};
  world.nodes[2].numbers = {{104, 1}, {107, 2}};
  getInstance(pathOf("26@f1"));
  std::vector<std::string> names;
  for (const auto& [name, value] : world.returnedInstances.at(0)->properties) {
    names.push_back(name);
  }
  EXPECT_THAT(names, ElementsAre("Description", "InstallDate", "Name", "InstanceID", "MajorVersion",
                                 "MinorVersion", "VersionString", "BuildID", "Manufacturer",
                                 "Classifications", "ClassificationDescriptions", "ReleaseDate"));
}

TEST_F(InstanceProperties, ThePropertyListIsTheBrokersBusiness) {
  const char* wanted[] = {"Description", nullptr};
  getInstance(pathOf("192@f2"), wanted);
  EXPECT_EQ(property(0, "VersionString"), "2.0");
}

/// Sets the process's time zone for a test: seconds west of UTC, as the C library has it.
class TimeZone {
 public:
  explicit TimeZone(const char* zone) { change(zone); }
  TimeZone(const TimeZone&) = delete;
  TimeZone& operator=(const TimeZone&) = delete;
  ~TimeZone() { change("UTC"); }

 private:
  static void change(const char* zone) {
    setenv("TZ", zone, 1);
    tzset();
  }
};

TEST_F(InstanceProperties, ReleaseDateTakesTheOffsetPositiveToTheWest) {
  const std::vector<std::pair<const char*, const char*>> zones = {
      {"UTC", "datetime:20101231000000.000000+000"},
      {"XXX5", "datetime:20101231000000.000000+300"},
      {"XXX-5:30", "datetime:20101231000000.000000-330"},
  };
  for (const auto& [zone, expected] : zones) {
    const TimeZone scope(zone);
    world.forget();
    getInstance(pathOf("26@f1"));
    EXPECT_EQ(property(0, "ReleaseDate"), expected);
  }
}

TEST_F(InstanceProperties, AnEmptyReleaseDateGivesPaddingAndZeros) {
  world.nodes[2].texts[164] = "";
  getInstance(pathOf("26@f1"));
  EXPECT_EQ(property(0, "ReleaseDate"), "datetime:   00000000000.000000+000");
}

TEST_F(InstanceProperties, ADateTooLongForItsBufferIsCut) {
  world.nodes[2].texts[164] = "-1/-1/-999";
  const TimeZone scope("UTC");
  getInstance(pathOf("26@f1"));
  EXPECT_EQ(property(0, "ReleaseDate").size(), std::strlen("datetime:") + 25);
}

}  // namespace
