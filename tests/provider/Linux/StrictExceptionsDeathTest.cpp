// The operations that let two types of exception out, and no other: any other ends the process. The resolvers
// of the system firmware make no such promise.
#include <Linux/InstalledSoftwareIdentity.h>
#include <Linux/NetworkSoftwareIdentity.h>
#include <Oru/Exceptions.h>
#include <gtest/gtest.h>

#include <functional>

#include "../AssociationWorld.h"

namespace {

using namespace associations;  // NOLINT(google-build-using-namespace): the tests' own vocabulary
using Oru::Moniker;
using Oru::SoftwareInventoryProfileProvider::InstalledSoftwareIdentity;
using Oru::SoftwareInventoryProfileProvider::NetworkSoftwareIdentity;
using standin::Fault;

struct Operation {
  const char* name;
  std::function<void()> run;
};

// Names the case where GoogleTest prints its parameter.
void PrintTo(const Operation& operation, std::ostream* stream) {  // NOLINT(readability-identifier-naming)
  *stream << operation.name;
}

/// Runs an operation of a resolver that is made before any fault counts.
template <typename Resolver, typename Result, typename... Arguments>
Operation operation(const char* name, Result (Resolver::*member)(Arguments...), const Keys& keys) {
  return {name, [=] {
            Resolver resolver;
            Moniker given = moniker(keys);
            standin::World& world = standin::world();
            world.calls.clear();
            if constexpr (sizeof...(Arguments) == 0) {
              static_cast<void>((resolver.*member)());
            } else {
              static_cast<void>((resolver.*member)(given));
            }
            world.failAt = 0;
          }};
}

using Overload = Moniker (NetworkSoftwareIdentity::*)(Moniker&);
using OverloadWithoutPort = Moniker (NetworkSoftwareIdentity::*)();

class StrictExceptionsDeathTest : public MachineTest, public testing::WithParamInterface<Operation> {
 protected:
  /// How many calls of the framework the operation makes.
  std::size_t calls() {
    GetParam().run();
    return world.calls.size();
  }

  void failWith(Fault fault, std::size_t call) {
    world.fault = fault;
    world.failAt = call;
    GetParam().run();
  }
};

TEST_P(StrictExceptionsDeathTest, AnotherExceptionEndsTheProcessWhereverItComesFrom) {
  testing::FLAGS_gtest_death_test_style = "threadsafe";
  const std::size_t last = calls();
  for (const std::size_t call : {std::size_t{1}, last}) {
    EXPECT_DEATH(failWith(Fault::ThrowOther, call), "terminate called") << "call " << call;
    EXPECT_DEATH(failWith(Fault::ThrowNumber, call), "terminate called") << "call " << call;
  }
}

TEST_P(StrictExceptionsDeathTest, TheFrameworksOwnExceptionPasses) {
  const std::size_t last = calls();
  for (std::size_t call = 1; call <= last; ++call) {
    EXPECT_EQ(thrownBy<Oru::InstrumentationException>([&] { failWith(Fault::Throw, call); }),
              "injected failure")
        << "call " << call;
  }
}

INSTANTIATE_TEST_SUITE_P(
    Resolvers, StrictExceptionsDeathTest,
    testing::Values(
        operation("InstalledSoftwareOfComputer", &InstalledSoftwareIdentity::getSoftwareIdentityMoniker,
                  {{"Name", "beta"}}),
        operation("ComputerOfInstalledSoftware", &InstalledSoftwareIdentity::getSystemMoniker,
                  {{"InstanceID", "192@f1"}}),
        operation("FirmwareOfFirstDevice",
                  static_cast<OverloadWithoutPort>(&NetworkSoftwareIdentity::getSoftwareIdentityMoniker), {}),
        operation("FirmwareOfPort",
                  static_cast<Overload>(&NetworkSoftwareIdentity::getSoftwareIdentityMoniker),
                  {{"DeviceID", "eth1"}}),
        operation("PortOfFirmware", &NetworkSoftwareIdentity::getNetworkPortMoniker,
                  {{"InstanceID", "26@f3"}})),
    [](const auto& param) { return std::string(param.param.name); });

}  // namespace
