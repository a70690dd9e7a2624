// A CMPI provider that behaves well and badly on demand. For an enumeration the class says how, for a single
// instance the key Name. It keeps no state but a counter, so that any number of requests may run at once.
#include <cmpi/cmpidt.h>
#include <cmpi/cmpift.h>
#include <cmpi/cmpimacs.h>

#include <atomic>
#include <chrono>
#include <cstring>
#include <ctime>
#include <stdexcept>
#include <string>
#include <string_view>
#include <thread>

namespace {

// Each factory sets it, also while requests run.
std::atomic<const CMPIBroker*> broker{nullptr};
std::atomic<int> met = 0;

constexpr CMPIStatus ok{CMPI_RC_OK, nullptr};

CMPIStatus failure(CMPIrc code, const char* message) {
  return {code, CMNewString(broker, message, nullptr)};
}

std::string classNameOf(const CMPIObjectPath* path) {
  return CMGetCharPtr(CMGetClassName(path, nullptr));
}

std::string nameOf(const CMPIObjectPath* path) {
  CMPIStatus status = ok;
  const CMPIData key = CMGetKey(path, "Name", &status);
  return status.rc == CMPI_RC_OK && key.type == CMPI_string ? CMGetCharPtr(key.value.string) : "";
}

CMPIObjectPath* pathOf(const CMPIObjectPath* asked, const char* className, const std::string& name) {
  const char* nameSpace = CMGetCharPtr(CMGetNameSpace(asked, nullptr));
  CMPIObjectPath* path = CMNewObjectPath(broker, nameSpace, className, nullptr);
  path->ft->addKey(path, "Name", reinterpret_cast<const CMPIValue*>(name.c_str()), CMPI_chars);
  return path;
}

CMPIInstance* instanceOf(const CMPIObjectPath* path, CMPIUint32 number) {
  CMPIInstance* instance = CMNewInstance(broker, path, nullptr);
  CMPIValue value;
  value.uint32 = number;
  instance->ft->setProperty(instance, "Number", &value, CMPI_uint32);
  instance->ft->setProperty(instance, "Text", reinterpret_cast<const CMPIValue*>("some text"), CMPI_chars);
  return instance;
}

/// One request: hands over whatever the operation wants, instances or paths.
class Answer {
 public:
  Answer(const CMPIResult* result, const CMPIObjectPath* asked, bool names)
      : result_(result), asked_(asked), names_(names) {}

  void give(const char* className, const std::string& name, CMPIUint32 number = 0) const {
    CMPIObjectPath* path = pathOf(asked_, className, name);
    if (names_)
      CMReturnObjectPath(result_, path);
    else
      CMReturnInstance(result_, instanceOf(path, number));
  }

  void giveNull() const {
    if (names_)
      CMReturnObjectPath(result_, nullptr);
    else
      CMReturnInstance(result_, nullptr);
  }

  [[nodiscard]] CMPIStatus done() const { return CMReturnDone(result_); }

