// The CMPI declarations against the table of the binary interface beside this file, in both directions.
#include "tests/provider/include/CmpiAbi.h"

#include <gtest/gtest.h>

#include <fstream>
#include <map>
#include <sstream>
#include <stdexcept>
#include <string>
#include <utility>

namespace {

/// Facts by what they are about.
using CmpiAbi = std::map<std::string, std::string>;

/// All of the enumerations of the interface are ints; the table does not say it of each.
constexpr const char* enumSize = "4";

std::string decimal(const std::string& number) {
  return std::to_string(std::stoll(number, nullptr, 0));
}

/// The two sides of "name = value".
std::pair<std::string, std::string> sides(const std::string& line) {
  const std::size_t sign = line.find(" = ");
  if (sign == std::string::npos) {
    throw std::runtime_error("No \" = \" in the table's line: " + line);
  }
  return {line.substr(0, sign), line.substr(sign + 3)};
}

class TableReader {
 public:
  CmpiAbi read(std::istream& table) {
    for (std::string line; std::getline(table, line);) {
      if (line.empty() || line.front() == '#') {
        continue;
      }
      if (line.front() == '[') {
        startSection(line);
      } else {
        addFact(line);
      }
    }
    return facts_;
  }

 private:
  // "[struct] CMPIString 16 8", "[enum] CMPIrc", "[constant]"
  void startSection(const std::string& line) {
    const std::size_t end = line.find(']');
    section_ = line.substr(1, end - 1);
    std::istringstream rest(line.substr(end + 1));
    rest >> name_;
    if (section_ == "struct" || section_ == "union") {
      std::string size;
      std::string alignment;
      rest >> size >> alignment;
      facts_[section_ + " " + name_] = size + " " + alignment;
    } else if (section_ == "enum") {
      facts_["enum " + name_] = enumSize;
    }
  }

  void addFact(const std::string& line) {
    if (section_ == "scalar") {
      const auto [name, type] = sides(line);
      facts_["scalar " + name] = tests::withoutBlanks(type);
    } else if (section_ == "constant") {
      const auto [name, value] = sides(line);
      facts_["constant " + name] = value.front() == '"' ? value : decimal(value);
    } else if (section_ == "enum") {
      addEnumerator(line);
    } else {
      addMember(line);
    }
  }

  void addEnumerator(const std::string& line) {
    // The probable causes of an error are carried as numbers: the table counts them and names none.
    if (name_ == "CMPIErrorProbableCause" && line.front() == '(') {
      return;
    }
    const auto [member, value] = sides(line);
    std::string key = "enumerator ";
    key += name_ + "." + member;
    facts_[key] = decimal(value);
  }

  // "8 8 ft : CMPIStringFT *"
  void addMember(const std::string& line) {
    std::istringstream parts(line);
    std::string offset;
    std::string size;
    std::string member;
    std::string colon;
    std::string type;
    parts >> offset >> size >> member >> colon;
    std::getline(parts, type);
    std::string key = "member ";
    key += name_ + "." + member;
    facts_[key] = offset + " " + size + " " + tests::withoutBlanks(type);
  }

  std::string section_;
  std::string name_;
  CmpiAbi facts_;
};

CmpiAbi fromTable() {
  std::ifstream table(CMPI_ABI_TABLE);
  if (!table) {
    throw std::runtime_error("Cannot read " CMPI_ABI_TABLE);
  }
  return TableReader().read(table);
}

CmpiAbi fromDeclarations() {
  CmpiAbi facts;
  for (const auto* part : {&tests::abiValues, &tests::abiBroker, &tests::abiObjects, &tests::abiProviders}) {
    for (const tests::AbiFact& fact : *part) {
      facts[fact.about] = fact.fact;
    }
  }
  return facts;
}

TEST(CmpiAbi, declarationsHoldEveryFactOfTheTable) {
  const CmpiAbi declared = fromDeclarations();
  for (const auto& [about, fact] : fromTable()) {
    const auto found = declared.find(about);
    if (found == declared.end()) {
      ADD_FAILURE() << about << " is in the table and not checked";
    } else {
      EXPECT_EQ(found->second, fact) << about;
    }
  }
}

TEST(CmpiAbi, nothingIsCheckedThatTheTableDoesNotHave) {
  const CmpiAbi table = fromTable();
  for (const auto& [about, fact] : fromDeclarations()) {
    EXPECT_TRUE(table.contains(about)) << about << " = " << fact;
  }
}

}  // namespace
