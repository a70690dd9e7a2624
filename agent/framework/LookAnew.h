// The one name of liboru.so besides those of the contract: for the process that the framework is loaded into.
#pragma once

extern "C" {

/// Has the machine looked at anew in the background (`TreeStore::lookAnew`). From any thread; does not wait,
/// except for a first look under way. A process that has not linked the library finds it by its name, `dlsym`
/// with `oruLookAnewName`: another framework library may be there that has no such function.
[[gnu::visibility("default")]] void oruLookAnew(void);
}

namespace agent {

inline constexpr const char* oruLibraryName = "liboru.so";
inline constexpr const char* oruLookAnewName = "oruLookAnew";

}  // namespace agent
