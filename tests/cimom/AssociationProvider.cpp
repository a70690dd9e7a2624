// A CMPI provider of associations between objects that nobody publishes. It logs each call that reaches it,
// and applies no filter itself. The far ends of an association class are the other ends of its links.
#include "CmpiTexts.h"

#include <cmpi/cmpidt.h>
#include <cmpi/cmpift.h>
#include <cmpi/cmpimacs.h>

#include <atomic>
#include <stdexcept>
#include <string>
#include <string_view>
#include <vector>

namespace {

using association_test::classOf;
using association_test::nameOf;
using association_test::textOf;

// Each factory sets it, also while requests run.
std::atomic<const CMPIBroker*> broker{nullptr};

constexpr CMPIStatus ok{CMPI_RC_OK, nullptr};
constexpr int crowdSize = 20000;

struct End {
  std::string className;
  std::string name;
};

struct Link {
  std::string className;
  std::string firstRole;
  End first;
  std::string secondRole;
  End second;
};

const End server{"TEST_System", "s"};
const End controller{"TEST_Controller", "c"};
const End firmware1{"TEST_Firmware", "f1"};
const End firmware2{"TEST_Firmware", "f2"};
const End driver{"TEST_Software", R"(d "quoted" \ and, more=)"};
const End port{"TEST_Port", "p"};

const std::vector<Link> links = {
    {"TEST_Installed", "System", server, "Installed", firmware1},
    {"TEST_Installed", "System", server, "Installed", firmware2},
    {"TEST_Installed", "System", server, "Installed", driver},
    {"TEST_Installed", "System", controller, "Installed", firmware1},
    {"TEST_Runs", "Antecedent", controller, "Dependent", firmware1},
    {"TEST_Serves", "Antecedent", firmware1, "Dependent", port},
    {"TEST_Holds", "Antecedent", server, "Dependent", firmware2},
    {"TEST_Holds", "Antecedent", server, "Dependent", firmware2},
    {"TEST_HoldsKind", "Antecedent", server, "Dependent", {"TEST_Port", "kind"}},
    {"TEST_HoldsMore", "Antecedent", server, "Dependent", {"TEST_Port", "more"}},
    {"TEST_Peer", "Antecedent", firmware1, "Dependent", firmware2},
    {"TEST_Peer", "Antecedent", {"TEST_Firmware", "f3"}, "Dependent", firmware1},
    {"TEST_Silent", "Owner", server, "Owned", {"TEST_Software", "silent"}},
    {"TEST_Broken", "Owner", server, "Owned", {"TEST_Software", "broken"}},
    {"TEST_AssociationOnly", "Owner", server, "Owned", {"TEST_Software", "only"}},
    {"TEST_Circular", "Owner", server, "Owned", {"TEST_Software", "circular"}},
    {"TEST_FaultThrows", "One", server, "Two", {"TEST_Software", "thrown"}},
    {"TEST_FaultDenied", "One", server, "Two", {"TEST_Software", "denied"}},
    {"TEST_FaultNulls", "One", server, "Two", {"TEST_Software", "nulls"}},
    {"TEST_FaultNoDone", "One", server, "Two", {"TEST_Software", "no done"}},
    {"TEST_FaultStrange", "One", server, "Two", {"TEST_Software", "strange"}},
};

CMPIStatus failure(CMPIrc code, const char* message) {
  return {code, CMNewString(broker, message, nullptr)};
}

void note(const std::string& call) {
  broker.load()->eft->logMessage(broker, CMPI_SEV_INFO, "call", call.c_str(), nullptr);
}
std::string argument(const char* name, const char* text) {
  return text == nullptr ? "" : " " + std::string(name) + "=" + text;
}

/// The path of an end. Its namespace is left out now and then, as providers do.
CMPIObjectPath* pathOf(const End& end, const char* nameSpace) {
  CMPIObjectPath* path = CMNewObjectPath(broker, nameSpace, end.className.c_str(), nullptr);
  path->ft->addKey(path, "Name", reinterpret_cast<const CMPIValue*>(end.name.c_str()), CMPI_chars);
  return path;
}

CMPIObjectPath* pathOf(const Link& link, const char* nameSpace) {
  CMPIObjectPath* path = CMNewObjectPath(broker, nameSpace, link.className.c_str(), nullptr);
  CMPIValue end;
  end.ref = pathOf(link.first, nameSpace);
  path->ft->addKey(path, link.firstRole.c_str(), &end, CMPI_ref);
  end.ref = pathOf(link.second, nameSpace);
  path->ft->addKey(path, link.secondRole.c_str(), &end, CMPI_ref);
  return path;
}

/// One request: hands over whatever the operation wants, instances or paths.
class Answer {
 public:
  Answer(const CMPIResult* result, const CMPIObjectPath* asked, bool names)
      : result_(result), nameSpace_(textOf(CMGetNameSpace(asked, nullptr))), names_(names) {}

