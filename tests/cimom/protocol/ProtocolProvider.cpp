// The CMPI provider of the protocol tests. It serves items, places and what ties them, and a crowd that a
// test steers; other classes say by their names how they fail.
#include "../CmpiTexts.h"
#include "Control.h"

#include <cmpi/cmpidt.h>
#include <cmpi/cmpift.h>
#include <cmpi/cmpimacs.h>

#include <atomic>
#include <string>
#include <string_view>

namespace {

using association_test::classOf;
using association_test::nameOf;
using association_test::textOf;
using protocol_test::Control;

// Each factory sets it, also while requests run.
std::atomic<const CMPIBroker*> broker{nullptr};

constexpr CMPIStatus ok{CMPI_RC_OK, nullptr};

Control& control() {
  static Control steered;
  return steered;
}

CMPIStatus failure(CMPIrc code, const char* message) {
  return {code, CMNewString(broker, message, nullptr)};
}

CMPIObjectPath* pathOf(const CMPIObjectPath* asked, const char* className, const std::string& name) {
  CMPIObjectPath* path =
      CMNewObjectPath(broker, textOf(CMGetNameSpace(asked, nullptr)).c_str(), className, nullptr);
  path->ft->addKey(path, "Name", reinterpret_cast<const CMPIValue*>(name.c_str()), CMPI_chars);
  return path;
}

CMPIObjectPath* linkOf(const CMPIObjectPath* asked, const char* className, const char* firstRole,
                       CMPIObjectPath* first, const char* secondRole, CMPIObjectPath* second) {
  CMPIObjectPath* path =
      CMNewObjectPath(broker, textOf(CMGetNameSpace(asked, nullptr)).c_str(), className, nullptr);
  CMPIValue end;
  end.ref = first;
  path->ft->addKey(path, firstRole, &end, CMPI_ref);
  end.ref = second;
  path->ft->addKey(path, secondRole, &end, CMPI_ref);
  return path;
}

/// One request: hands over whatever the operation wants, instances or paths.
class Answer {
 public:
  Answer(const CMPIResult* result, const CMPIObjectPath* asked, bool names)
      : result_(result), asked_(asked), names_(names) {}

  void give(const CMPIObjectPath* path, CMPIUint32 number) const {
    if (names_) {
      CMReturnObjectPath(result_, path);
      return;
    }
    CMPIInstance* instance = CMNewInstance(broker, path, nullptr);
    CMPIValue value;
    value.uint32 = number;
    instance->ft->setProperty(instance, "Number", &value, CMPI_uint32);
    instance->ft->setProperty(instance, "Text", reinterpret_cast<const CMPIValue*>("a < b"), CMPI_chars);
    instance->ft->setProperty(instance, "Extra", reinterpret_cast<const CMPIValue*>("more"), CMPI_chars);
    instance->ft->setProperty(instance, "Note", reinterpret_cast<const CMPIValue*>("noted"), CMPI_chars);
    CMReturnInstance(result_, instance);
  }
  void give(const char* className, const std::string& name, CMPIUint32 number = 0) const {
    give(pathOf(asked_, className, name), number);
  }

  [[nodiscard]] CMPIStatus done() const { return CMReturnDone(result_); }

