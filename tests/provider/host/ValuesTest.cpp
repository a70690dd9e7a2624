// Values as object managers take them: types checked or not, keys taken from paths or not, datetimes refused,
// nulls.
#include <gmock/gmock.h>

#include <algorithm>

#include "HostTest.h"

namespace {

using host::Answer;
using host::Object;
using testing::Contains;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::Key;
using testing::Not;
using testing::Pair;

class HostValues : public HostTest {
 protected:
  Object theOne(const char* instanceId) {
    const Answer answer = providers.get(softwareOf(instanceId));
    EXPECT_EQ(answer.objects.size(), 1U) << instanceId;
    return answer.objects.empty() ? Object{} : answer.objects.front();
  }
};

// Each property that is set, against its declaration.
TEST_F(HostValues, HaveTheTypesThatTheSchemaDeclares) {
  const std::vector<std::string> unchecked = everything();
  cmpi.typeOf = declaredType;
  EXPECT_EQ(everything(), unchecked);
  EXPECT_THAT(cmpi.refused, IsEmpty());
  EXPECT_THAT(cmpi.unknown, IsEmpty());
}

TEST_F(HostValues, OfAllTypesAreAmongThem) {
  const Object identity = theOne("192@f1");
  for (const char* name : {"Description", "InstallDate", "MajorVersion", "Classifications",
                           "ClassificationDescriptions", "BuildID", "InstanceID"}) {
    EXPECT_THAT(identity.properties, Contains(Key(name)));
  }
  const std::vector<Object> ports = providers.enumerate(path(host::ports)).objects;
  ASSERT_EQ(ports.size(), 3U);
  for (const char* name : {"Speed", "LinkTechnology", "PermanentAddress", "EnabledState", "ElementName"}) {
    EXPECT_THAT(ports[0].properties, Contains(Key(name)));
  }
  EXPECT_THAT(ports[1].properties, Contains(Pair("OtherLinkTechnology", "WWAN")));
}

TEST_F(HostValues, OfAnotherTypeStayUnsetAndAreSeen) {
  cmpi.typeOf = [](const std::string& className, const std::string& property) {
    return property == "MajorVersion" ? std::optional<CMPIType>(CMPI_string)
                                      : declaredType(className, property);
  };
  const Object identity = theOne("192@f1");
  EXPECT_THAT(identity.properties, Not(Contains(Key("MajorVersion"))));
  EXPECT_THAT(identity.properties, Contains(Pair("MinorVersion", "14")));
  EXPECT_THAT(cmpi.refused, testing::ElementsAre("KELVO_SoftwareIdentity.MajorVersion"));
}

TEST_F(HostValues, OfPropertiesThatAreUnknownAnswerOkAndAreLeftOut) {
  cmpi.typeOf = [](const std::string& className, const std::string& property) {
    return property == "BuildID" || property == "ElementName" ? std::nullopt
                                                              : declaredType(className, property);
  };
  EXPECT_THAT(theOne("192@f1").properties, Not(Contains(Key("BuildID"))));
  const Answer answer = providers.enumerate(path(host::ports));
  EXPECT_EQ(answer.status, CMPI_RC_OK);
  EXPECT_EQ(answer.objects.size(), 3U);
}

// A new instance may or may not take its keys from its path.
TEST_F(HostValues, OfKeysAreInThePathAndInTheInstance) {
  for (const bool taken : {false, true}) {
    cmpi.instancesTakeKeys = taken;
    for (const char* className : classes) {
      const Answer answer = providers.enumerate(path(className));
      EXPECT_THAT(answer.objects, Not(IsEmpty())) << className;
      for (const Object& object : answer.objects) {
        EXPECT_THAT(object.keys, Not(IsEmpty()));
        for (const auto& key : object.keys) {
          EXPECT_THAT(object.properties, Contains(key)) << className;
        }
      }
    }
  }
}

TEST_F(HostValues, ThatAreRefusedDatetimesAreLeftOut) {
  const Object before = theOne("192@f1");
  EXPECT_THAT(before.properties, Contains(Pair("ReleaseDate", "20240322000000.000000+000")));
  for (const auto fault :
       {tests::FakeCmpi::Fault::Null, tests::FakeCmpi::Fault::Status, tests::FakeCmpi::Fault::Both}) {
    cmpi.faults["newDateTimeFromChars"] = fault;
    std::map<std::string, std::string> without = before.properties;
    without.erase("ReleaseDate");
    without.erase("InstallDate");
    EXPECT_EQ(theOne("192@f1").properties, without);
  }
}

TEST_F(HostValues, AreNeverNull) {
  for (const std::string& text : everything()) {
    EXPECT_THAT(text, Not(HasSubstr("(null)")));
  }
}

// Object managers hand them on as they are.
TEST_F(HostValues, AreCleanTexts) {
  const std::map<std::string, std::string> odd = theOne("193@d2").properties;
  EXPECT_THAT(odd, Contains(Pair("Description", "driver of  beta\xEF\xBF\xBD")));
  EXPECT_THAT(odd, Contains(Pair("Manufacturer", "Vel mor  \xC3\xA9")));
  for (const char* className : classes) {
    for (const Object& object : providers.enumerate(path(className)).objects) {
      for (const auto& [name, value] : object.properties) {
        EXPECT_TRUE(host::isClean(value)) << className << '.' << name;
      }
    }
  }
}

// What is not set comes as a null with the type of its property: here the name of another provider's
// instance.
TEST_F(HostValues, OfUpcallsMayBeNullsOfTheirType) {
  cmpi.typeOf = declaredType;
  cmpi.source = [this](const CMPIObjectPath* asked, std::vector<CMPIInstance*>& found) {
    found.push_back(cmpi.instance("root/cimv2", tests::FakeCmpi::classOf(asked).c_str()));
    return CMPI_RC_OK;
  };
  CMPIObjectPath* const association = path(host::installed);
  CMPIData end{CMPI_ref, CMPI_goodValue, {}};
  end.value.ref = computer(host::computers, "alpha");
  cmpi.setKey(association, "System", end);
  end.value.ref = softwareOf("192@f1");
  cmpi.setKey(association, "InstalledSoftware", end);
  const Answer answer = providers.get(association);
  EXPECT_EQ(answer.status, CMPI_RC_OK);
  EXPECT_THAT(answer.objects, IsEmpty()) << "the computer without a name is not the one";
}

}  // namespace
