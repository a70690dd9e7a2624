// What the four association adapters have in common: two ends, a resolver between them, and the direction,
// which the class of the given path alone decides.
//
// Every association ties software identities to one other kind of element: computer systems or network ports.
// The end that a request's path names stays fixed and is never walked; the other end is located through the
// resolver and then walked. A path of the association class itself sets up both. How far an adapter is, and
// which end moves when, is the adapter's own: its constructor, `operator bool` and `operator++`.
#pragma once

#include <Oru/Moniker.h>
#include <Oru/ProviderUtilities.h>
#include <Trace.h>
#include <cmpi/cmpidt.h>

#include <array>
#include <cstdint>
#include <string>

#include "CMPISoftwareIdentity.h"

namespace Oru::SoftwareInventoryProfileProvider {

/// Class id of KELVO_SoftwareIdentity, an end of each association.
inline constexpr std::uint16_t softwareIdentityClassId = 2;

/// One end of an association.
enum class End { Element, Software };

/// A reference of the association and the end whose path it holds.
struct Reference {
  const char* name;
  End holds;
};

/// Which nulls end the making of an association. Those that are not tested are handed on as they are.
enum class NullTests {
  None,         ///< an instance is asked for even of a path that could not be made
  Path,         ///< a path that could not be made is the end
  PathAndEnds,  ///< so is an end without a path
};

/// All that sets one association class apart in what it is called and what it holds.
struct AssociationTable {
  const char* className;
  std::uint16_t classId;
  const char* elementClassName;  ///< of the end that is no software identity
  std::uint16_t elementClassId;
  std::array<Reference, 2> references;  ///< in the order in which they are set
  NullTests nullTests;
  const std::string& logger;
  CallSite place;  ///< the table's own: what is shared speaks in the adapter's name
};

/// One adapter belongs to one request on one thread; the broker, the context and all CMPI objects that it
/// returns are the object manager's. `ElementEnd` is a cursor over the instances of the element's class.
template <typename ElementEnd, typename Resolver>
class AssociationAdapter {
 public:
  AssociationAdapter(const AssociationAdapter&) = delete;
  AssociationAdapter& operator=(const AssociationAdapter&) = delete;

  /// The path of the association that the cursor stands on, with both references.
  CMPIObjectPath* getObjectPath();

  /// Its instance, whatever `properties` lists.
  CMPIInstance* getCMPIInstance(const char** properties);

  /// The path of the far end; null for a path that was none of the ends.
  CMPIObjectPath* getAssociatorNames();

  /// The instance of the far end; as above.
  CMPIInstance* getAssociator(const char** properties);

 protected:
  AssociationAdapter(const AssociationTable& associationTable, const CMPIBroker* objectManager,
                     const CMPIContext* requestContext, const CMPIObjectPath* objectPath);
  ~AssociationAdapter() = default;

  /// A path of `className`, with the keys that `resolve` makes of those of `objectPath`: bare where that has
  /// none.
  template <typename Resolve>
  CMPIObjectPath* locate(const char* className, const CMPIObjectPath* objectPath, Resolve resolve);

  /// The keys of a moniker, written into a path.
  static CMPIObjectPath* withKeys(CMPIObjectPath* path, Moniker moniker);

  /// The calling function, as one of the adapter's own.
  [[nodiscard]] LogPoint point(CallSite site = CallSite::here()) const {
    return {table.logger, {site.function, table.place.file, table.place.line}};
  }

  // The direction.
  [[nodiscard]] bool isSoftwareGiven() const { return requestedClassId == softwareIdentityClassId; }
  [[nodiscard]] bool isElementGiven() const { return requestedClassId == table.elementClassId; }
  [[nodiscard]] bool isAssociationGiven() const { return requestedClassId == table.classId; }

  const AssociationTable& table;
  const CMPIBroker* broker;
  const CMPIContext* context;
  std::string nameSpace;
  std::uint16_t requestedClassId = 0;
  ElementEnd elementEnd;
  CMPISoftwareIdentity softwareIdentityEnd;
  Resolver resolver;