  void give(const End& end, bool names) const {
    give(pathOf(end, end.className == "TEST_Firmware" ? "" : nameSpace_.c_str()), names);
  }
  void give(const End& end) const { give(end, names_); }
  void give(const Link& link) const { give(pathOf(link, nameSpace_.c_str()), names_); }
  /// A remark that the server made at the port about its first link.
  void giveRemark() const {
    CMPIObjectPath* path = CMNewObjectPath(broker, nameSpace_.c_str(), "TEST_Remark", nullptr);
    CMPIValue end;
    end.ref = pathOf(links.front(), nameSpace_.c_str());
    path->ft->addKey(path, "Link", &end, CMPI_ref);
    end.ref = pathOf(port, nameSpace_.c_str());
    path->ft->addKey(path, "Place", &end, CMPI_ref);
    if (names_) {
      CMReturnObjectPath(result_, path);
      return;
    }
    CMPIInstance* instance = CMNewInstance(broker, path, nullptr);
    end.ref = pathOf(server, nameSpace_.c_str());
    instance->ft->setProperty(instance, "Author", &end, CMPI_ref);
    CMReturnInstance(result_, instance);
  }
  void giveStranger(const End& end) const { give(end, !names_); }
  void giveNull() const {
    if (names_)
      CMReturnObjectPath(result_, nullptr);
    else
      CMReturnInstance(result_, nullptr);
  }
  [[nodiscard]] CMPIStatus done() const { return CMReturnDone(result_); }

 private:
  void give(const CMPIObjectPath* path, bool names) const {
    if (names) {
      CMReturnObjectPath(result_, path);
      return;
    }
    CMPIInstance* instance = CMNewInstance(broker, path, nullptr);
    CMPIValue seven;
    seven.uint32 = 7;
    instance->ft->setProperty(instance, "Number", &seven, CMPI_uint32);
    instance->ft->setProperty(instance, "Note", reinterpret_cast<const CMPIValue*>("noted"), CMPI_chars);
    CMReturnInstance(result_, instance);
  }

