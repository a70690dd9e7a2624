// Every call into the framework or the broker fails once in every request about associations, in each way
// that it can: no crash, no leak, the status that the interface promises, and what was delivered before stays
// delivered.
#include <gmock/gmock.h>

#include <algorithm>
#include <functional>

#include "AssociationRequests.h"

namespace {

using namespace associations;  // NOLINT(google-build-using-namespace): the tests' own vocabulary

enum class Operation { AssociatorNames, Associators, EnumerateNames, Enumerate, Get };

/// A request about one association class, from one kind of source.
struct Request {
  std::string name;
  Operation operation;
  const char* associationClass;
  CMPIObjectPath* (*source)();

  [[nodiscard]] bool isAssociation() const {
    return operation == Operation::AssociatorNames || operation == Operation::Associators;
  }
};

// Names the case where GoogleTest prints its parameter.
void PrintTo(const Request& request, std::ostream* stream) {  // NOLINT(readability-identifier-naming)
  *stream << request.name;
}

CMPIObjectPath* oneInstalled() {
  return path(installedClass, {},
              {{"System", computer("alpha")}, {"InstalledSoftware", software(nicFirmware)}});
}

/// Both directions of each class, the path without keys of each end, and the class itself.
std::vector<Request> requests() {
  struct Source {
    const char* name;
    const char* associationClass;
    CMPIObjectPath* (*path)();
  };
  const Source sources[] = {
      {"InstalledFromComputer", installedClass, [] { return computer("alpha"); }},
      {"InstalledFromSoftware", installedClass, [] { return software(nicFirmware); }},
      {"InstalledFromAllSoftware", installedClass, [] { return path("KELVO_SoftwareIdentity"); }},
      {"InstalledFromAPort", installedClass, [] { return port("eth0"); }},
      {"NetworkFromPort", networkClass, [] { return port("eth1"); }},
      {"NetworkFromAllPorts", networkClass, [] { return path("KELVO_NetworkPort"); }},
      {"NetworkFromSoftware", networkClass, [] { return software(nicBootRom); }},
      {"NetworkFromAllSoftware", networkClass, [] { return path("KELVO_SoftwareIdentity"); }},
      {"BmcFromComputer", bmcClass, [] { return serviceProcessor("alpha"); }},
      {"BmcFromSoftware", bmcClass, [] { return software(bmc); }},
      {"BiosFromComputer", biosClass, [] { return computer("alpha"); }},
      {"BiosFromSoftware", biosClass, [] { return software(bios); }},
      {"AllElementSoftware", "CIM_ElementSoftwareIdentity", [] { return path("KELVO_SoftwareIdentity"); }},
  };
  std::vector<Request> all;
  for (const Source& source : sources) {
    const std::string name = source.name;
    all.push_back({name + "Names", Operation::AssociatorNames, source.associationClass, source.path});
    all.push_back({name, Operation::Associators, source.associationClass, source.path});
  }
  const Source classes[] = {
      {"Installed", installedClass, [] { return path(installedClass); }},
      {"Network", networkClass, [] { return path(networkClass); }},
      {"Bmc", bmcClass, [] { return path(bmcClass); }},
      {"Bios", biosClass, [] { return path(biosClass); }},
  };
  for (const Source& each : classes) {
    const std::string name = std::string("Enumerate") + each.name;
    all.push_back({name + "Names", Operation::EnumerateNames, each.associationClass, each.path});
    all.push_back({name, Operation::Enumerate, each.associationClass, each.path});
  }
  all.push_back({"GetInstalled", Operation::Get, installedClass, oneInstalled});
  return all;
}

class AssociationFaults : public AssociationRequests, public testing::WithParamInterface<Request> {
 protected:
  Answer ask() {
    const Request& request = GetParam();
    CMPIObjectPath* const source = request.source();
    const CMPIResult* const result = world.result();
    switch (request.operation) {
      case Operation::AssociatorNames:
        return answer(associations->ft->associatorNames(associations, nullptr, result, source,
                                                        request.associationClass, nullptr, nullptr, nullptr));
      case Operation::Associators:
        return answer(associations->ft->associators(associations, nullptr, result, source,
                                                    request.associationClass, nullptr, nullptr, nullptr,
                                                    nullptr));
      case Operation::EnumerateNames:
        return answer(enumInstanceNames(source));
      case Operation::Enumerate:
        return answer(enumInstances(source));
      case Operation::Get:
        return answer(getInstance(source));
    }
    return {};
  }