 private:
  const CMPIResult* result_;
  const CMPIObjectPath* asked_;
  bool names_;
};

CMPIStatus crowd(const Answer& answer) {
  Control& steered = control();
  std::unique_lock lock(steered.mutex);
  steered.delivered = 0;
  ++steered.running;
  std::size_t number = 0;
  for (; number < steered.size && number < steered.failsAfter; ++number) {
    steered.changed.wait(lock, [&] { return number < steered.allowed; });
    lock.unlock();
    answer.give("TEST_Crowd", "n" + std::to_string(number), static_cast<CMPIUint32>(number));
    lock.lock();
    steered.delivered = number + 1;
    steered.changed.notify_all();
  }
  const bool fails = steered.failsAfter <= number;
  --steered.running;
  steered.changed.notify_all();
  return fails ? failure(CMPI_RC_ERR_ACCESS_DENIED, "no entry") : answer.done();
}

CMPIStatus enumerate(const CMPIResult* result, const CMPIObjectPath* path, bool names) {
  const Answer answer(result, path, names);
  const std::string className = classOf(path);
  if (className == "TEST_Item") {
    answer.give("TEST_Item", "a", 1);
    answer.give("TEST_Item", "b", 2);
    answer.give("TEST_SubItem", "s", 3);
  } else if (className == "TEST_Crowd") {
    return crowd(answer);
  } else if (className == "TEST_Refused") {
    return {CMPI_RC_ERR_ACCESS_DENIED, nullptr};
  } else if (className == "TEST_Broken") {
    return {CMPI_RC_ERROR_SYSTEM, nullptr};
  } else if (className == "TEST_LateFailing") {
    answer.give("TEST_LateFailing", "first");
    return failure(CMPI_RC_ERR_ACCESS_DENIED, "no entry: 100%\n\xC3\xA4");
  } else if (className == "TEST_NoDone") {
    answer.give("TEST_NoDone", "first");
    return ok;
  } else if (className == "TEST_Place") {
    answer.give("TEST_Place", "here");
  }
  return answer.done();
}

CMPIStatus enumerateInstances(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* result,
                              const CMPIObjectPath* path, const char**) {
  return enumerate(result, path, false);
}

CMPIStatus enumerateInstanceNames(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* result,
                                  const CMPIObjectPath* path) {
  return enumerate(result, path, true);
}

CMPIStatus getOne(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* result, const CMPIObjectPath* path,
                  const char**) {
  const Answer answer(result, path, false);
  if (nameOf(path) == "none")
    return {CMPI_RC_ERR_NOT_FOUND, nullptr};
  answer.give(classOf(path).c_str(), nameOf(path), 1);
  return answer.done();
}

/// "Name=a Number=5": the properties that are set.
std::string shown(const CMPIInstance* instance) {
  std::string result;
  for (CMPICount index = 0; index < CMGetPropertyCount(instance, nullptr); ++index) {
    CMPIString* name = nullptr;
    const CMPIData data = CMGetPropertyAt(instance, index, &name, nullptr);
    if ((data.state & CMPI_nullValue) == 0)
      result += " " + textOf(name) + "=" +
                (data.type == CMPI_string ? textOf(data.value.string) : std::to_string(data.value.uint32));
  }
  return result;
}

void say(const std::string& line) {
  broker.load()->eft->logMessage(broker, CMPI_SEV_INFO, "call", line.c_str(), nullptr);
}

CMPIStatus create(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* result, const CMPIObjectPath* path,
                  const CMPIInstance* instance) {
  say("create" + shown(instance));
  if (nameOf(path) == "a")
    return failure(CMPI_RC_ERR_ALREADY_EXISTS, "it is there");
  CMReturnObjectPath(result, pathOf(path, "TEST_Item", nameOf(path) + " made"));
  return CMReturnDone(result);
}

CMPIStatus modify(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* result, const CMPIObjectPath* path,
                  const CMPIInstance* instance, const char** names) {
  std::string line = "modify " + nameOf(path) + ":" + shown(instance);
  for (line += names == nullptr ? "" : " only"; names != nullptr && *names != nullptr; ++names)
    line += std::string(" ") + *names;
  say(line);
  return CMReturnDone(result);
}

CMPIStatus remove(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* result, const CMPIObjectPath* path) {
  say("delete " + nameOf(path));
  return nameOf(path) == "none" ? CMPIStatus{CMPI_RC_ERR_NOT_FOUND, nullptr} : CMReturnDone(result);
}

CMPIStatus query(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* result, const CMPIObjectPath* path,
                 const char* text, const char* language) {
  say(std::string("query ") + language + ": " + text);
  const Answer answer(result, path, false);
  answer.give("TEST_Item", "a", 1);
  answer.give("TEST_Item", "b", 2);
  return answer.done();
}

CMPIStatus cleanUp(CMPIInstanceMI*, const CMPIContext*, CMPIBoolean) {
  return ok;
}

CMPIStatus cleanUpAssociations(CMPIAssociationMI*, const CMPIContext*, CMPIBoolean) {
  return ok;
}

/// The place "here" holds the items a and s.
CMPIStatus farEnds(const CMPIResult* result, const CMPIObjectPath* source, const char* association,
                   bool names) {
  const Answer answer(result, source, names);
  const std::string_view asked = association == nullptr ? "" : association;
  if (asked == "TEST_Holds" && classOf(source) == "TEST_Place") {
    answer.give("TEST_Item", "a", 1);
    answer.give("TEST_SubItem", "s", 3);
  } else if (asked == "TEST_Holds") {
    answer.give("TEST_Place", "here");
  }
  return answer.done();
}

CMPIStatus associators(CMPIAssociationMI*, const CMPIContext*, const CMPIResult* result,
                       const CMPIObjectPath* path, const char* association, const char*, const char*,
                       const char*, const char**) {
  return farEnds(result, path, association, false);
}

CMPIStatus associatorNames(CMPIAssociationMI*, const CMPIContext*, const CMPIResult* result,
                           const CMPIObjectPath* path, const char* association, const char*, const char*,
                           const char*) {
  return farEnds(result, path, association, true);
}

CMPIStatus referring(const CMPIResult* result, const CMPIObjectPath* source, const char* association,
                     bool names) {
  const Answer answer(result, source, names);
  const std::string_view asked = association == nullptr ? "" : association;
  if (asked == "TEST_Holds") {
    answer.give(linkOf(source, "TEST_Holds", "Antecedent", pathOf(source, "TEST_Place", "here"), "Dependent",
                       pathOf(source, "TEST_Item", "a")),
                0);
  }
  return answer.done();
}

CMPIStatus references(CMPIAssociationMI*, const CMPIContext*, const CMPIResult* result,
                      const CMPIObjectPath* path, const char* association, const char*, const char**) {
  return referring(result, path, association, false);
}

CMPIStatus referenceNames(CMPIAssociationMI*, const CMPIContext*, const CMPIResult* result,
                          const CMPIObjectPath* path, const char* association, const char*) {
  return referring(result, path, association, true);
}

}  // namespace

