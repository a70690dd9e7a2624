// A cursor over every software and firmware element that the provider reports, and their CIM property values.
#pragma once

#include <Oru/Instrumentation.h>
#include <Oru/NodeLexicon.h>

#include <string>
#include <vector>

#include "Linux/InstanceId.h"
#include "Linux/ReleaseDate.h"

namespace Oru::SoftwareInventoryProfileProvider {

/// Walks the framework's nodes of each type that carries software, one type after the other: firmware, BIOS,
/// drivers. It can be narrowed once, to one element or to the elements below one parent.
///
/// Use: construct; optionally `setFilter`; then, while `operator bool` is true, read the getters and call
/// `operator++`. It stands on a node, or between types (true, though on no node: types are left to try), or
/// is exhausted (false). One object belongs to one request on one thread.
class SoftwareIdentity {
 public:
  /// What a filter's value means.
  enum FilterType : unsigned int {
    InstanceIdFilter = 0,  ///< an InstanceID: the node whose path text follows its "@"
  };

  /// Stands on the first node of the first type that has one. Throws `Oru::InstrumentationException` "Could
  /// Not Find Any of the Software Identity Nodes" where none has.
  SoftwareIdentity();
  ~SoftwareIdentity();
  SoftwareIdentity(const SoftwareIdentity&) = delete;
  SoftwareIdentity& operator=(const SoftwareIdentity&) = delete;

  /// Narrows the walk for the rest of the object's life. `value` is an InstanceID (with "@": that element),
  /// or a parent identifier (a decimal number: what is below that parent, or below the computer). Throws what
  /// the framework's filter throws for a parent identifier.
  void setFilter(FilterType type, std::string value);

  /// True when the current node satisfies every filter record.
  bool evaluate();

  /// Advances by one node, on to the next type that has one when the current type is exhausted.
  void forwardInstrumentation();

  /// True on a node, and as long as types are left to try.
  bool areNodeAvailable();
  explicit operator bool();

  /// Advances to the next node that satisfies the filters.
  void operator++();

  // Getters of the current node's CIM properties: true, and the value in the argument, where the property is
  // published.

  bool getName(std::string& name);
  bool getManufacturer(std::string& manufacturer);
  bool getBuildId(std::string& buildId);
  /// The low 16 bits; written, as 0 where there is none, whatever the result.
  bool getMajorVersion(unsigned short& majorVersion);
  bool getMinorVersion(unsigned short& minorVersion);
  /// Which property holds it depends on the type of node and, for firmware, on its description.
  bool getVersionString(std::string& versionString);
  bool getDescription(std::string& description);
  /// A CIM datetime. Its offset takes the C library's `timezone` as it stands, positive to the west.
  bool getReleaseDate(std::string& releaseDate);
  /// The same as `getReleaseDate`.
  bool getInstallDate(std::string& installDate);
  /// Appends one value of the CIM property Classifications.
  bool getClassifications(std::vector<unsigned short>& classifications);
  /// Appends the text that goes with it.
  bool getClassificationDescriptions(std::vector<std::string>& descriptions);
  /// The key: the parent's number in decimal, "@", the node's path text.
  bool getInstanceID(std::string& instanceId);

  // Getters of what is never published: false, with the argument untouched.

  bool getCaption(std::string& caption);
  bool getElementName(std::string& elementName);
  bool getOperationalStatus(std::vector<unsigned short>& operationalStatus);
  bool getStatusDescriptions(std::vector<std::string>& statusDescriptions);
  bool getHealthState(unsigned short& healthState);
  bool getPrimaryStatus(unsigned short& primaryStatus);
  bool getDetailedStatus(unsigned short& detailedStatus);
  bool getOperatingStatus(unsigned short& operatingStatus);
  bool getCommunicationStatus(unsigned short& communicationStatus);
  bool getRevisionNumber(unsigned short& revisionNumber);
  bool getBuildNumber(unsigned short& buildNumber);
  bool getTargetOperatingSystems(std::vector<std::string>& targetOperatingSystems);
  bool getLanguages(std::vector<std::string>& languages);
  bool getSerialNumber(std::string& serialNumber);
  bool getTargetTypes(std::vector<std::string>& targetTypes);
  bool getIdentityInfoValue(std::vector<std::string>& identityInfoValue);
  bool getIdentityInfoType(std::vector<std::string>& identityInfoType);
  bool isEntity(bool& entity);
  bool getExtendedResourceType(unsigned short& extendedResourceType);
  bool getOtherExtendedResourceTypeDescription(std::string& description);
  bool getMinExtendedResourceTypeMajorVersion(unsigned short& majorVersion);
  bool getMinExtendedResourceTypeMinorVersion(unsigned short& minorVersion);
  bool getMinExtendedResourceTypeRevisionNumber(unsigned short& revisionNumber);
  bool getMinExtendedResourceTypeBuildNumber(unsigned short& buildNumber);
  bool getTargetOSTypes(std::vector<unsigned short>& targetOSTypes);

  /// Writes the element software status of the current node; the framework's result.
  bool modifyElementSoftwareStatus(const std::vector<unsigned short>& status);

 private:
  struct Filter {
    FilterType type;
    std::string value;
  };
  struct Classification {
    unsigned short value;
    const char* description;
  };
  /// What a firmware's description says of it.
  struct FirmwareKind {
    std::string description;
    bool hasFirmwareRevision = false;  ///< its version is its firmware revision
    Classification classification{10, "Firmware"};
  };

  bool selectCurrentNodeType();
  [[nodiscard]] int currentType() const;
  const FirmwareKind& firmwareKind();
  Classification classify();
  bool getVersionNumber(NodeLexicon::Properties property, unsigned short& number);

  bool filterActive = false;
  NodeLexicon::PathType pathType = NodeLexicon::ExactPath;  ///< meaningful while filterActive
  std::string filterPath;
  Instrumentation instrumentation;
  std::vector<Filter> filters;
  static const std::vector<NodeLexicon::NodeType> nodeTypes;  ///< in the order of the walk
  std::vector<NodeLexicon::NodeType>::const_iterator currentNodeType;
  DateFormatter dateBuffer;  ///< holds the last formatted date
  InstanceIdMaker instanceIds;
  FirmwareKind lastFirmwareKind;  ///< of the description that was asked about last
};

}  // namespace Oru::SoftwareInventoryProfileProvider