  Answer askWithFault(standin::Fault fault, std::size_t number) {
    world.forget();
    world.fault = fault;
    world.failAt = number;
    return ask();
  }

  /// How many objects had been handed over before call number `number`.
  static std::size_t deliveredBefore(const std::vector<std::string>& calls, std::size_t number) {
    return static_cast<std::size_t>(std::count_if(
        calls.begin(), calls.begin() + static_cast<std::ptrdiff_t>(number) - 1,
        [](const std::string& call) { return call.rfind("return", 0) == 0 && call != "returnDone"; }));
  }

  /// The software walk takes an exception for "this type has no nodes" where it enters a type: in selectNode
  /// by type, and in what it asks right after it.
  static bool mayEnterType(const std::vector<std::string>& calls, std::size_t number) {
    const auto isSelection = [&](std::size_t call) {
      return calls[call - 1] == "selectNode(3)" || calls[call - 1] == "selectNode(2)" ||
             calls[call - 1] == "selectNode(44)";
    };
    return isSelection(number) || (number >= 2 && isSelection(number - 1)) ||
           (number >= 3 && calls[number - 1].rfind("setFilter(", 0) == 0 && isSelection(number - 2));
  }

  void checkThrown(const Answer& answer, std::size_t before) const {
    EXPECT_EQ(answer.status.rc, CMPI_RC_OK);
    EXPECT_THAT(answer.failures, testing::Contains("injected failure")) << "it is logged";
    EXPECT_EQ(answer.done, GetParam().isAssociation() ? 1 : 0);
    if (std::string(GetParam().associationClass).rfind("KELVO", 0) == 0) {
      EXPECT_EQ(answer.objects.size(), before) << "and ends the walk";
    }
  }

  void checkBadResult(const Answer& answer) const {
    const bool classIsLost = GetParam().isAssociation()
                                 ? world.faultCall.rfind("getClassId(KELVO", 0) == 0 ||
                                       world.faultCall.rfind("areClassesRelated(CIM_Element", 0) == 0
                                 : world.failAt == 1;
    EXPECT_EQ(answer.status.rc, classIsLost ? CMPI_RC_ERR_INVALID_CLASS : CMPI_RC_OK);
    if (GetParam().isAssociation()) {
      EXPECT_EQ(answer.done, 1);
    } else {
      EXPECT_EQ(answer.done, classIsLost || !answer.failures.empty() ? 0 : 1);
    }
    EXPECT_TRUE(!classIsLost || answer.objects.empty());
  }
};

TEST_P(AssociationFaults, EveryCallOnce) {
  world.logOn = false;
  world.traceOn = false;
  const Answer whole = ask();
  const std::vector<std::string> faultless = world.calls;
  ASSERT_FALSE(faultless.empty());
  ASSERT_EQ(whole.done, 1);
  std::size_t applied = 0;
  for (const standin::Fault fault : {standin::Fault::Result, standin::Fault::Throw}) {
    for (std::size_t number = 1; number <= faultless.size(); ++number) {
      const Answer answer = askWithFault(fault, number);
      SCOPED_TRACE(world.faultCall + ", call " + std::to_string(number));
      ASSERT_TRUE(world.faultReached);
      ASSERT_LT(answer.objects.size(), tooMany);
      EXPECT_EQ(answer.status.msg, nullptr);
      EXPECT_EQ(texts(3000), texts(3000, true));
      const std::size_t before = deliveredBefore(faultless, number);
      ASSERT_GE(answer.objects.size(), before);
      EXPECT_TRUE(std::equal(whole.objects.begin(),
                             whole.objects.begin() + static_cast<std::ptrdiff_t>(before),
                             answer.objects.begin()))
          << "what was delivered stays delivered";
      applied += world.faultApplied ? 1 : 0;
      if (!world.faultApplied) {
        EXPECT_EQ(answer.objects, whole.objects) << "a call that cannot fail in this way";
        EXPECT_EQ(answer.status.rc, whole.status.rc);
      } else if (fault == standin::Fault::Result) {
        checkBadResult(answer);
      } else if (!mayEnterType(faultless, number)) {
        checkThrown(answer, before);
      } else {
        EXPECT_EQ(answer.status.rc, CMPI_RC_OK);
      }
    }
  }
  EXPECT_GT(applied, 0U);
}

INSTANTIATE_TEST_SUITE_P(Requests, AssociationFaults, testing::ValuesIn(requests()),
                         [](const auto& param) { return param.param.name; });

}  // namespace