 private:
  CMPIObjectPath* pathOf(End end);
};

template <typename ElementEnd, typename Resolver>
AssociationAdapter<ElementEnd, Resolver>::AssociationAdapter(const AssociationTable& associationTable,
                                                             const CMPIBroker* objectManager,
                                                             const CMPIContext* requestContext,
                                                             const CMPIObjectPath* objectPath)
    : table(associationTable),
      broker(objectManager),
      context(requestContext),
      nameSpace(ProviderUtilities::getNamespace(objectPath)),
      elementEnd(objectManager, requestContext, nameSpace),
      softwareIdentityEnd(objectManager, requestContext, nameSpace) {
  requestedClassId = ProviderUtilities::getClassId(objectPath);
}

template <typename ElementEnd, typename Resolver>
template <typename Resolve>
CMPIObjectPath* AssociationAdapter<ElementEnd, Resolver>::locate(const char* className,
                                                                 const CMPIObjectPath* objectPath,
                                                                 Resolve resolve) {
  CMPIObjectPath* located = ProviderUtilities::createObjectPath(broker, className, nameSpace);
  if (ProviderUtilities::getKeyCount(objectPath) == 0) {
    return located;
  }
  Moniker given;
  ProviderUtilities::transformObjectPathToMoniker(objectPath, given);
  return withKeys(located, resolve(given));
}

template <typename ElementEnd, typename Resolver>
CMPIObjectPath* AssociationAdapter<ElementEnd, Resolver>::withKeys(CMPIObjectPath* path, Moniker moniker) {
  ProviderUtilities::transformMonikerToObjectPath(moniker, &path);
  return path;
}

template <typename ElementEnd, typename Resolver>
CMPIObjectPath* AssociationAdapter<ElementEnd, Resolver>::pathOf(End end) {
  return end == End::Element ? elementEnd.getObjectPath() : softwareIdentityEnd.getObjectPath();
}

template <typename ElementEnd, typename Resolver>
CMPIObjectPath* AssociationAdapter<ElementEnd, Resolver>::getObjectPath() {
  const TraceScope scope(point());
  CMPIObjectPath* path = ProviderUtilities::createObjectPath(broker, table.className, nameSpace);
  if (path == nullptr) {
    return nullptr;
  }
  if (table.nullTests != NullTests::PathAndEnds) {
    for (const Reference& reference : table.references) {
      ProviderUtilities::setKeyProperty(path, reference.name, pathOf(reference.holds));
    }
    return path;
  }
  std::array<CMPIObjectPath*, 2> ends{};
  for (std::size_t i = 0; i < ends.size(); ++i) {
    ends[i] = pathOf(table.references[i].holds);
  }
  if (ends[0] == nullptr || ends[1] == nullptr) {
    return nullptr;
  }
  for (std::size_t i = 0; i < ends.size(); ++i) {
    ProviderUtilities::setKeyProperty(path, table.references[i].name, ends[i]);
  }
  return path;
}

template <typename ElementEnd, typename Resolver>
CMPIInstance* AssociationAdapter<ElementEnd, Resolver>::getCMPIInstance(const char** properties) {
  const TraceScope scope(point(), " properties=", static_cast<const void*>(properties));
  CMPIObjectPath* path = getObjectPath();
  if (path == nullptr && table.nullTests != NullTests::None) {
    return nullptr;
  }
  CMPIInstance* instance = ProviderUtilities::createInstance(broker, path);
  if (instance == nullptr) {
    return nullptr;
  }
  for (const Reference& reference : table.references) {
    CMPIObjectPath* value = nullptr;
    if (ProviderUtilities::getKeyProperty(path, reference.name, &value)) {
      ProviderUtilities::setProperty(instance, reference.name, value);
    }
  }
  return instance;
}

template <typename ElementEnd, typename Resolver>
CMPIObjectPath* AssociationAdapter<ElementEnd, Resolver>::getAssociatorNames() {
  const TraceScope scope(point());
  if (isElementGiven()) {
    return softwareIdentityEnd.getObjectPath();
  }
  return isSoftwareGiven() ? elementEnd.getObjectPath() : nullptr;
}

template <typename ElementEnd, typename Resolver>
CMPIInstance* AssociationAdapter<ElementEnd, Resolver>::getAssociator(const char** properties) {
  const TraceScope scope(point(), " properties=", static_cast<const void*>(properties));
  if (isElementGiven()) {
    return softwareIdentityEnd.getCMPIInstance(properties);
  }
  return isSoftwareGiven() ? elementEnd.getCMPIInstance(properties) : nullptr;
}

}  // namespace Oru::SoftwareInventoryProfileProvider
