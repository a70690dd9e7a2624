// The drivers that run this machine's devices.
#pragma once

#include <agent/discovery/Source.h>
#include <agent/discovery/drivers/ModuleDatabase.h>

#include <memory>

namespace agent::discovery {

/// Finds the modules and built-in drivers that a device is bound to: one node for each, by name. `modules`
/// tells what sysfs lacks; null: libkmod over the root's lib/modules.
void readDrivers(SourceContext& context, std::shared_ptr<ModuleDatabase> modules);

}  // namespace agent::discovery