 private:
  const CMPIResult* result_;
  const CMPIObjectPath* asked_;
  bool names_;
};

/// Its own instances, those of an unregistered subclass, and those of a registered one.
CMPIStatus things(const Answer& answer) {
  answer.give("TEST_Thing", "a", 1);
  answer.give("TEST_Thing", "b", 2);
  answer.give("TEST_Kind", "k", 3);
  answer.give("TEST_SubThing", "s", 4);
  return answer.done();
}

/// Asks for the TEST_Echo instances with the key that it was asked with, and passes on what it is told.
CMPIStatus ask(const CMPIContext* context, const CMPIObjectPath* asked, const Answer& answer) {
  CMPIStatus status = ok;
  const CMPIObjectPath* path = pathOf(asked, "TEST_Echo", "from " + nameOf(asked));
  const CMPIEnumeration* echo = CBEnumInstances(broker, context, path, nullptr, &status);
  while (status.rc == CMPI_RC_OK && echo != nullptr && echo->ft->hasNext(echo, nullptr) != 0) {
    const CMPIData next = echo->ft->getNext(echo, nullptr);
    const CMPIData text = CMGetProperty(next.value.inst, "Name", nullptr);
    answer.give("TEST_Asking", CMGetCharPtr(text.value.string));
  }
  const CMPIInstance* one =
      CBGetInstance(broker, context, pathOf(asked, "TEST_Thing", "a"), nullptr, &status);
  if (one != nullptr)
    answer.give("TEST_Asking", "one", CMGetProperty(one, "Number", nullptr).value.uint32);
  const CMPIEnumeration* names = CBEnumInstanceNames(broker, context, path, &status);
  if (names != nullptr)
    answer.give("TEST_Asking", "names", names->ft->toArray(names, nullptr) != nullptr ? 1 : 0);
  if (status.rc != CMPI_RC_OK)
    return status;
  return answer.done();
}

/// Asks itself until somebody refuses.
CMPIStatus dive(const CMPIContext* context, const CMPIObjectPath* asked, const Answer& answer) {
  CMPIStatus status = ok;
  const std::string name = nameOf(asked);
  const CMPIObjectPath* deeper = pathOf(asked, "TEST_Deep", name + "x");
  const CMPIEnumeration* below = CBEnumInstances(broker, context, deeper, nullptr, &status);
  if (status.rc != CMPI_RC_OK) {
    answer.give("TEST_Deep", name, static_cast<CMPIUint32>(name.size()));
    answer.give("TEST_Deep", status.msg == nullptr ? "" : CMGetCharPtr(status.msg), 1000);
    return answer.done();
  }
  while (below->ft->hasNext(below, nullptr) != 0) {
    const CMPIData next = below->ft->getNext(below, nullptr);
    answer.give("TEST_Deep", CMGetCharPtr(CMGetProperty(next.value.inst, "Name", nullptr).value.string),
                CMGetProperty(next.value.inst, "Number", nullptr).value.uint32);
  }
  return answer.done();
}

/// Waits until two requests are here at once; without the other it gives up.
CMPIStatus meet(const Answer& answer) {
  const auto deadline = std::chrono::steady_clock::now() + std::chrono::seconds(20);
  ++met;
  while (met < 2 && std::chrono::steady_clock::now() < deadline)
    std::this_thread::sleep_for(std::chrono::milliseconds(1));
  answer.give("TEST_Meeting", "met", static_cast<CMPIUint32>(met.load()));
  return answer.done();
}

CMPIStatus behaveBadly(std::string_view className, const Answer& answer) {
  answer.give(className == "TEST_Strange" ? "TEST_NoDone" : className.data(), "first", 1);
  if (className == "TEST_Failing")
    return failure(CMPI_RC_ERR_ACCESS_DENIED, "no entry");
  if (className == "TEST_Throwing")
    throw std::runtime_error("something broke");
  if (className == "TEST_NoDone")
    return ok;
  answer.giveNull();
  answer.give(className.data(), "second", 2);
  return answer.done();
}

CMPIStatus enumerate(const CMPIContext* context, const CMPIResult* result, const CMPIObjectPath* path,
                     bool names) {
  const Answer answer(result, path, names);
  const std::string className = classNameOf(path);
  if (className == "TEST_Thing")
    return things(answer);
  if (className == "TEST_Asking")
    return ask(context, path, answer);
  if (className == "TEST_Deep")
    return dive(context, path, answer);
  if (className == "TEST_Meeting")
    return meet(answer);
  if (className == "TEST_Echo") {
    answer.give("TEST_Echo", "echo of '" + nameOf(path) + "'", CMGetKeyCount(path, nullptr));
    return answer.done();
  }
  if (className == "TEST_Zone") {
    answer.give("TEST_Zone", "west of Greenwich", static_cast<CMPIUint32>(timezone));
    return answer.done();
  }
  if (className == "TEST_Logging")
    broker.load()->eft->logMessage(broker, CMPI_SEV_ERROR, "part", "said by the provider", nullptr);
  if (className == "TEST_SubThing" || className == "TEST_Logging" || className == "TEST_Untidy" ||
      className == "TEST_Staying") {
    answer.give(className.c_str(), "s", 4);
    return answer.done();
  }
  return behaveBadly(className, answer);
}

CMPIStatus getOne(CMPIInstanceMI* /*mi*/, const CMPIContext* /*context*/, const CMPIResult* result,
                  const CMPIObjectPath* path, const char** /*properties*/) {
  const Answer answer(result, path, false);
  const std::string className = classNameOf(path);
  const std::string name = nameOf(path);
  if (name == "failing")
    return failure(CMPI_RC_ERR_ACCESS_DENIED, "no entry");
  if (name == "none")
    return answer.done();
  if (name == "gone")
    return ok;
  if (name == "path") {
    CMReturnObjectPath(result, path);
    return answer.done();
  }
  if (name == "null")
    answer.giveNull();
  answer.give(className.c_str(), name == "other" ? "another" : name, 1);
  if (name == "two")
    answer.give(className.c_str(), "two", 2);
  return name == "no done" ? ok : answer.done();
}

CMPIStatus enumerateInstances(CMPIInstanceMI* /*mi*/, const CMPIContext* context, const CMPIResult* result,
                              const CMPIObjectPath* path, const char** /*properties*/) {
  return enumerate(context, result, path, false);
}

CMPIStatus enumerateInstanceNames(CMPIInstanceMI* /*mi*/, const CMPIContext* context,
                                  const CMPIResult* result, const CMPIObjectPath* path) {
  return enumerate(context, result, path, true);
}

CMPIStatus cleanUp(CMPIInstanceMI* /*mi*/, const CMPIContext* /*context*/, CMPIBoolean /*terminating*/) {
  return ok;
}

CMPIStatus cleanUpBadly(CMPIInstanceMI* /*mi*/, const CMPIContext* /*context*/, CMPIBoolean /*terminating*/) {
  return failure(CMPI_RC_ERR_FAILED, "crumbs left");
}

CMPIStatus stay(CMPIInstanceMI* /*mi*/, const CMPIContext* /*context*/, CMPIBoolean /*terminating*/) {
  return {CMPI_RC_NEVER_UNLOAD, nullptr};
}

using CleanUp = CMPIStatus (*)(CMPIInstanceMI*, const CMPIContext*, CMPIBoolean);

CMPIInstanceMIFT table(const char* name, CleanUp cleanup) {
  return {CMPICurrentVersion,
          CMPICurrentVersion,
          name,
          cleanup,
          enumerateInstanceNames,
          enumerateInstances,
          getOne,
          nullptr,
          nullptr,
          nullptr,
          nullptr};
}

}  // namespace