// NOLINTBEGIN(readability-identifier-naming): CMPI has the factories' names

#define EXPORTED extern "C" __attribute__((visibility("default")))

EXPORTED CMPIInstanceMI* Protocol_Create_InstanceMI(const CMPIBroker* given, const CMPIContext*,
                                                    CMPIStatus*) {
  static CMPIInstanceMIFT functions = {CMPICurrentVersion,
                                       CMPICurrentVersion,
                                       "Protocol",
                                       cleanUp,
                                       enumerateInstanceNames,
                                       enumerateInstances,
                                       getOne,
                                       create,
                                       modify,
                                       remove,
                                       query};
  static CMPIInstanceMI mi{nullptr, &functions};
  broker = given;
  return &mi;
}

EXPORTED CMPIAssociationMI* Protocol_Create_AssociationMI(const CMPIBroker* given, const CMPIContext*,
                                                          CMPIStatus*) {
  static CMPIAssociationMIFT functions = {CMPICurrentVersion,  CMPICurrentVersion, "Protocol",
                                          cleanUpAssociations, associators,        associatorNames,
                                          references,          referenceNames};
  static CMPIAssociationMI mi{nullptr, &functions};
  broker = given;
  return &mi;
}

EXPORTED Control* ProtocolTestControl() {
  return &control();
}

// NOLINTEND(readability-identifier-naming)
