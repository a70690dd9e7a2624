#include "Answers.h"

#include <cmpi/cmpimacs.h>

#include <atomic>
#include <cstring>

#include "SoftwareInventoryProvider.h"

namespace Oru::SoftwareInventoryProfileProvider {

const CMPIBroker* broker = nullptr;

namespace {

std::atomic<bool> nullsAreLeftOut{false};

/// The name by which the small-footprint broker is known in its function table.
constexpr const char* smallFootprintBroker = "RequestHandler";

bool isBorne(const void* object) {
  return object != nullptr || !nullsAreLeftOut.load(std::memory_order_relaxed);
}

}  // namespace

void storeBroker(const CMPIBroker* newBroker) {
  const char* name = newBroker != nullptr && newBroker->bft != nullptr ? newBroker->bft->brokerName : nullptr;
  nullsAreLeftOut.store(name != nullptr && std::strcmp(name, smallFootprintBroker) == 0,
                        std::memory_order_relaxed);
  std::atomic_ref(broker).store(newBroker, std::memory_order_relaxed);
}

const CMPIBroker* currentBroker() {
  return std::atomic_ref(broker).load(std::memory_order_relaxed);
}

void deliver(const CMPIResult* result, const CMPIObjectPath* path) {
  if (isBorne(path)) {
    CMReturnObjectPath(result, path);
  }
}

void deliver(const CMPIResult* result, const CMPIInstance* instance) {
  if (isBorne(instance)) {
    CMReturnInstance(result, instance);
  }
}

}  // namespace Oru::SoftwareInventoryProfileProvider
