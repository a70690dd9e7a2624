// A CMPI provider for the operations that change something, for queries and for answers of any length. What
// it is asked to change it changes nothing of: it says in the log what reached it.
#include "CmpiTexts.h"

#include <cmpi/cmpidt.h>
#include <cmpi/cmpift.h>
#include <cmpi/cmpimacs.h>

#include <atomic>
#include <cstddef>
#include <string>
#include <string_view>

namespace {

using association_test::classOf;
using association_test::nameOf;
using association_test::textOf;

std::atomic<const CMPIBroker*> broker{nullptr};

constexpr CMPIStatus ok{CMPI_RC_OK, nullptr};

CMPIStatus failure(CMPIrc code, const char* message) {
  return {code, CMNewString(broker, message, nullptr)};
}

void say(const std::string& line) {
  broker.load()->eft->logMessage(broker, CMPI_SEV_INFO, "call", line.c_str(), nullptr);
}

CMPIObjectPath* pathOf(const CMPIObjectPath* asked, const char* className, const std::string& name) {
  CMPIObjectPath* path =
      CMNewObjectPath(broker, CMGetCharPtr(CMGetNameSpace(asked, nullptr)), className, nullptr);
  path->ft->addKey(path, "Name", reinterpret_cast<const CMPIValue*>(name.c_str()), CMPI_chars);
  return path;
}

std::string written(const CMPIObjectPath* path) {
  return textOf(path->ft->toString(path, nullptr));
}

/// " Name=a Number=5": the properties that are set, in their order.
std::string properties(const CMPIInstance* instance) {
  std::string result;
  for (CMPICount index = 0; index < CMGetPropertyCount(instance, nullptr); ++index) {
    CMPIString* name = nullptr;
    const CMPIData data = CMGetPropertyAt(instance, index, &name, nullptr);
    result += " " + textOf(name) + "=";
    if ((data.state & CMPI_nullValue) != 0)
      result += "null";
    else
      result += data.type == CMPI_string ? textOf(data.value.string) : std::to_string(data.value.uint32);
  }
  return result;
}

CMPIStatus create(CMPIInstanceMI* /*mi*/, const CMPIContext* /*context*/, const CMPIResult* result,
                  const CMPIObjectPath* path, const CMPIInstance* instance) {
  say("create " + written(path) + " of " + written(CMGetObjectPath(instance, nullptr)) +
      properties(instance));
  if (nameOf(path) == "known")
    return failure(CMPI_RC_ERR_ALREADY_EXISTS, "it is there");
  CMReturnObjectPath(result, pathOf(path, "TEST_Record", "made for " + nameOf(path)));
  if (nameOf(path) == "no done")
    return ok;
  return CMReturnDone(result);
}

CMPIStatus modify(CMPIInstanceMI* /*mi*/, const CMPIContext* /*context*/, const CMPIResult* result,
                  const CMPIObjectPath* path, const CMPIInstance* instance, const char** names) {
  std::string line = "modify " + written(path) + properties(instance);
  for (line += names == nullptr ? "" : " only"; names != nullptr && *names != nullptr; ++names)
    line += std::string(" ") + *names;
  say(line);
  if (nameOf(path) == "known")
    return failure(CMPI_RC_ERR_NO_SUCH_PROPERTY, "not that one");
  return CMReturnDone(result);
}

CMPIStatus remove(CMPIInstanceMI* /*mi*/, const CMPIContext* /*context*/, const CMPIResult* /*result*/,
                  const CMPIObjectPath* path) {
  say("delete " + written(path));
  return nameOf(path) == "gone" ? failure(CMPI_RC_ERR_NOT_FOUND, "not here") : ok;
}

CMPIInstance* numbered(const CMPIObjectPath* path, CMPIUint32 number) {
  CMPIInstance* instance = CMNewInstance(broker, path, nullptr);
  CMPIValue value;
  value.uint32 = number;
  instance->ft->setProperty(instance, "Number", &value, CMPI_uint32);
  return instance;
}

CMPIStatus query(CMPIInstanceMI* /*mi*/, const CMPIContext* /*context*/, const CMPIResult* result,
                 const CMPIObjectPath* path, const char* text, const char* language) {
  say("query " + written(path) + " in " + language + ": " + text);
  if (std::string_view(language) == "mumble")
    return failure(CMPI_RC_ERR_QUERY_LANGUAGE_NOT_SUPPORTED, "no mumbling");
  CMReturnInstance(result, numbered(pathOf(path, "TEST_Record", "found"), 1));
  // Another class than the one in the query: a projection may be anything.
  CMReturnInstance(result, numbered(pathOf(path, "TEST_Single", "found"), 2));
  return CMReturnDone(result);
}

/// What an answer of many objects does for each of them.
class Crowd {
 public:
  Crowd(const CMPIContext* context, const CMPIObjectPath* asked)
      : context_(context), asked_(asked), className_(classOf(asked)) {
    if (is("TEST_Walking"))
      answer_ = CBEnumInstances(broker, context, pathOf(asked, "TEST_Single", "x"), nullptr, nullptr);
    if (answer_ != nullptr)
      single_ = CMGetNext(answer_, nullptr).value.inst;
  }

