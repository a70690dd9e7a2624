// Every call into the framework or the broker fails once, in each way that it can: no crash, no leak, the
// status that the interface promises, and what was delivered before stays delivered.
#include <gmock/gmock.h>

#include <algorithm>
#include <functional>

#include "ProviderAccess.h"

namespace {

struct Request {
  const char* name;
  std::function<CMPIStatus(CMPIInstanceMI*, CMPIResult*, standin::World&)> make;
};

// Names the case where GoogleTest prints its parameter.
void PrintTo(const Request& request, std::ostream* stream) {  // NOLINT(readability-identifier-naming)
  *stream << request.name;
}

CMPIObjectPath* requestPath(standin::World& world, const char* instanceId) {
  standin::Path* path = world.newPath("KELVO_SoftwareIdentity");
  if (instanceId != nullptr) {
    path->keys.emplace_back("InstanceID", instanceId);
  }
  return &path->cmpi;
}

Request names(const char* name, const char* instanceId) {
  return {name, [=](CMPIInstanceMI* mi, CMPIResult* result, standin::World& world) {
            return mi->ft->enumerateInstanceNames(mi, nullptr, result, requestPath(world, instanceId));
          }};
}

Request enumeration(const char* name, const char* instanceId) {
  return {name, [=](CMPIInstanceMI* mi, CMPIResult* result, standin::World& world) {
            return mi->ft->enumerateInstances(mi, nullptr, result, requestPath(world, instanceId), nullptr);
          }};
}

Request get(const char* name, const char* instanceId) {
  return {name, [=](CMPIInstanceMI* mi, CMPIResult* result, standin::World& world) {
            return mi->ft->getInstance(mi, nullptr, result, requestPath(world, instanceId), nullptr);
          }};
}

Request modify() {
  return {"Modify", [](CMPIInstanceMI* mi, CMPIResult* result, standin::World& world) {
            standin::Instance* instance = world.newInstance(world.newPath("KELVO_SoftwareIdentity"));
            return mi->ft->modifyInstance(mi, nullptr, result, requestPath(world, nullptr), &instance->cmpi,
                                          nullptr);
          }};
}

class Faults : public ProviderTest, public testing::WithParamInterface<Request> {
 protected:
  struct Delivered {
    std::size_t paths;
    std::size_t instances;
  };

  CMPIStatus ask() { return GetParam().make(instances, world.result(), world); }

  /// What the request delivered, in order.
  std::vector<std::string> delivered() const {
    std::vector<std::string> objects = returnedNames();
    const std::vector<std::string> asInstances = returnedInstanceNames();
    objects.insert(objects.end(), asInstances.begin(), asInstances.end());
    return objects;
  }

  /// How many objects had been handed over before call number `number`.
  static std::size_t deliveredBefore(const std::vector<std::string>& calls, std::size_t number) {
    return static_cast<std::size_t>(std::count_if(
        calls.begin(), calls.begin() + static_cast<std::ptrdiff_t>(number) - 1,
        [](const std::string& call) { return call.rfind("return", 0) == 0 && call != "returnDone"; }));
  }

  /// The walk takes an exception for "this type has no nodes" where it enters a type: in selectNode, and in
  /// what it asks right after it.
  static bool entersType(const std::vector<std::string>& calls, std::size_t number) {
    const auto isSelection = [&](std::size_t call) { return calls[call - 1].rfind("selectNode", 0) == 0; };
    if (isSelection(number)) {
      return true;
    }
    if (number >= 2 && calls[number - 1] == "operator bool" && isSelection(number - 1)) {
      return true;
    }
    return number >= 3 && calls[number - 1].rfind("setFilter(", 0) == 0 &&
           calls[number - 2] == "operator bool" && isSelection(number - 2);
  }

  /// A bad result is used as it is, and the walk goes on to its end: only an unknown class, a walk without
  /// any node and a filter that nothing passes leave the done marker out.
  void checkDoneAfterBadResult() const {
    const bool ended = world.faultCall == "getClassId(path)" || texts(3000).size() == 1;
    EXPECT_EQ(world.done, ended ? 0 : 1);
  }

  void checkStatus(const CMPIStatus& status) const {
    EXPECT_EQ(status.msg, nullptr);
    if (!world.faultApplied) {
      EXPECT_EQ(status.rc, CMPI_RC_OK) << "a call that cannot fail in this way";
    } else if (world.faultCall == "getClassId(path)" && std::string(GetParam().name) != "Modify") {
      EXPECT_EQ(status.rc, CMPI_RC_ERR_INVALID_CLASS);
      EXPECT_EQ(world.done, 0);
    } else if (world.faultCall == "getClassName") {
      // The broker answers the question twice, and the second answer counts.
      EXPECT_EQ(status.rc, world.calls.size() == world.failAt ? CMPI_RC_ERR_FAILED : CMPI_RC_OK);
    } else {
      EXPECT_EQ(status.rc, CMPI_RC_OK);
    }
  }
};

bool endsWithDone(const std::vector<std::string>& calls) {
  return calls.back() == "returnDone";
}

TEST_P(Faults, EveryCallOnce) {
  ask();
  const std::vector<std::string> faultless = world.calls;
  ASSERT_FALSE(faultless.empty());
  const std::vector<std::string> wholeAnswer = delivered();
  std::size_t applied = 0;
  for (const standin::Fault fault : {standin::Fault::Result, standin::Fault::Throw}) {
    for (std::size_t number = 1; number <= faultless.size(); ++number) {
      world.forget();
      world.failAt = number;
      world.fault = fault;
      const CMPIStatus status = ask();
      SCOPED_TRACE(world.faultCall + ", call " + std::to_string(number));
      ASSERT_TRUE(world.faultReached);
      applied += world.faultApplied ? 1 : 0;
      checkStatus(status);
      const std::size_t before = deliveredBefore(faultless, number);
      const std::vector<std::string> answer = delivered();
      ASSERT_GE(answer.size(), before);
      EXPECT_TRUE(std::equal(answer.begin(), answer.begin() + static_cast<std::ptrdiff_t>(before),
                             wholeAnswer.begin()))
          << "what was delivered stays delivered";
      if (!world.faultApplied) {
        EXPECT_EQ(answer, wholeAnswer);
      } else if (fault == standin::Fault::Throw && !entersType(faultless, number)) {
        EXPECT_EQ(answer.size(), before) << "an exception ends the walk";
        EXPECT_EQ(world.done, 0);
        EXPECT_EQ(texts(3000).size(), 1U) << "and is logged";
        EXPECT_EQ(texts(3000, true), texts(3000));
      } else if (fault == standin::Fault::Result && endsWithDone(faultless)) {
        checkDoneAfterBadResult();
      }
    }
  }
  EXPECT_GT(applied, 0U);
}

INSTANTIATE_TEST_SUITE_P(Requests, Faults,
                         testing::Values(names("Names", nullptr), names("NamesOfFirmware", "26@f1"),
                                         names("NamesOfDriver", "192@d2"), names("NamesBelowComputer", "192"),
                                         names("NamesBelowDevice", "26"), names("NamesOfNothing", "1@other"),
                                         enumeration("Instances", nullptr),
                                         enumeration("InstancesBelow", "26"), get("Get", "26@f1"),
                                         get("GetDriver", "192@d1"), get("GetNothing", "12@"), modify()),
                         [](const auto& param) { return std::string(param.param.name); });

}  // namespace
