// The object manager that the library serves, and how it is handed what it asked for.
#pragma once

#include <cmpi/cmpidt.h>

namespace Oru::SoftwareInventoryProfileProvider {

/// Remembers the broker of a factory call, and what it bears. Object managers may call a factory again while
/// requests run.
void storeBroker(const CMPIBroker* newBroker);

/// The one that was stored last.
const CMPIBroker* currentBroker();

/// Hands an object on, a null like any other where the object manager bears it: the small-footprint broker
/// ends the provider's process on one, so that for it nulls are left out.
void deliver(const CMPIResult* result, const CMPIObjectPath* path);
void deliver(const CMPIResult* result, const CMPIInstance* instance);

}  // namespace Oru::SoftwareInventoryProfileProvider
