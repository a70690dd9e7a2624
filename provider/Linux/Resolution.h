// What the resolvers of the associations share: reading the key of a moniker, making one, climbing to the
// computer system, and the list of exceptions that may come out of an operation.
#pragma once

#include <Oru/Exceptions.h>
#include <Oru/Instrumentation.h>
#include <Oru/Moniker.h>

#include <exception>
#include <optional>
#include <string>

namespace Oru::SoftwareInventoryProfileProvider {

// Keys of monikers.
inline constexpr const char* nameKey = "Name";
inline constexpr const char* instanceIdKey = "InstanceID";
inline constexpr const char* deviceIdKey = "DeviceID";

/// The value of the first key with exactly this name, which stays selected; nothing where there is none.
std::optional<std::string> findKey(Moniker& moniker, const char* name);

/// A moniker with one key.
Moniker monikerOf(const char* key, const std::string& value);

/// Selects parents, beginning with the current node itself, up to a computer system. False, with the cursor
/// on no node, where there is none above: parents end at the root.
bool climbToComputer(Instrumentation& tree);

/// Runs an operation out of which only `Oru::InstrumentationException` and `Oru::FrameworkException` may
/// come: any other exception ends the process, as a failure that nobody has thought of.
template <typename Operation>
auto withExceptionList(const Operation& operation) {
  try {
    return operation();
  } catch (const InstrumentationException&) {
    throw;
  } catch (const FrameworkException&) {
    throw;
  } catch (...) {
    std::terminate();
  }
}

}  // namespace Oru::SoftwareInventoryProfileProvider
