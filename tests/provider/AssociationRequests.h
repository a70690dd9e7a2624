// Requests about associations through the provider's function tables, over the machine of AssociationWorld.h.
#pragma once

#include <string>
#include <vector>

#include "AssociationWorld.h"
#include "ProviderAccess.h"

namespace associations {

inline constexpr const char* installedClass = "KELVO_InstalledSoftwareIdentity";
inline constexpr const char* networkClass = "KELVO_NetworkSoftwareIdentity";
inline constexpr const char* bmcClass = "KELVO_BMCSoftwareIdentity";
inline constexpr const char* biosClass = "KELVO_BIOSSoftwareIdentity";

/// What one request delivered.
struct Answer {
  CMPIStatus status{CMPI_RC_OK, nullptr};
  int done = 0;
  std::vector<std::string> objects;   ///< paths, or the paths of instances, as describe() has them
  std::vector<std::string> failures;  ///< what exceptions said, by the log

  /// As most requests end: OK, all objects delivered, one done marker, nothing failed.
  [[nodiscard]] bool isComplete() const {
    return status.rc == CMPI_RC_OK && status.msg == nullptr && done == 1 && failures.empty();
  }
};

/// What describe() says of an association's path.
std::string installedText(const std::string& computerName, const std::string& instanceId);
std::string bmcText(const std::string& computerName, const std::string& instanceId);
std::string biosText(const std::string& computerName, const std::string& instanceId);
std::string networkText(const std::string& instanceId, const std::string& deviceId);

class AssociationRequests : public ProviderTest {
 protected:
  AssociationRequests();

  // Each request forgets what happened before it.
  Answer names(const CMPIObjectPath* source, const char* associationClass, const char* resultClass = nullptr);
  Answer associators(const CMPIObjectPath* source, const char* associationClass,
                     const char** properties = nullptr);
  Answer enumerateNames(const CMPIObjectPath* path);
  Answer enumerate(const CMPIObjectPath* path, const char** properties = nullptr);
  Answer get(const CMPIObjectPath* path, const char** properties = nullptr);

  CMPIObjectPath* path(const char* className, const Keys& keys = {}, const References& references = {}) {
    return associations::path(className, keys, references);
  }
  standin::Node& node(const std::string& text);
  standin::Served& served(const char* className) { return world.served.at(className); }
  /// Another answer to the enumeration of a class: instances with one key each.
  void serve(const char* className, const char* key, const std::vector<std::string>& values);
  /// The factories are called again, with a broker of that name.
  void useBroker(const char* name);

  /// What the request that gave that status has delivered so far.
  Answer answer(CMPIStatus status) const;
};

}  // namespace associations