// NOLINTBEGIN(readability-identifier-naming): CMPI has the factories' names

#define EXPORTED extern "C" __attribute__((visibility("default")))

EXPORTED CMPIInstanceMI* TestProvider_Create_InstanceMI(const CMPIBroker* given, const CMPIContext*,
                                                        CMPIStatus*) {
  static CMPIInstanceMIFT functions = table("TestProvider", cleanUp);
  static CMPIInstanceMI mi{nullptr, &functions};
  broker = given;
  return &mi;
}

EXPORTED CMPIInstanceMI* Untidy_Create_InstanceMI(const CMPIBroker* given, const CMPIContext*, CMPIStatus*) {
  static CMPIInstanceMIFT functions = table("Untidy", cleanUpBadly);
  static CMPIInstanceMI mi{nullptr, &functions};
  broker = given;
  return &mi;
}

EXPORTED CMPIInstanceMI* Staying_Create_InstanceMI(const CMPIBroker* given, const CMPIContext*, CMPIStatus*) {
  static CMPIInstanceMIFT functions = table("Staying", stay);
  static CMPIInstanceMI mi{nullptr, &functions};
  broker = given;
  return &mi;
}

/// Has no operation at all.
EXPORTED CMPIInstanceMI* Empty_Create_InstanceMI(const CMPIBroker*, const CMPIContext*, CMPIStatus*) {
  static CMPIInstanceMIFT functions{};
  static CMPIInstanceMI mi{nullptr, &functions};
  return &mi;
}

EXPORTED CMPIInstanceMI* Null_Create_InstanceMI(const CMPIBroker*, const CMPIContext*, CMPIStatus*) {
  return nullptr;
}

EXPORTED CMPIInstanceMI* Failing_Create_InstanceMI(const CMPIBroker* given, const CMPIContext*,
                                                   CMPIStatus* status) {
  CMSetStatusWithChars(given, status, CMPI_RC_ERR_ACCESS_DENIED, "not today");
  return nullptr;
}

// NOLINTEND(readability-identifier-naming)
