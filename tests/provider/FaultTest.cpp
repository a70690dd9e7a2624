// Every call into the framework or the broker fails once, in each way that it can: no crash, no leak, the
// status that the interface promises, and what was delivered before stays delivered.
#include <gmock/gmock.h>

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

  /// What had been handed over before call number `number`.
  static Delivered before(const std::vector<std::string>& calls, std::size_t number) {
    Delivered delivered{0, 0};
    for (std::size_t i = 0; i + 1 < number; ++i) {
      delivered.paths += calls[i] == "returnObjectPath" ? 1 : 0;
      delivered.instances += calls[i] == "returnInstance" ? 1 : 0;
    }
    return delivered;
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

TEST_P(Faults, EveryCallOnce) {
  ask();
  const std::vector<std::string> faultless = world.calls;
  ASSERT_FALSE(faultless.empty());
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
      const Delivered delivered = before(faultless, number);
      EXPECT_GE(world.returnedPaths.size(), delivered.paths);
      EXPECT_GE(world.returnedInstances.size(), delivered.instances);
      const bool swallowed =
          fault == standin::Fault::Throw && (world.faultCall.rfind("selectNode", 0) == 0 || world.done == 1);
      if (fault == standin::Fault::Throw && world.faultApplied && !swallowed) {
        EXPECT_EQ(world.done, 0);
        EXPECT_EQ(texts(3000).size(), 1U) << "an exception that ends a request is logged";
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