  /// The number at the end of the class's name.
  [[nodiscard]] std::size_t size() const {
    return std::stoul(className_.substr(className_.find_first_of("0123456789")));
  }

  /// The path of a new object.
  [[nodiscard]] CMPIObjectPath* next(std::size_t number) const {
    std::string name = "object " + std::to_string(number);
    if (is("TEST_Asking"))
      name += CBGetInstance(broker, context_, pathOf(asked_, "TEST_Single", "x"), nullptr, nullptr) != nullptr
                  ? " asked"
                  : " unanswered";
    // The answer of the first upcall must last as long as the request does.
    if (single_ != nullptr)
      name += " with " + nameOf(CMGetObjectPath(single_, nullptr));
    return pathOf(asked_, className_.c_str(), name);
  }

 private:
  [[nodiscard]] bool is(std::string_view kind) const { return className_.starts_with(kind); }

  const CMPIContext* context_;
  const CMPIObjectPath* asked_;
  std::string className_;
  CMPIEnumeration* answer_ = nullptr;
  CMPIInstance* single_ = nullptr;
};

CMPIStatus enumerateNames(CMPIInstanceMI* /*mi*/, const CMPIContext* context, const CMPIResult* result,
                          const CMPIObjectPath* path) {
  const Crowd crowd(context, path);
  for (std::size_t number = 0; number < crowd.size(); ++number)
    CMReturnObjectPath(result, crowd.next(number));
  return CMReturnDone(result);
}

CMPIStatus enumerate(CMPIInstanceMI* /*mi*/, const CMPIContext* context, const CMPIResult* result,
                     const CMPIObjectPath* path, const char** /*properties*/) {
  if (classOf(path) == "TEST_Single") {
    CMReturnInstance(result, numbered(pathOf(path, "TEST_Single", "x"), 1));
    return CMReturnDone(result);
  }
  const Crowd crowd(context, path);
  for (std::size_t number = 0; number < crowd.size(); ++number)
    CMReturnInstance(result, numbered(crowd.next(number), static_cast<CMPIUint32>(number)));
  return CMReturnDone(result);
}

CMPIStatus getOne(CMPIInstanceMI* /*mi*/, const CMPIContext* /*context*/, const CMPIResult* result,
                  const CMPIObjectPath* path, const char** /*properties*/) {
  if (nameOf(path) == "none")
    return failure(CMPI_RC_ERR_NOT_FOUND, "no such thing");
  CMReturnInstance(result, numbered(path, 1));
  return CMReturnDone(result);
}

CMPIStatus cleanUp(CMPIInstanceMI* /*mi*/, const CMPIContext* /*context*/, CMPIBoolean /*terminating*/) {
  return ok;
}

}  // namespace

// NOLINTBEGIN(readability-identifier-naming): CMPI has the factories' names

#define EXPORTED extern "C" __attribute__((visibility("default")))

EXPORTED CMPIInstanceMI* Operations_Create_InstanceMI(const CMPIBroker* given, const CMPIContext*,
                                                      CMPIStatus*) {
  static CMPIInstanceMIFT functions{CMPICurrentVersion,
                                    CMPICurrentVersion,
                                    "Operations",
                                    cleanUp,
                                    enumerateNames,
                                    enumerate,
                                    getOne,
                                    create,
                                    modify,
                                    remove,
                                    query};
  static CMPIInstanceMI mi{nullptr, &functions};
  broker = given;
  return &mi;
}

/// Has no operation at all.
EXPORTED CMPIInstanceMI* Idle_Create_InstanceMI(const CMPIBroker*, const CMPIContext*, CMPIStatus*) {
  static CMPIInstanceMIFT functions{};
  static CMPIInstanceMI mi{nullptr, &functions};
  return &mi;
}

// NOLINTEND(readability-identifier-naming)