  const CMPIResult* result_;
  std::string nameSpace_;
  bool names_;
};

/// A class without keys is every object of the class.
bool isEnd(const End& end, const CMPIObjectPath* source) {
  return classOf(source) == end.className &&
         (CMGetKeyCount(source, nullptr) == 0 || nameOf(source) == end.name);
}

/// TEST_Holds answers for the classes below it too, though one has a provider of its own.
bool isServed(const Link& link, std::string_view asked) {
  return link.className == asked || (asked == "TEST_Holds" && link.className.starts_with(asked));
}

/// How an answer ends; the class says it.
CMPIStatus ended(std::string_view className, const Answer& answer) {
  if (className == "TEST_FaultThrows")
    throw std::runtime_error("something broke");
  if (className == "TEST_FaultDenied")
    return failure(CMPI_RC_ERR_ACCESS_DENIED, "no entry");
  if (className == "TEST_FaultNoDone")
    return ok;
  if (className == "TEST_FaultNulls")
    answer.giveNull();
  if (className == "TEST_FaultStrange")
    answer.giveStranger({"TEST_Port", "stranger"});
  return answer.done();
}

/// Asks what it was asked itself.
CMPIStatus askAgain(const CMPIContext* context, const CMPIObjectPath* path, const char* association) {
  CMPIStatus status = ok;
  broker.load()->bft->associatorNames(broker, context, path, association, nullptr, "Owner", nullptr, &status);
  return status;
}

void giveCrowd(const Answer& answer) {
  for (int number = 0; number < crowdSize; ++number)
    answer.give(End{"TEST_Software", "member " + std::to_string(number)});
}

CMPIStatus farEnds(const CMPIContext* context, const CMPIObjectPath* source, const char* association,
                   const Answer& answer) {
  const std::string_view className = association == nullptr ? "" : association;
  if (className == "TEST_Endless")
    return askAgain(context, source, association);
  if (className.ends_with("Crowd") && nameOf(source) == "many")
    giveCrowd(answer);
  for (const Link& link : links) {
    if (isServed(link, className) && isEnd(link.first, source))
      answer.give(link.second);
    else if (isServed(link, className) && isEnd(link.second, source))
      answer.give(link.first);
  }
  return ended(className, answer);
}

std::string markIn(const CMPIContext* context) {
  CMPIStatus status = ok;
  const CMPIData mark = context->ft->getEntry(context, "Mark", &status);
  return status.rc == CMPI_RC_OK && mark.type == CMPI_string ? " marked " + textOf(mark.value.string) : "";
}

CMPIStatus associators(CMPIAssociationMI*, const CMPIContext* context, const CMPIResult* result,
                       const CMPIObjectPath* path, const char* association, const char* resultClass,
                       const char* role, const char* resultRole, const char** properties) {
  note("associators" + argument("of", association) + argument("result", resultClass) +
       argument("role", role) + argument("resultRole", resultRole) +
       argument("first", properties == nullptr ? nullptr : *properties) + markIn(context));
  return farEnds(context, path, association, Answer(result, path, false));
}

CMPIStatus associatorNames(CMPIAssociationMI*, const CMPIContext* context, const CMPIResult* result,
                           const CMPIObjectPath* path, const char* association, const char* resultClass,
                           const char* role, const char* resultRole) {
  note("associatorNames" + argument("of", association) + argument("result", resultClass) +
       argument("role", role) + argument("resultRole", resultRole) + markIn(context));
  return farEnds(context, path, association, Answer(result, path, true));
}

CMPIStatus referring(const CMPIObjectPath* source, const char* association, const Answer& answer) {
  const std::string_view className = association == nullptr ? "" : association;
  if (className == "TEST_Serves")
    return failure(CMPI_RC_ERR_NOT_SUPPORTED, "no references here");
  if (className == "TEST_Remark")
    answer.giveRemark();
  for (const Link& link : links) {
    if (isServed(link, className) && (isEnd(link.first, source) || isEnd(link.second, source)))
      answer.give(link);
  }
  return ended(className, answer);
}

CMPIStatus references(CMPIAssociationMI*, const CMPIContext* context, const CMPIResult* result,
                      const CMPIObjectPath* path, const char* association, const char* role, const char**) {
  note("references" + argument("of", association) + argument("role", role) + markIn(context));
  return referring(path, association, Answer(result, path, false));
}

CMPIStatus referenceNames(CMPIAssociationMI*, const CMPIContext* context, const CMPIResult* result,
                          const CMPIObjectPath* path, const char* association, const char* role) {
  note("referenceNames" + argument("of", association) + argument("role", role) + markIn(context));
  return referring(path, association, Answer(result, path, true));
}

CMPIStatus cleanUpAssociations(CMPIAssociationMI*, const CMPIContext*, CMPIBoolean) {
  note("association cleanup");
  return ok;
}

CMPIStatus enumerate(const CMPIContext* context, const CMPIObjectPath* path, const Answer& answer) {
  const std::string className = classOf(path);
  note("enumerate of=" + className);
  if (className == "TEST_Silent")
    return answer.done();
  if (className == "TEST_Broken")
    return failure(CMPI_RC_ERR_FAILED, "out of order");
  if (className == "TEST_Circular")
    askAgain(context, pathOf(server, "root/test"), "TEST_Circular");
  for (const Link& link : links) {
    if (isServed(link, className))
      answer.give(link);
  }
  return ended(className, answer);
}

CMPIStatus enumerateInstances(CMPIInstanceMI*, const CMPIContext* context, const CMPIResult* result,
                              const CMPIObjectPath* path, const char**) {
  return enumerate(context, path, Answer(result, path, false));
}

CMPIStatus enumerateInstanceNames(CMPIInstanceMI*, const CMPIContext* context, const CMPIResult* result,
                                  const CMPIObjectPath* path) {
  return enumerate(context, path, Answer(result, path, true));
}

End endAt(const CMPIObjectPath* path, const std::string& role) {
  CMPIStatus status = ok;
  const CMPIData key = CMGetKey(path, role.c_str(), &status);
  const bool isReference = status.rc == CMPI_RC_OK && key.type == CMPI_ref;
  return isReference ? End{classOf(key.value.ref), nameOf(key.value.ref)} : End{};
}

CMPIStatus getOne(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* result, const CMPIObjectPath* path,
                  const char**) {
  const Answer answer(result, path, false);
  const std::string className = classOf(path);
  for (const Link& link : links) {
    const End first = endAt(path, link.firstRole);
    const End second = endAt(path, link.secondRole);
    if (link.className == className && first.className == link.first.className &&
        first.name == link.first.name && second.name == link.second.name) {
      const CMPIData end = CMGetKey(path, link.firstRole.c_str(), nullptr);
      note("get of=" + className + " in " + textOf(CMGetNameSpace(end.value.ref, nullptr)));
      answer.give(link);
      break;
    }
  }
  return answer.done();
}

CMPIStatus cleanUp(CMPIInstanceMI*, const CMPIContext*, CMPIBoolean) {
  return ok;
}

}  // namespace

