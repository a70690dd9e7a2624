// What the four association adapters say of themselves, on both channels: one suite for all.
#include <CMPIBIOSSoftwareIdentity.h>
#include <CMPIBMCSoftwareIdentity.h>
#include <CMPIInstalledSoftwareIdentity.h>
#include <CMPINetworkSoftwareIdentity.h>
#include <gmock/gmock.h>

#include <sstream>

#include "AssociationWorld.h"

namespace {

using namespace associations;  // NOLINT(google-build-using-namespace): the tests' own vocabulary
using namespace Oru::SoftwareInventoryProfileProvider;  // NOLINT(google-build-using-namespace): four of it
using testing::StartsWith;

struct Installed {
  using Adapter = CMPIInstalledSoftwareIdentity;
  static constexpr const char* name = "CMPIInstalledSoftwareIdentity";
  static constexpr const char* className = "KELVO_InstalledSoftwareIdentity";
  static constexpr const char* id = "3";
  static constexpr const char* locateElement = "locateComputer";
  static CMPIObjectPath* element(Adapter& adapter, CMPIObjectPath* given) {
    return adapter.locateComputer(given);
  }
};
struct BMC {
  using Adapter = CMPIBMCSoftwareIdentity;
  static constexpr const char* name = "CMPIBMCSoftwareIdentity";
  static constexpr const char* className = "KELVO_BMCSoftwareIdentity";
  static constexpr const char* id = "117";
  static constexpr const char* locateElement = "locateComputer";
  static CMPIObjectPath* element(Adapter& adapter, CMPIObjectPath* given) {
    return adapter.locateComputer(given);
  }
};
struct BIOS {
  using Adapter = CMPIBIOSSoftwareIdentity;
  static constexpr const char* name = "CMPIBIOSSoftwareIdentity";
  static constexpr const char* className = "KELVO_BIOSSoftwareIdentity";
  static constexpr const char* id = "118";
  static constexpr const char* locateElement = "locateComputer";
  static CMPIObjectPath* element(Adapter& adapter, CMPIObjectPath* given) {
    return adapter.locateComputer(given);
  }
};
struct Network {
  using Adapter = CMPINetworkSoftwareIdentity;
  static constexpr const char* name = "CMPINetworkSoftwareIdentity";
  static constexpr const char* className = "KELVO_NetworkSoftwareIdentity";
  static constexpr const char* id = "35";
  static constexpr const char* locateElement = "locateNetwork";
  static CMPIObjectPath* element(Adapter& adapter, CMPIObjectPath* given) {
    return adapter.locateNetwork(given);
  }
};

template <typename Kind>
class AssociationTrace : public MachineTest {
 protected:
  using Adapter = typename Kind::Adapter;

  /// What the adapter's own file said at the routine level.
  std::vector<std::string> ownTexts() const {
    const std::string place = std::string(" in ") + Kind::name + ".cpp";
    std::vector<std::string> texts = logTexts(world, 4000);
    std::erase_if(texts, [&](const std::string& text) { return text.find(place) == std::string::npos; });
    return texts;
  }
  static std::string event(const std::string& kind, const std::string& function,
                           const std::string& list = "") {
    return kind + ": " + function + "() in " + Kind::name + ".cpp [Line: N]" +
           (list.empty() ? "" : ",Parameters List: " + list);
  }
  template <typename Pointer>
  static std::string parameter(const char* name, Pointer pointer) {
    std::ostringstream list;
    list << name << static_cast<const void*>(pointer);
    return list.str();
  }
  /// An operation's entry, with its parameters where it has any, and its exit around all it says.
  template <typename Action>
  void expectEntryAndExit(const std::string& function, const std::string& list, Action action) {
    world.log.clear();
    action();
    const std::vector<std::string> texts = ownTexts();
    ASSERT_GE(texts.size(), 2U) << function;
    EXPECT_EQ(texts.front(), event("ENTERING", function, list));
    EXPECT_THAT(texts.back(), StartsWith(event("EXITING", function)));
    for (const standin::LogLine& line : world.log) {
      EXPECT_TRUE(line.file != std::string(Kind::name) + ".cpp" || line.level == 4000) << line.text;
      EXPECT_EQ(line.category, "Corvane.SoftwareInventoryProvider");
    }
    EXPECT_EQ(logTexts(world, 4000), logTexts(world, 4000, true));
  }

