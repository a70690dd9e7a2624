// Enumerations over machines/several.json: a tree with everything that a tree can have.
#include <gmock/gmock.h>

#include "Requests.h"

namespace {

using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;
using Endpoints = Requests;

std::string systemPath(const std::string& className, const std::string& name) {
  return "root/cimv2:" + className + ".CreationClassName=" + className + ",Name=" + name;
}

std::string portPath(const std::string& computer, const std::string& device) {
  return "root/cimv2:KELVO_NetworkPort.SystemCreationClassName=KELVO_ComputerSystem,SystemName=" + computer +
         ",CreationClassName=KELVO_NetworkPort,DeviceID=" + device;
}

TEST_F(Endpoints, ComputersAreTheNamedOnesOfTheTreeInItsOrder) {
  const Answer answer = enumerateNames(computers);
  EXPECT_EQ(answer.status, CMPI_RC_OK);
  EXPECT_EQ(answer.done, 1);
  EXPECT_THAT(answer.paths, ElementsAre(systemPath(computers, "atlas"), systemPath(computers, "boreas"),
                                        systemPath(computers, "blade")))
      << "of two with a name, the first; a nameless one cannot be told";
}

TEST_F(Endpoints, ControllersAreWhereTheirFirmwareIsAndBearTheNameOfTheComputerAbove) {
  const Answer answer = enumerateNames(controllers);
  EXPECT_EQ(answer.status, CMPI_RC_OK);
  EXPECT_EQ(answer.done, 1);
  EXPECT_THAT(answer.paths, ElementsAre(systemPath(controllers, "atlas"), systemPath(controllers, "blade")))
      << "two images of firmware make one controller; the description is compared with case";
}

TEST_F(Endpoints, PortsAreTheNamedOnesOfNamedComputersInTheOrderOfTheWalk) {
  const Answer answer = enumerateNames(ports);
  EXPECT_EQ(answer.status, CMPI_RC_OK);
  EXPECT_EQ(answer.done, 1);
  EXPECT_THAT(answer.paths,
              ElementsAre(portPath("atlas", "0000:02:00.0/1"), portPath("atlas", "0000:02:00.0/2"),
                          portPath("atlas", "usb:1-4:1.0/1"), portPath("atlas", "0000:3b:00.0/1"),
                          portPath("boreas", "0000:02:00.0/1")));
}

TEST_F(Endpoints, WhatIsLeftOutIsLogged) {
  testing::internal::CaptureStderr();
  enumerateNames(ports);
  const std::string log = testing::internal::GetCapturedStderr();
  EXPECT_THAT(log, HasSubstr("3 of the nodes of KELVO_NetworkPort have no name"));
  EXPECT_THAT(log, HasSubstr("1 of the nodes of KELVO_NetworkPort have the keys of one before"));
}

TEST_F(Endpoints, InstancesComeInTheSameOrderWithTheirKeys) {
  const Answer answer = enumerate(ports);
  EXPECT_EQ(answer.status, CMPI_RC_OK);
  EXPECT_EQ(answer.done, 1);
  ASSERT_EQ(answer.instances.size(), 5U);
  EXPECT_EQ(answer.property(0, "SystemCreationClassName"), "KELVO_ComputerSystem");
  EXPECT_EQ(answer.property(0, "SystemName"), "atlas");
  EXPECT_EQ(answer.property(0, "CreationClassName"), "KELVO_NetworkPort");
  EXPECT_EQ(answer.property(0, "DeviceID"), "0000:02:00.0/1");
  EXPECT_EQ(answer.property(1, "DeviceID"), "0000:02:00.0/2");
  EXPECT_EQ(answer.property(4, "SystemName"), "boreas");
}

TEST_F(Endpoints, PortsHaveWhatTheTreeTellsOfThem) {
  const Answer answer = enumerate(ports);
  ASSERT_EQ(answer.instances.size(), 5U);
  EXPECT_EQ(answer.property(0, "ElementName"), "eno1");
  EXPECT_EQ(answer.property(0, "PermanentAddress"), "02005e100001");
  EXPECT_EQ(answer.property(0, "LinkTechnology"), "2") << "Ethernet";
  EXPECT_EQ(answer.property(0, "OtherLinkTechnology"), "(unset)");
  EXPECT_EQ(answer.property(0, "Speed"), "25000000000 (uint64)") << "in bits per second";
  EXPECT_EQ(answer.property(0, "EnabledState"), "2") << "Enabled";
  EXPECT_EQ(answer.property(2, "LinkTechnology"), "1") << "Other";
  EXPECT_EQ(answer.property(2, "OtherLinkTechnology"), "WWAN");
  EXPECT_EQ(answer.property(2, "EnabledState"), "6") << "Enabled but Offline";
  EXPECT_EQ(answer.property(3, "LinkTechnology"), "3") << "IB";
  EXPECT_EQ(answer.property(3, "Speed"), "400000000000 (uint64)");
  EXPECT_EQ(answer.property(3, "EnabledState"), "3") << "Disabled";
  EXPECT_EQ(answer.property(4, "LinkTechnology"), "11") << "Wireless LAN";
  EXPECT_EQ(answer.property(4, "EnabledState"), "7") << "In Test";
}

TEST_F(Endpoints, WhatTheTreeDoesNotTellIsAbsent) {
  EXPECT_THAT(enumerate(ports).propertyNames(1),
              ElementsAre("SystemCreationClassName", "SystemName", "CreationClassName", "DeviceID"));
  EXPECT_THAT(enumerate(controllers).propertyNames(1), ElementsAre("CreationClassName", "Name", "Dedicated"))
      << "the state of firmware that is not in use is none of its controller's";
}

TEST_F(Endpoints, ComputersAndControllersSayWhatTheyAreFor) {
  const Answer computer = enumerate(computers);
  ASSERT_EQ(computer.instances.size(), 3U);
  EXPECT_EQ(computer.property(0, "CreationClassName"), "KELVO_ComputerSystem");
  EXPECT_EQ(computer.property(0, "Name"), "atlas");
  EXPECT_EQ(computer.property(0, "ElementName"), "atlas");
  EXPECT_EQ(computer.property(0, "Dedicated"), "{0}") << "Not Dedicated";
  EXPECT_EQ(computer.property(0, "EnabledState"), "2") << "that of the first of the name";
  EXPECT_EQ(computer.property(1, "EnabledState"), "(unset)");
  EXPECT_EQ(computer.property(2, "EnabledState"), "(unset)") << "no state that CIM has a number for";

  const Answer controller = enumerate(controllers);
  ASSERT_EQ(controller.instances.size(), 2U);
  EXPECT_EQ(controller.property(0, "CreationClassName"), "KELVO_SPComputerSystem");
  EXPECT_EQ(controller.property(0, "Name"), "atlas");
  EXPECT_EQ(controller.property(0, "ElementName"), "Service Processor") << "the name of its first firmware";
  EXPECT_EQ(controller.property(0, "Dedicated"), "{28}") << "Management Controller";
  EXPECT_EQ(controller.property(0, "EnabledState"), "2");
}

TEST_F(Endpoints, PropertyListLeavesOutTheOthersButNoKey) {
  const char* list[] = {"speed", "ElementName", "NoSuchProperty", nullptr};
  EXPECT_THAT(enumerate(path(ports), list).propertyNames(0),
              ElementsAre("SystemCreationClassName", "SystemName", "CreationClassName", "DeviceID",
                          "ElementName", "Speed"));
  const char* nothing[] = {nullptr};
  EXPECT_THAT(enumerate(path(computers), nothing).propertyNames(0), ElementsAre("CreationClassName", "Name"));
}

TEST_F(Endpoints, DeviceIdAloneNarrowsToThePortsThatHaveIt) {
  EXPECT_THAT(enumerateNames(ports, {{"DeviceID", "usb:1-4:1.0/1"}}).paths,
              ElementsAre(portPath("atlas", "usb:1-4:1.0/1")));
  EXPECT_THAT(enumerateNames(ports, {{"DeviceID", "0000:02:00.0/1"}}).paths,
              ElementsAre(portPath("atlas", "0000:02:00.0/1"), portPath("boreas", "0000:02:00.0/1")));
  EXPECT_EQ(enumerate(ports, {{"DeviceID", "0000:3b:00.0/1"}}).property(0, "ElementName"), "ib0");
}

TEST_F(Endpoints, EachKeyNarrows) {
  EXPECT_THAT(enumerateNames(ports, {{"SystemName", "boreas"}}).paths,
              ElementsAre(portPath("boreas", "0000:02:00.0/1")));
  EXPECT_EQ(enumerateNames(ports, {{"CreationClassName", "KELVO_NetworkPort"}}).paths.size(), 5U);
  EXPECT_EQ(enumerateNames(ports, {{"SystemCreationClassName", "KELVO_ComputerSystem"}}).paths.size(), 5U);
  EXPECT_THAT(enumerateNames(ports, {{"SystemCreationClassName", "KELVO_SPComputerSystem"}}).paths,
              IsEmpty());
  EXPECT_THAT(enumerateNames(computers, {{"Name", "boreas"}}).paths,
              ElementsAre(systemPath(computers, "boreas")));
  EXPECT_THAT(enumerateNames(controllers, {{"Name", "blade"}}).paths,
              ElementsAre(systemPath(controllers, "blade")));
  EXPECT_THAT(enumerateNames(controllers, {{"Name", "boreas"}}).paths, IsEmpty()) << "it has no controller";
  EXPECT_THAT(
      enumerateNames(computers, {{"Name", "atlas"}, {"CreationClassName", "KELVO_SPComputerSystem"}}).paths,
      IsEmpty());
}

TEST_F(Endpoints, NarrowingToNothingIsAnEmptyAnswer) {
  const Answer answer = enumerate(computers, {{"Name", "nobody"}});
  EXPECT_EQ(answer.status, CMPI_RC_OK);
  EXPECT_EQ(answer.done, 1);
  EXPECT_THAT(answer.instances, IsEmpty());
}

TEST_F(Endpoints, ValuesAreComparedExactlyAndKeyNamesAsCimDoes) {
  EXPECT_THAT(enumerateNames(computers, {{"Name", "Atlas"}}).paths, IsEmpty());
  EXPECT_THAT(enumerateNames(computers, {{"Name", "atlas "}}).paths, IsEmpty());
  EXPECT_THAT(enumerateNames(computers, {{"Name", ""}}).paths, IsEmpty());
  EXPECT_THAT(enumerateNames(computers, {{"CreationClassName", "kelvo_computersystem"}}).paths, IsEmpty());
  EXPECT_THAT(enumerateNames(computers, {{"NAME", "atlas"}}).paths,
              ElementsAre(systemPath(computers, "atlas")));
  EXPECT_THAT(enumerateNames(computers, {{"Name", "boreas"}, {"name", "atlas"}}).paths,
              ElementsAre(systemPath(computers, "boreas")))
      << "of two keys of a name the first stands";
}

TEST_F(Endpoints, KeysOfOtherClassesNarrowNothing) {
  EXPECT_EQ(enumerateNames(computers, {{"InstanceID", "193@f1"}, {"DeviceID", "x"}}).paths.size(), 3U);
  EXPECT_EQ(enumerateNames(ports, {{"Name", "atlas"}}).paths.size(), 5U);
}

TEST_F(Endpoints, ValueThatIsNoTextIsThatOfNothing) {
  CMPIObjectPath* wanted = path(computers);
  CMPIData number{CMPI_uint32, CMPI_goodValue, {}};
  number.value.uint32 = 7;
  cmpi.setKey(wanted, "Name", number);
  EXPECT_THAT(enumerateNames(wanted).paths, IsEmpty());
}

TEST_F(Endpoints, KeyWithoutAValueNarrowsNothing) {
  CMPIObjectPath* wanted = path(computers);
  cmpi.setKey(wanted, "Name", {CMPI_string, CMPI_nullValue, {}});
  EXPECT_EQ(enumerateNames(wanted).paths.size(), 3U);
}

TEST_F(Endpoints, NamespaceIsThatOfTheRequest) {
  const CMPIObjectPath* elsewhere = cmpi.path("root/interop", computers);
  EXPECT_EQ(enumerateNames(elsewhere).paths.at(0),
            "root/interop:KELVO_ComputerSystem.CreationClassName=KELVO_ComputerSystem,Name=atlas");
}

TEST_F(Endpoints, EveryNameNamesItsInstance) {
  for (const char* className : {computers, controllers, ports}) {
    for (const CMPIInstance* each : enumerate(className).instances) {
      CMPIObjectPath* name = path(className);
      for (const char* key :
           {"SystemCreationClassName", "SystemName", "CreationClassName", "DeviceID", "Name"}) {
        if (const auto value = tests::FakeCmpi::property(each, key)) {
          cmpi.setKey(name, key, *value);
        }
      }
      const Answer got = get(name);
      EXPECT_EQ(got.status, CMPI_RC_OK) << got.message;
      EXPECT_EQ(got.done, 1);
      ASSERT_EQ(got.instances.size(), 1U);
      for (const std::string& property : got.propertyNames(0)) {
        EXPECT_TRUE(tests::FakeCmpi::property(each, property)) << property;
      }
    }
  }
}

}  // namespace
