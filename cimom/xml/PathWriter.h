// Object paths and class paths in the forms of DSP0203.
#pragma once

#include <cimom/broker/Objects.h>
#include <cmpi/cmpidt.h>

#include <cstddef>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

namespace cimom::xml {

/// For paths that carry none of their own: the host by which clients reach this server, and the namespace of
/// the request.
struct Location {
  std::string host = {};
  std::string nameSpace = {};  ///< "root/cimv2"
};

enum class PathForm {
  instanceName,  ///< INSTANCENAME: EnumerateInstanceNames, CreateInstance
  instancePath,  ///< INSTANCEPATH: PullInstancePaths
  objectPath,    ///< OBJECTPATH with INSTANCEPATH: AssociatorNames, ReferenceNames
  /// VALUE.REFERENCE, the value of a property: INSTANCEPATH where the path has a host of its own, else
  /// LOCALINSTANCEPATH, or INSTANCENAME where nobody knows the namespace.
  valueReference
};

/// How deep references are written that keys hold; those below lose their keys.
inline constexpr unsigned referenceDepth = 8;

/// Writes paths, mostly of one class: names are escaped once, not for each path. Keys have VALUETYPE and
/// TYPE. Used by one thread at a time; it keeps nothing of a path.
class PathWriter {
 public:
  explicit PathWriter(PathForm form, Location location = {});

  void append(std::string& out, const ObjectPath& path);

 private:
  struct KeyPlan {
    std::string name;
    CMPIType type = CMPI_null;
    std::string open;  // up to the value
    std::unique_ptr<PathWriter> reference;
  };

  PathWriter(PathForm form, Location location, unsigned depth);
  void plan(const ObjectPath& path);
  void planPlace();
  KeyPlan& planFor(const NamedValue& key, std::size_t position);
  void appendKey(std::string& out, const NamedValue& key, std::size_t position);

  PathForm form_;
  Location location_;
  unsigned depth_ = 0;
  bool isPlanned_ = false;
  // What the plan was made for, and the plan.
  std::string className_;
  std::string host_;
  std::string nameSpace_;
  std::string open_;   // up to the first key
  std::string close_;  // from the last key on
  std::vector<KeyPlan> keys_;
};

/// CLASSNAME.
void appendClassName(std::string& out, std::string_view className);
/// CLASSPATH.
void appendClassPath(std::string& out, std::string_view className, const Location& location);
/// OBJECTPATH with CLASSPATH: AssociatorNames and ReferenceNames of a class.
void appendClassObjectPath(std::string& out, std::string_view className, const Location& location);

}  // namespace cimom::xml