// NOLINTBEGIN(readability-identifier-naming): CMPI has the factories' names

#define EXPORTED extern "C" __attribute__((visibility("default")))

EXPORTED CMPIInstanceMI* Linking_Create_InstanceMI(const CMPIBroker* given, const CMPIContext*, CMPIStatus*) {
  static CMPIInstanceMIFT functions = {CMPICurrentVersion,
                                       CMPICurrentVersion,
                                       "Linking",
                                       cleanUp,
                                       enumerateInstanceNames,
                                       enumerateInstances,
                                       getOne,
                                       nullptr,
                                       nullptr,
                                       nullptr,
                                       nullptr};
  static CMPIInstanceMI mi{nullptr, &functions};
  broker = given;
  return &mi;
}

EXPORTED CMPIAssociationMI* Linking_Create_AssociationMI(const CMPIBroker* given, const CMPIContext*,
                                                         CMPIStatus*) {
  static CMPIAssociationMIFT functions = {CMPICurrentVersion,  CMPICurrentVersion, "Linking",
                                          cleanUpAssociations, associators,        associatorNames,
                                          references,          referenceNames};
  static CMPIAssociationMI mi{nullptr, &functions};
  broker = given;
  return &mi;
}

/// Has no operation at all.
EXPORTED CMPIAssociationMI* Empty_Create_AssociationMI(const CMPIBroker*, const CMPIContext*, CMPIStatus*) {
  static CMPIAssociationMIFT functions = {
      CMPICurrentVersion, CMPICurrentVersion, "Empty", nullptr, nullptr, nullptr, nullptr, nullptr};
  static CMPIAssociationMI mi{nullptr, &functions};
  return &mi;
}

// NOLINTEND(readability-identifier-naming)
