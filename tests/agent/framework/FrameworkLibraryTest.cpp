// liboru.so as a file: it exports the contract's names and one for its process, and stays mapped once loaded.
#include "tests/support/ElfFile.h"

#include <cxxabi.h>
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <cstdlib>
#include <memory>
#include <set>
#include <string>

namespace {

using ::testing::ContainerEq;

/// A symbol as a person reads it, without its parameters, ABI tags and return type.
std::string plainName(const std::string& symbol) {
  int status = 0;
  const std::unique_ptr<char, decltype(&std::free)> demangled(
      abi::__cxa_demangle(symbol.c_str(), nullptr, nullptr, &status), &std::free);
  std::string name = status == 0 ? demangled.get() : symbol;
  name.resize(std::min(name.size(), name.find('(')));
  if (const std::size_t tag = name.find("[abi:"); tag != std::string::npos) {
    name.erase(tag, name.find(']', tag) - tag + 1);
  }
  return name;
}

std::set<std::string> contract() {
  std::set<std::string> names{"Oru::operator<<", "ZelLog::str", "oruLookAnew"};
  const auto addMembers = [&names](const std::string& type, const std::vector<std::string>& members) {
    for (const std::string& member : members) {
      names.insert(type + "::" + member);
    }
  };
  addMembers("Oru::Instrumentation",
             {"Instrumentation", "~Instrumentation", "selectNode", "setFilter", "operator bool", "operator++",
              "getPathToNode", "getPathToParentNode", "getPathToComputer", "convertPathToString",
              "convertStringToPath", "getNodeDescription", "getSensorType", "getProperty", "setProperty"});
  addMembers("Oru::Moniker", {"Moniker", "~Moniker", "operator=", "addKey", "getKeyCount", "selectKey",
                              "getName", "getValue"});
  addMembers("Oru::ProviderUtilities",
             {"getClassId", "areClassesRelated", "getNamespace", "getKeyCount", "getKeyProperty",
              "setKeyProperty", "createObjectPath", "createInstance", "getProperty", "setProperty",
              "transformObjectPathToMoniker", "transformMonikerToObjectPath"});
  addMembers("ZelLog::ZelLogger", {"logLevelMessage", "traceLevelMessage", "isLevelOn"});
  addMembers("ZelLog::ZelMessageBuffer",
             {"ZelMessageBuffer", "~ZelMessageBuffer", "operator<<", "operator std::ostream&"});
  for (const std::string exception :
       {"InstrumentationException", "FrameworkException", "ProviderException"}) {
    addMembers("Oru::" + exception, {exception, "~" + exception, "operator=", "what"});
    for (const std::string kind : {"typeinfo for ", "typeinfo name for ", "vtable for "}) {
      names.insert(kind + "Oru::" + exception);
    }
  }
  return names;
}

TEST(FrameworkLibrary, ExportsTheNamesOfTheContractAndOneForItsProcess) {
  std::set<std::string> names;
  for (const std::string& symbol : tests::ElfFile(FRAMEWORK_LIBRARY).exportedSymbols()) {
    std::string name = plainName(symbol);
    constexpr std::string_view stream = "std::basic_ostream<char, std::char_traits<char> >&";
    if (const std::size_t place = name.find(stream); place != std::string::npos) {
      name.replace(place, stream.size(), "std::ostream&");
    }
    names.insert(name);
  }
  EXPECT_THAT(names, ContainerEq(contract()));
}

TEST(FrameworkLibrary, StaysMappedOnceLoaded) {
  EXPECT_NE(tests::ElfFile(FRAMEWORK_LIBRARY).flags() & DF_1_NODELETE, 0U);
}

}  // namespace
