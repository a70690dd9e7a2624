#include "Declared.h"

#include <unistd.h>

#include <array>
#include <atomic>
#include <thread>

namespace {

using cimom::RegistrationError;
using declared_test::Declared;
using declared_test::declaredConfiguration;
using declared_test::Lines;
using declared_test::plain;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::SizeIs;

class Interop : public Declared {
 protected:
  /// The texts of a property, one for each instance.
  static std::vector<std::string> values(cimom::ObjectManager& manager, std::string_view nameSpace,
                                         std::string_view className, std::string_view property) {
    std::vector<std::string> result;
    const cimom::Outcome outcome =
        manager.enumerateInstances(nameSpace, className, std::nullopt, [&](const cimom::Instance& instance) {
          const cimom::NamedValue* found = instance.find(property);
          result.emplace_back(found == nullptr ? "unset" : cimom::text(found->data).value_or("no text"));
          return true;
        });
    EXPECT_EQ(outcome.status.code, CMPI_RC_OK) << outcome.status.description;
    return result;
  }

  static std::string hostName() {
    std::array<char, 256> name{};
    EXPECT_EQ(::gethostname(name.data(), name.size() - 1), 0);
    return name.data();
  }
};

TEST_F(Interop, hasANamespaceForEachThatThereIs) {
  const std::vector<std::string> all = {"root/test", "root/about", "root/interop"};
  EXPECT_EQ(manager_.nameSpaces(), all);
  EXPECT_EQ(values(manager_, "root/interop", "CIM_Namespace", "Name"), all);
  EXPECT_THAT(values(manager_, "root/interop", "CIM_Namespace", "ObjectManagerName"),
              testing::Each("cimom:" + hostName()));
}

TEST_F(Interop, knowsNamespacesByTheirNames) {
  for (const char* name : {"root/test", "/ROOT/Test", "root/about", "root/interop", "interop", "/INTEROP"})
    EXPECT_TRUE(manager_.knowsNameSpace(name)) << name;
  for (const char* name : {"", "/", "root", "test", "root/interop/x", "about"})
    EXPECT_FALSE(manager_.knowsNameSpace(name)) << name;
}

TEST_F(Interop, isFoundUnderBothNames) {
  const std::vector<std::string> all = names("root/interop", "CIM_Namespace").objects;
  EXPECT_THAT(all, SizeIs(3));
  EXPECT_EQ(names("interop", "CIM_Namespace").objects, all);
  EXPECT_EQ(instances("/Interop", "CIM_Namespace").objects, all);
  std::string path = all.front();
  ASSERT_TRUE(path.starts_with("root/interop:CIM_Namespace."));
  EXPECT_THAT(get(path.substr(std::string("root/").size())).objects, ElementsAre(path));
}

TEST_F(Interop, tellsOfTheObjectManager) {
  const auto value = [this](std::string_view property) {
    const auto all = values(manager_, "interop", "CIM_ObjectManager", property);
    return all.size() == 1 ? all.front() : "not one";
  };
  EXPECT_EQ(value("SystemCreationClassName"), "CIM_ComputerSystem");
  EXPECT_EQ(value("SystemName"), hostName());
  EXPECT_EQ(value("CreationClassName"), "CIM_ObjectManager");
  EXPECT_EQ(value("Name"), "cimom:" + hostName());
  EXPECT_EQ(value("ElementName"), "cimom");
  EXPECT_EQ(value("Description"), "A CIM object manager.");
}

TEST_F(Interop, tellsWhatItIsConfiguredToTell) {
  Lines log;
  cimom::Configuration configuration = declaredConfiguration(log);
  configuration.interop = cimom::InteropSettings{.nameSpace = "root/other",
                                                 .otherName = "",
                                                 .systemName = "sys",
                                                 .systemClass = "TEST_System",
                                                 .name = "X:1",
                                                 .elementName = "it",
                                                 .description = "That.",
                                                 .version = "2.3"};
  cimom::ObjectManager manager(configuration);
  const auto value = [&](std::string_view property) {
    return values(manager, "root/other", "CIM_ObjectManager", property).at(0);
  };
  EXPECT_EQ(value("SystemCreationClassName"), "TEST_System");
  EXPECT_EQ(value("SystemName"), "sys");
  EXPECT_EQ(value("Name"), "X:1");
  EXPECT_EQ(value("ElementName"), "it");
  EXPECT_EQ(value("Description"), "That. Version 2.3.");
  EXPECT_EQ(manager.nameSpaces(), (std::vector<std::string>{"root/test", "root/about", "root/other"}));
  EXPECT_FALSE(manager.knowsNameSpace("interop"));
  EXPECT_FALSE(manager.knowsNameSpace(""));
}

// Everything that is there, whatever its class.
TEST_F(Interop, isEnumeratedBySuperclasses) {
  EXPECT_THAT(names("interop", "CIM_ManagedElement").objects, SizeIs(4));
  EXPECT_THAT(names("interop", "CIM_Service").objects, SizeIs(1));
}

TEST_F(Interop, isNotThereUnlessConfigured) {
  Lines log;
  cimom::Configuration configuration = declaredConfiguration(log);
  configuration.interop.reset();
  cimom::ObjectManager manager(configuration);
  EXPECT_EQ(manager.nameSpaces(), std::vector<std::string>{"root/test"});
  const auto sink = [](const cimom::ObjectPath&) { return true; };
  EXPECT_EQ(manager.enumerateInstanceNames("root/interop", "CIM_Namespace", sink).status.code,
            CMPI_RC_ERR_INVALID_NAMESPACE);
  EXPECT_EQ(manager.enumerateInstanceNames("root/about", "TEST_Profile", sink).status.code,
            CMPI_RC_ERR_INVALID_NAMESPACE);
  const cimom::Outcome outcome = manager.associatorNames(plain("object 1"), {}, sink);
  EXPECT_EQ(outcome.status.code, CMPI_RC_OK);
  EXPECT_EQ(outcome.delivered, 0U);
}

TEST_F(Interop, unknownNamespacesAreRefusedByEveryOperation) {
  const std::string path = R"(root/none:TEST_Plain3.Name="x")";
  const auto paths = [](const cimom::ObjectPath&) { return true; };
  const auto objects = [](const cimom::Instance&) { return true; };
  cimom::Arena arena;
  const cimom::ObjectPath& parsed = *cimom::parseWbemUri(arena, manager_.classTable(), path);
  const cimom::Instance& instance = *cimom::Instance::create(arena, parsed);
  for (const cimom::Outcome& outcome :
       {manager_.enumerateInstances("root/none", "TEST_None", std::nullopt, objects),
        manager_.enumerateInstanceNames("root/none", "TEST_Plain3", paths),
        manager_.getInstance(path, std::nullopt, objects),
        manager_.getInstance(parsed, std::nullopt, objects),
        manager_.associators(path, {.associationClass = "TEST_None"}, std::nullopt, objects),
        manager_.associators(parsed, {}, std::nullopt, objects), manager_.associatorNames(path, {}, paths),
        manager_.associatorNames(parsed, {}, paths), manager_.references(path, {}, std::nullopt, objects),
        manager_.references(parsed, {}, std::nullopt, objects), manager_.referenceNames(path, {}, paths),
        manager_.referenceNames(parsed, {}, paths), manager_.createInstance("root/none", instance, paths),
        manager_.modifyInstance(instance, std::nullopt), manager_.deleteInstance(parsed),
        manager_.execQuery("root/none", "mumble", "hm", objects)})
    EXPECT_EQ(outcome.status.code, CMPI_RC_ERR_INVALID_NAMESPACE) << outcome.status.description;
}

TEST_F(Interop, classesHaveProvidersOrDeclaredInstances) {
  Lines log;
  cimom::Configuration configuration = declaredConfiguration(log);
  configuration.providers.front().className = "CIM_Namespace";
  configuration.providers.front().nameSpaces = {"interop"};
  try {
    const cimom::ObjectManager manager(configuration);
    FAIL() << "a class was registered twice over";
  } catch (const RegistrationError& error) {
    EXPECT_STREQ(error.what(),
                 "a provider is registered for class CIM_Namespace in root/interop, where "
                 "instances of it are declared");
  }
}

// A registration may call the namespace by either name.
TEST_F(Interop, isOneNamespace) {
  Lines log;
  cimom::Configuration configuration = declaredConfiguration(log);
  configuration.providers.front().nameSpaces = {"interop", "root/test"};
  cimom::ObjectManager manager(configuration);
  const std::vector<std::string> all = {"root/interop", "root/test", "root/about"};
  EXPECT_EQ(manager.nameSpaces(), all);
  EXPECT_EQ(values(manager, "interop", "CIM_Namespace", "Name"), all);
  EXPECT_THAT(values(manager, "root/interop", "TEST_Plain3", "Name"),
              ElementsAre("object 0", "object 1", "object 2"));
}

TEST_F(Interop, answersSeveralThreads) {
  std::atomic<int> answers{0};
  const auto ask = [&] {
    for (int round = 0; round < 20; ++round) {
      answers += static_cast<int>(instances("root/about", "TEST_Conforms").objects.size());
      answers += static_cast<int>(instances("interop", "CIM_Namespace").objects.size());
    }
  };
  std::thread other(ask);
  ask();
  other.join();
  EXPECT_EQ(answers, 2 * 20 * (4 + 3));
}

TEST_F(Interop, instancesNeedANamespace) {
  Lines log;
  cimom::Configuration configuration = declaredConfiguration(log);
  configuration.schema.emplace_back(NO_NAMESPACE_SCHEMA);
  EXPECT_THAT([&] { const cimom::ObjectManager manager(configuration); },
              testing::ThrowsMessage<cimom::MofError>(
                  HasSubstr("nonamespace.mof:3: no #pragma namespace says where the instance belongs")));
}

}  // namespace
