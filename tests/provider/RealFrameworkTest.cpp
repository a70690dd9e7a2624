// The loaded provider over the real framework, on machines/edges.json: the edge cases that a real tree can
// show.
#include <gmock/gmock.h>

#include "RealRequests.h"

namespace {

using testing::ElementsAre;
using testing::IsEmpty;

using RealFramework = RealRequests;

TEST_F(RealFramework, NamesComeInOrderFirmwareBiosDrivers) {
  const Answer answer = enumerateNames();
  EXPECT_EQ(answer.status, CMPI_RC_OK);
  EXPECT_THAT(answer.names, ElementsAre("26@f1", "26@f2", "192@f3", "192@b1", "192@d1", "192@d2"));
  EXPECT_EQ(answer.done, 1);
}

TEST_F(RealFramework, EveryNameNamesItsInstanceAlone) {
  for (const std::string& name : enumerateNames().names) {
    const Answer answer = get(name.c_str());
    EXPECT_THAT(answer.names, ElementsAre(name));
    EXPECT_EQ(answer.done, 1);
  }
}

TEST_F(RealFramework, AnInstanceIdOfADriverPassesTheOtherTypes) {
  EXPECT_THAT(get("192@d2").names, ElementsAre("192@d2"));
}

TEST_F(RealFramework, AnInstanceIdThatNamesNothingYieldsTheDoneMarkerAlone) {
  for (const char* id :
       {"192@nothing", "192@ff", "12@", "192@0", "192@ffffffffffffffff", "192@F1", "192@0f1"}) {
    const Answer answer = get(id);
    EXPECT_EQ(answer.status, CMPI_RC_OK) << id;
    EXPECT_THAT(answer.names, IsEmpty()) << id;
    EXPECT_EQ(answer.done, 1) << id;
  }
}

TEST_F(RealFramework, TheComputersIdentifierSelectsAllBelowIt) {
  EXPECT_THAT(enumerateNames("192").names,
              ElementsAre("26@f1", "26@f2", "192@f3", "192@b1", "192@d1", "192@d2"));
}

TEST_F(RealFramework, ADevicesIdentifierSelectsWhatIsBelowIt) {
  EXPECT_THAT(enumerateNames("26").names, ElementsAre("26@f1", "26@f2"));
}

TEST_F(RealFramework, AParentIdentifierThatNamesNothingEndsWithoutDoneMarker) {
  for (const char* id : {"other", "0", "18446744073709551615", "99999999999999999999", "27"}) {
    const Answer answer = enumerateNames(id);
    EXPECT_EQ(answer.status, CMPI_RC_OK) << id;
    EXPECT_THAT(answer.names, IsEmpty()) << id;
    EXPECT_EQ(answer.done, 0) << id;
  }
}

TEST_F(RealFramework, PropertiesFollowTheNode) {
  const Answer answer = enumerate();
  ASSERT_EQ(answer.instances.size(), 6U);
  EXPECT_EQ(answer.property(0, "MajorVersion"), "4464") << "the low 16 bits of 70000";
  EXPECT_EQ(answer.property(0, "Description"), "Orsella Controller II Firmware");
  EXPECT_EQ(answer.property(0, "VersionString"), "7.1");
  EXPECT_EQ(answer.property(0, "Classifications"), "10");
  EXPECT_EQ(answer.property(1, "Classifications"), "11");
  EXPECT_EQ(answer.property(1, "ClassificationDescriptions"), "BIOS/FCode");
  EXPECT_EQ(answer.property(2, "VersionString"), "0x4F") << "FPGA firmware has it under another property";
  EXPECT_EQ(answer.property(3, "Classifications"), "11") << "a type-2 node, whatever its description";
  EXPECT_EQ(answer.property(4, "VersionString"), "5.10");
  EXPECT_EQ(answer.property(4, "ClassificationDescriptions"), "Driver");
  EXPECT_EQ(answer.property(5, "VersionString"), "(unset)");
}

TEST_F(RealFramework, DatesAreSetTogetherOrNotAtAll) {
  const Answer answer = enumerate();
  EXPECT_EQ(answer.property(0, "ReleaseDate"), "20101231000000.000000+000");
  EXPECT_EQ(answer.property(0, "InstallDate"), answer.property(0, "ReleaseDate"));
  EXPECT_EQ(answer.property(2, "ReleaseDate"), "   00000000000.000000+000");
  EXPECT_EQ(answer.property(2, "InstallDate"), answer.property(2, "ReleaseDate"));
  EXPECT_EQ(answer.property(1, "ReleaseDate"), "(unset)");
  EXPECT_EQ(answer.property(1, "InstallDate"), "(unset)");
}

TEST_F(RealFramework, NeverPublishesCaptionElementNameOrAnyStatus) {
  const Answer answer = enumerate();
  for (std::size_t i = 0; i < answer.instances.size(); ++i) {
    for (const char* name :
         {"Caption", "ElementName", "OperationalStatus", "StatusDescriptions", "HealthState", "PrimaryStatus",
          "DetailedStatus", "OperatingStatus", "CommunicationStatus"}) {
      EXPECT_EQ(answer.property(i, name), "(unset)") << name;
    }
  }
}

}  // namespace
