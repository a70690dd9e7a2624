// A broker over a few classes that the tests know, and a request to work in.
#pragma once

#include <cimom/broker/Broker.h>
#include <cimom/broker/Objects.h>
#include <cimom/broker/Request.h>
#include <cmpi/cmpidt.h>
#include <cmpi/cmpift.h>

#include <gtest/gtest.h>

#include <map>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace cimom {

/// Declarations in a list.
class ListedModel : public ClassModel {
 public:
  std::vector<ClassDeclaration> classes;

  [[nodiscard]] std::vector<std::string> classNames() const override {
    std::vector<std::string> names;
    for (const ClassDeclaration& declared : classes) {
      names.push_back(declared.name);
    }
    return names;
  }

  [[nodiscard]] std::optional<ClassDeclaration> declaration(std::string_view className) const override {
    for (const ClassDeclaration& declared : classes) {
      if (sameName(declared.name, className)) {
        return declared;
      }
    }
    return std::nullopt;
  }
};

/// The types that a property can have, by the name of a property of Test_Thing.
inline const std::map<std::string, CMPIType>& propertyTypes() {
  static const std::map<std::string, CMPIType> types = {
      {"Boolean", CMPI_boolean},  {"Char16", CMPI_char16}, {"Uint8", CMPI_uint8},
      {"Uint16", CMPI_uint16},    {"Uint32", CMPI_uint32}, {"Uint64", CMPI_uint64},
      {"Sint8", CMPI_sint8},      {"Sint16", CMPI_sint16}, {"Sint32", CMPI_sint32},
      {"Sint64", CMPI_sint64},    {"Real32", CMPI_real32}, {"Real64", CMPI_real64},
      {"String", CMPI_string},    {"Time", CMPI_dateTime}, {"Reference", CMPI_ref},
      {"Embedded", CMPI_instance}};
  return types;
}

inline ListedModel testModel() {
  ListedModel model;
  model.classes.push_back({"Test_Base", "", {{"InstanceID", CMPI_string, true}, {"Caption", CMPI_string}}});
  ClassDeclaration thing{
      "Test_Thing", "Test_Base", {{"InstanceID", CMPI_string, true}, {"Caption", CMPI_string}}};
  for (const auto& [name, type] : propertyTypes()) {
    thing.properties.push_back({name, type});
    thing.properties.push_back({name + "s", static_cast<CMPIType>(type | CMPI_ARRAY)});
  }
  model.classes.push_back(thing);
  model.classes.push_back(
      {"Test_Link", "", {{"Left", CMPI_ref, true}, {"Right", CMPI_ref, true}, {"Note", CMPI_string}}});
  ClassDeclaration keyed{"Test_Keyed", "", {}};
  for (const auto& [name, type] : propertyTypes()) {
    if (type != CMPI_instance) {
      keyed.properties.push_back({name, type, true});
    }
  }
  model.classes.push_back(keyed);
  return model;
}

inline CMPIValue number(unsigned long long bits) {
  CMPIValue value{};
  value.uint64 = bits;
  return value;
}

/// A text as CMPI passes it with the type CMPI_chars: in the place of the value.
inline const CMPIValue* chars(const char* text) {
  return reinterpret_cast<const CMPIValue*>(text);
}

inline CMPIData dataOf(CMPIType type, CMPIValue value) {
  CMPIData data{};
  data.type = type;
  data.value = value;
  return data;
}

class BrokerTest : public testing::Test {
 protected:
  BrokerTest() : BrokerTest(nullptr) {}
  explicit BrokerTest(UpcallTarget* upcalls)
      : broker_(testModel(), settings(upcalls)), scope_(&request_), mb_(broker_.handle()), eft_(mb_->eft) {}

  BrokerSettings settings(UpcallTarget* upcalls) {
    BrokerSettings made;
    made.name = "test broker";
    made.upcalls = upcalls;
    made.log = [this](const LogEntry& entry) {
      log_.push_back(std::string(entry.isTrace ? "trace " : "message ") + std::to_string(entry.level) + " " +
                     std::string(entry.component) + ": " + std::string(entry.text));
    };
    return made;
  }

  CMPIObjectPath* newPath(const char* className = "Test_Thing") {
    return eft_->newObjectPath(mb_, "root/test", className, nullptr);
  }
  CMPIObjectPath* newKeyedPath(const char* id) {
    CMPIObjectPath* const path = newPath();
    const CMPIValue* const value = chars(id);
    EXPECT_EQ(path->ft->addKey(path, "InstanceID", value, CMPI_chars).rc, CMPI_RC_OK);
    return path;
  }
  CMPIInstance* newThing() { return eft_->newInstance(mb_, newPath(), nullptr); }
  CMPIString* newString(const char* text) { return eft_->newString(mb_, text, nullptr); }
  static std::string textOf(const CMPIString* string) {
    return string == nullptr ? "(null)" : string->ft->getCharPtr(string, nullptr);
  }

  /// Some value of the type, in the request's memory.
  CMPIValue sample(CMPIType type) {
    CMPIValue value{};
    if ((type & CMPI_ARRAY) != 0) {
      const auto simple = static_cast<CMPIType>(type & ~CMPI_ARRAY);
      value.array = eft_->newArray(mb_, 2, simple, nullptr);
      const CMPIValue element = sample(simple);
      EXPECT_EQ(value.array->ft->setElementAt(value.array, 0, &element, simple).rc, CMPI_RC_OK);
      return value;
    }
    switch (type) {
      case CMPI_string:
        value.string = newString("text");
        break;
      case CMPI_dateTime:
        value.dateTime = eft_->newDateTimeFromChars(mb_, "20240229123456.123456+060", nullptr);
        break;
      case CMPI_ref:
        value.ref = newKeyedPath("referred");
        break;
      case CMPI_instance:
        value.inst = eft_->newInstance(mb_, newKeyedPath("embedded"), nullptr);
        break;
      case CMPI_real32:
        value.real32 = 1.5F;
        break;
      case CMPI_real64:
        value.real64 = -2.5;
        break;
      case CMPI_boolean:
        value.boolean = 1;
        break;
      default:
        value.uint64 = 'A';
    }
    return value;
  }

  std::vector<std::string> log_;
  Broker broker_;
  Request request_;
  RequestScope scope_;
  const CMPIBroker* mb_;
  const CMPIBrokerEncFT* eft_;
};

}  // namespace cimom
