// Both providers as an object manager holds them: loaded with all symbols bound and shared, each class's
// factories called once, requests handed to the one that is registered for the class. Below is the real
// framework, which reads the inventory of the test program.
//
// What is delivered is read at once and kept as texts, so that objects may end with their request. Requests
// may be made from several threads at once, each with objects of its own.
#pragma once

#include <cmpi/cmpidt.h>
#include <cmpi/cmpift.h>
#include <tests/support/HostileCmpi.h>

#include <cstdint>
#include <map>
#include <string>
#include <vector>

namespace host {

inline constexpr const char* software = "KELVO_SoftwareIdentity";
inline constexpr const char* installed = "KELVO_InstalledSoftwareIdentity";
inline constexpr const char* network = "KELVO_NetworkSoftwareIdentity";
inline constexpr const char* bmc = "KELVO_BMCSoftwareIdentity";
inline constexpr const char* bios = "KELVO_BIOSSoftwareIdentity";
inline constexpr const char* computers = "KELVO_ComputerSystem";
inline constexpr const char* controllers = "KELVO_SPComputerSystem";
inline constexpr const char* ports = "KELVO_NetworkPort";

/// An object as it was when it was delivered. Values are texts: numbers as such, a null as "(null)", an array
/// as
/// "{...}", a path as CLASS(VALUE,...) of those keys that tell its objects apart.
struct Object {
  std::string path;
  std::map<std::string, std::string> keys;        ///< of a path, or of an instance's path
  std::map<std::string, std::string> properties;  ///< of an instance
};

struct Answer {
  CMPIrc status = CMPI_RC_OK;
  int done = 0;
  int nulls = 0;
  std::vector<Object> objects;

  [[nodiscard]] std::vector<std::string> paths() const;
};

/// What narrows an association request, apart from the association's class. Object managers may leave it to
/// the provider to heed it.
struct Narrowing {
  const char* resultClass = nullptr;
  const char* role = nullptr;
  const char* resultRole = nullptr;
};

class Host {
 public:
  /// How a null that is handed to a result is answered.
  static constexpr CMPIrc nullRefused = CMPI_RC_ERR_INVALID_PARAMETER;

  explicit Host(const CMPIBroker* broker);
  ~Host();
  Host(const Host&) = delete;
  Host& operator=(const Host&) = delete;

  Answer enumerateNames(const CMPIObjectPath* path) const;
  Answer enumerate(const CMPIObjectPath* path, const char** properties = nullptr) const;
  Answer get(const CMPIObjectPath* path) const;
  Answer names(const CMPIObjectPath* source, const char* associationClass) const;
  Answer associators(const CMPIObjectPath* source, const char* associationClass,
                     const Narrowing& narrowing = {}) const;

  /// Answers upcalls of `cmpi` with the provider of the class that is asked for: with the path as it is, or
  /// with one whose keys got lost on the way.
  enum class UpcallKeys { Kept, Dropped };
  void serveUpcalls(tests::FakeCmpi& cmpi, UpcallKeys keys = UpcallKeys::Kept) const;

  /// Cleans up every interface and lets go of both libraries.
  void unload();
  [[nodiscard]] bool isLoaded() const { return !libraries_.empty(); }

  // One interface for each class and factory, in the order of registration.
  std::map<std::string, CMPIInstanceMI*> instances;
  std::map<std::string, CMPIAssociationMI*> associations;

 private:
  CMPIrc collect(const CMPIObjectPath* path, std::vector<CMPIInstance*>& found) const;

  std::map<std::string, void*> libraries_;  ///< by the names of registrations
};

/// A path in root/cimv2, with texts as keys.
using Keys = std::vector<std::pair<const char*, const char*>>;
CMPIObjectPath* makePath(tests::FakeCmpi& cmpi, const char* className, const Keys& keys = {});

/// Sets the environment that a program over `INVENTORY_FILE` has.
void useInventory(const char* file);

/// Whether any XML can hold the text as it is: valid UTF-8 without control characters, U+FFFE and U+FFFF.
bool isClean(const std::string& text);

/// Whether a file of that name is mapped into this process.
bool isMapped(const std::string& name);

}  // namespace host