  CMPIContext context{};
};

struct KindNames {
  template <typename Kind>
  static std::string GetName(int) {  // NOLINT(readability-identifier-naming): GoogleTest asks for it
    return Kind::name;
  }
};
using Kinds = testing::Types<Installed, BMC, BIOS, Network>;
TYPED_TEST_SUITE(AssociationTrace, Kinds, KindNames);

TYPED_TEST(AssociationTrace, TheConstructorSaysItsParametersAndTheRequestedClassId) {
  CMPIObjectPath* const given = path(TypeParam::className);
  this->world.log.clear();
  const typename TypeParam::Adapter adapter(&this->broker, &this->context, given);
  const std::vector<std::string> texts = this->ownTexts();
  EXPECT_EQ(texts.front(), this->event("ENTERING", TypeParam::name,
                                       this->parameter(" _broker=", &this->broker) +
                                           this->parameter(" _context=", &this->context) +
                                           this->parameter(" objectPath=", given)));
  EXPECT_EQ(texts[1], std::string("VARIABLE: 'requestedClassId' has Value '") + TypeParam::id +
                          "' at line N in " + TypeParam::name + ".cpp");
  EXPECT_EQ(texts.back(), this->event("EXITING", TypeParam::name));
  EXPECT_EQ(logTexts(this->world, 4000), logTexts(this->world, 4000, true));
}

TYPED_TEST(AssociationTrace, TheDestructorSpeaksBeforeItsParts) {
  {
    const typename TypeParam::Adapter adapter(&this->broker, &this->context, path("Other"));
    this->world.log.clear();
  }
  ASSERT_FALSE(this->world.log.empty());
  EXPECT_EQ(this->world.log.front().file, std::string(TypeParam::name) + ".cpp");
  EXPECT_EQ(this->world.log.front().function, std::string("~") + TypeParam::name);
  // Then the resolver, the software end and the other end, in that order.
  std::vector<std::string> files;
  for (const standin::LogLine& line : this->world.log) {
    if (files.empty() || files.back() != line.file) {
      files.push_back(line.file);
    }
  }
  ASSERT_EQ(files.size(), 5U);
  EXPECT_THAT(files[1], StartsWith("Linux/"));
  EXPECT_EQ(files[2], "CMPISoftwareIdentity.cpp");
  EXPECT_EQ(files[3], "Linux/SoftwareIdentity.cpp") << "which the software end holds";
  EXPECT_THAT(files[4], testing::AnyOf("CMPIComputerSystem.cpp", "CMPINetworkPort.cpp"));
}

TYPED_TEST(AssociationTrace, EveryOperationSaysItsEntryAndExit) {
  typename TypeParam::Adapter adapter(&this->broker, &this->context, path(TypeParam::className));
  const char* properties[] = {"Name", nullptr};
  const std::string list = this->parameter(" properties=", properties);
  this->expectEntryAndExit("operator bool", "", [&] { static_cast<void>(static_cast<bool>(adapter)); });
  this->expectEntryAndExit("getObjectPath", "", [&] { adapter.getObjectPath(); });
  this->expectEntryAndExit("getCMPIInstance", list, [&] { adapter.getCMPIInstance(properties); });
  this->expectEntryAndExit("getAssociatorNames", "", [&] { adapter.getAssociatorNames(); });
  this->expectEntryAndExit("getAssociator", list, [&] { adapter.getAssociator(properties); });
  this->expectEntryAndExit("operator++", "", [&] { ++adapter; });
  CMPIObjectPath* const given = path("Other");
  const std::string where = this->parameter(" objectPath=", given);
  this->expectEntryAndExit("locateIdentity", where, [&] { adapter.locateIdentity(given); });
  this->expectEntryAndExit(TypeParam::locateElement, where, [&] { TypeParam::element(adapter, given); });
}

using InstalledAssociationTrace = AssociationTrace<Installed>;

TEST_F(InstalledAssociationTrace, SetObjectPathSaysItsPath) {
  CMPIInstalledSoftwareIdentity adapter(&broker, &context, path("Other"));
  CMPIObjectPath* const given = path("KELVO_InstalledSoftwareIdentity");
  expectEntryAndExit("setObjectPath", parameter(" objectPath=", given),
                     [&] { adapter.setObjectPath(given); });
}

}  // namespace
