// Keys as they come: as a client sent them, unchecked; counted, but not set; lost on the way of an upcall.
#include <gmock/gmock.h>

#include "HostTest.h"

namespace {

using host::Answer;
using testing::AllOf;
using testing::Contains;
using testing::Each;
using testing::ElementsAre;
using testing::IsEmpty;
using testing::SizeIs;
using testing::StartsWith;

constexpr std::size_t softwareCount = 9;

class HostKeys : public HostTest {
 protected:
  /// The path with one more key: a number.
  CMPIObjectPath* withNumber(CMPIObjectPath* made, const char* key, CMPIUint32 number) {
    CMPIData data{CMPI_uint32, CMPI_goodValue, {}};
    data.value.uint32 = number;
    cmpi.setKey(made, key, data);
    return made;
  }
};

TEST_F(HostKeys, OfAClassThatNobodySetAreNone) {
  const std::vector<std::string> before = everything();
  EXPECT_THAT(before, Contains(StartsWith("KELVO_SoftwareIdentity: status 0, done 1, nulls 0\n")));
  countKeysOfClasses();
  EXPECT_EQ(everything(), before);
}

TEST_F(HostKeys, OfAClassPathThatCountsThemAsASourceAreNone) {
  const std::vector<std::string> before = providers.names(path(host::software), host::network).paths();
  EXPECT_THAT(before, SizeIs(2));
  countKeysOfClasses();
  EXPECT_EQ(providers.names(path(host::software), host::network).paths(), before);
  EXPECT_THAT(providers.names(path(host::ports), host::network).paths(),
              ElementsAre("KELVO_SoftwareIdentity(26@f3)", "KELVO_SoftwareIdentity(26@f4)"));
}

TEST_F(HostKeys, OfOtherNamesNarrowNothing) {
  const CMPIObjectPath* const wrong = path(host::software, {{"Identifier", "192@f1"}});
  for (const Answer& answer :
       {providers.enumerateNames(wrong), providers.enumerate(wrong), providers.get(wrong)}) {
    EXPECT_EQ(answer.status, CMPI_RC_OK);
    EXPECT_THAT(answer.objects, SizeIs(softwareCount));
  }
  EXPECT_THAT(providers.enumerate(path(host::computers, {{"Identifier", "alpha"}})).objects, SizeIs(2));
  EXPECT_EQ(providers.get(path(host::computers, {{"Identifier", "alpha"}})).status,
            CMPI_RC_ERR_INVALID_PARAMETER);
}

TEST_F(HostKeys, BeyondThoseOfTheClassChangeNothing) {
  EXPECT_THAT(
      providers.get(path(host::software, {{"Other", "x"}, {"InstanceID", "192@f1"}, {"More", "y"}})).paths(),
      ElementsAre("KELVO_SoftwareIdentity(192@f1)"));
  EXPECT_THAT(providers
                  .get(path(host::computers,
                            {{"Other", "x"}, {"CreationClassName", host::computers}, {"Name", "beta"}}))
                  .paths(),
              ElementsAre("KELVO_ComputerSystem(beta)"));
  EXPECT_THAT(
      providers.names(path(host::software, {{"Other", "x"}, {"InstanceID", "192@f1"}}), host::bios).paths(),
      ElementsAre("KELVO_ComputerSystem(alpha)"));
}

// A number is no InstanceID: the request is one without.
TEST_F(HostKeys, ThatAreNumbersAreNoTexts) {
  const Answer identity = providers.get(withNumber(path(host::software), "InstanceID", 192));
  EXPECT_EQ(identity.status, CMPI_RC_OK);
  EXPECT_THAT(identity.objects, SizeIs(softwareCount));
  const Keys keyOfClass{{"CreationClassName", host::computers}};
  EXPECT_EQ(providers.get(withNumber(path(host::computers, keyOfClass), "Name", 7)).status,
            CMPI_RC_ERR_NOT_FOUND);
  EXPECT_THAT(providers.enumerate(withNumber(path(host::computers), "Name", 7)).objects, IsEmpty());
  for (const char* association : associationClasses) {
    const Answer answer = providers.names(withNumber(path(host::software), "InstanceID", 192), association);
    EXPECT_EQ(answer.status, CMPI_RC_OK) << association;
    EXPECT_THAT(answer.objects, IsEmpty()) << association;
  }
}

TEST_F(HostKeys, OfASourceThatAreWrongFindNothing) {
  for (const char* association : associationClasses) {
    const Answer answer = providers.associators(path(host::software, {{"Identifier", "x"}}), association);
    EXPECT_EQ(answer.status, CMPI_RC_OK) << association;
    EXPECT_EQ(answer.done, 1);
    EXPECT_THAT(answer.objects, IsEmpty()) << association;
  }
  EXPECT_THAT(providers.names(path(host::computers, {{"Identifier", "x"}}), host::bios).objects, IsEmpty());
  EXPECT_THAT(providers.names(path(host::computers, {{"Identifier", "x"}}), host::installed).objects,
              SizeIs(softwareCount))
      << "a computer's path narrows nothing";
}

TEST_F(HostKeys, OfAnAssociationMayBeTextsOrMissing) {
  for (const Keys& keys : {Keys{{"System", "alpha"}, {"InstalledSoftware", "192@f1"}},
                           Keys{{"System", "alpha"}}, Keys{{"Name", "alpha"}}}) {
    const Answer answer = providers.get(path(host::installed, keys));
    EXPECT_EQ(answer.status, CMPI_RC_OK);
    EXPECT_THAT(answer.objects, IsEmpty());
  }
}

TEST_F(HostKeys, ThatAreNullAreNotSet) {
  CMPIObjectPath* const made = path(host::software);
  cmpi.setKey(made, "InstanceID", {CMPI_string, CMPI_nullValue, {}});
  EXPECT_THAT(providers.enumerateNames(made).objects, SizeIs(softwareCount));
  EXPECT_THAT(providers.names(made, host::network).objects, SizeIs(2)) << "as of a path without keys";
}

// ---- Upcalls.

TEST_F(HostKeys, OfAnUpcallThatArriveSelectOnePort) {
  EXPECT_THAT(providers.names(softwareOf("27@f5"), host::network).paths(),
              ElementsAre("KELVO_NetworkPort(0000:31:00.0)"));
}

// The port end then sees every port, and walks all but the last.
TEST_F(HostKeys, OfAnUpcallThatGotLostSelectEveryPortButTheLast) {
  providers.serveUpcalls(cmpi, host::Host::UpcallKeys::Dropped);
  for (const char* firmware : {"26@f3", "27@f5"}) {
    for (const Answer& answer : {providers.names(softwareOf(firmware), host::network),
                                 providers.associators(softwareOf(firmware), host::network)}) {
      EXPECT_EQ(answer.status, CMPI_RC_OK);
      EXPECT_EQ(answer.done, 1);
      EXPECT_THAT(answer.paths(),
                  ElementsAre("KELVO_NetworkPort(0000:17:00.0)", "KELVO_NetworkPort(0000:17:00.1)"));
    }
  }
  const Answer all = providers.enumerateNames(path(host::network));
  EXPECT_EQ(all.status, CMPI_RC_OK);
  EXPECT_THAT(all.paths(), Contains("KELVO_NetworkSoftwareIdentity(KELVO_SoftwareIdentity(26@f3),"
                                    "KELVO_NetworkPort(0000:17:00.1))"))
      << "each firmware with each of these ports";
}

TEST_F(HostKeys, OfAnUpcallThatGotLostSelectEveryComputer) {
  providers.serveUpcalls(cmpi, host::Host::UpcallKeys::Dropped);
  EXPECT_THAT(providers.names(softwareOf("192@f1"), host::bios).paths(),
              ElementsAre("KELVO_ComputerSystem(alpha)", "KELVO_ComputerSystem(beta)"));
  const Answer fetched = providers.enumerateNames(path(host::installed));
  EXPECT_THAT(fetched.objects, SizeIs(softwareCount)) << "each computer's software with its own computer";
}

// ---- Classes.

TEST_F(HostKeys, NeedNoSuperclass) {
  for (const char* className : classes) {
    for (const Answer& answer :
         {providers.enumerateNames(path(className)), providers.enumerate(path(className))}) {
      EXPECT_THAT(answer.paths(),
                  AllOf(testing::Not(IsEmpty()), Each(StartsWith(std::string(className) + "("))))
          << "objects of this class alone: each class below a superclass is asked by its own name";
    }
  }
}

// Result class and roles are the object manager's to heed: the provider answers the same whatever they say.
TEST_F(HostKeys, AreAllThatNarrowsAnAssociation) {
  for (const char* association : associationClasses) {
    const std::vector<std::string> all = providers.associators(softwareOf("26@f3"), association).paths();
    for (const host::Narrowing& narrowing :
         {host::Narrowing{host::software, nullptr, nullptr},
          host::Narrowing{"CIM_Chassis", "None", "Neither"}, host::Narrowing{"", "", ""}}) {
      EXPECT_EQ(providers.associators(softwareOf("26@f3"), association, narrowing).paths(), all)
          << association;
    }
  }
}

}  // namespace
