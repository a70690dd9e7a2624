// A CMPI provider that asks for associations through the broker, and publishes what it is told. The key Name
// of the instance asked for says what it asks.
#include "CmpiTexts.h"

#include <cmpi/cmpidt.h>
#include <cmpi/cmpift.h>
#include <cmpi/cmpimacs.h>

#include <atomic>
#include <string>

namespace {

using association_test::classOf;
using association_test::nameOf;
using association_test::textOf;

// Each factory sets it, also while requests run.
std::atomic<const CMPIBroker*> broker{nullptr};

constexpr CMPIStatus ok{CMPI_RC_OK, nullptr};

CMPIObjectPath* classPath(const char* className) {
  return CMNewObjectPath(broker, "root/test", className, nullptr);
}

CMPIObjectPath* firmware() {
  CMPIObjectPath* path = classPath("TEST_Firmware");
  path->ft->addKey(path, "Name", reinterpret_cast<const CMPIValue*>("f1"), CMPI_chars);
  return path;
}

/// What an enumeration holds, as text.
std::string listed(const CMPIEnumeration* found) {
  std::string result;
  while (found->ft->hasNext(found, nullptr) != 0) {
    const CMPIData next = found->ft->getNext(found, nullptr);
    if (next.type == CMPI_ref) {
      result += " path " + classOf(next.value.ref) + " " + nameOf(next.value.ref);
    } else {
      const CMPIObjectPath* path = next.value.inst->ft->getObjectPath(next.value.inst, nullptr);
      result += " instance " + classOf(path) + " " + nameOf(path);
    }
  }
  return result;
}

/// What other providers told about the firmware or, for the name "class", about all firmware.
std::string told(const CMPIContext* context, const std::string& question) {
  CMPIStatus status = ok;
  const CMPIBrokerFT& calls = *broker.load()->bft;
  const char* properties[] = {"Number", nullptr};
  const CMPIObjectPath* source = firmware();
  CMPIContext* marked = context->ft->clone(context, nullptr);
  marked->ft->addEntry(marked, "Mark", reinterpret_cast<const CMPIValue*>("me"), CMPI_chars);
  const CMPIEnumeration* found = nullptr;
  if (question == "associators")
    found = calls.associators(broker, marked, source, "TEST_ElementSoftware", "TEST_Element", "Dependent",
                              "Antecedent", properties, &status);
  else if (question == "associatorNames")
    found = calls.associatorNames(broker, marked, source, "TEST_ElementSoftware", nullptr, nullptr, nullptr,
                                  &status);
  else if (question == "references")
    found = calls.references(broker, marked, source, "TEST_Runs", "Dependent", properties, &status);
  else if (question == "referenceNames")
    found = calls.referenceNames(broker, marked, source, "TEST_Peer", nullptr, &status);
  else if (question == "class")
    found = calls.associatorNames(broker, marked, classPath("TEST_Firmware"), "TEST_ElementSoftware", nullptr,
                                  "Antecedent", nullptr, &status);
  else if (question == "references of a class")
    found = calls.referenceNames(broker, marked, classPath("TEST_Software"), "TEST_Installed", "Installed",
                                 &status);
  else if (question == "unknown")
    found =
        calls.associators(broker, marked, source, "TEST_None", nullptr, nullptr, nullptr, nullptr, &status);
  std::string result =
      found == nullptr ? "status " + std::to_string(status.rc) + ": " + textOf(status.msg) : listed(found);
  marked->ft->release(marked);
  return result;
}

CMPIStatus getOne(CMPIInstanceMI*, const CMPIContext* context, const CMPIResult* result,
                  const CMPIObjectPath* path, const char**) {
  CMPIInstance* instance = CMNewInstance(broker, path, nullptr);
  const std::string text = told(context, nameOf(path));
  instance->ft->setProperty(instance, "Told", reinterpret_cast<const CMPIValue*>(text.c_str()), CMPI_chars);
  CMReturnInstance(result, instance);
  return CMReturnDone(result);
}

CMPIStatus cleanUp(CMPIInstanceMI*, const CMPIContext*, CMPIBoolean) {
  return ok;
}

}  // namespace

// CMPI has the factory's name.
// NOLINTNEXTLINE(readability-identifier-naming)
extern "C" __attribute__((visibility("default"))) CMPIInstanceMI* Asking_Create_InstanceMI(
    const CMPIBroker* given, const CMPIContext*, CMPIStatus*) {
  static CMPIInstanceMIFT functions = {CMPICurrentVersion,
                                       CMPICurrentVersion,
                                       "Asking",
                                       cleanUp,
                                       nullptr,
                                       nullptr,
                                       getOne,
                                       nullptr,
                                       nullptr,
                                       nullptr,
                                       nullptr};
  static CMPIInstanceMI mi{nullptr, &functions};
  broker = given;
  return &mi;
}
