// Object paths and class paths in the forms of DSP0203.
#pragma once

#include <cimom/broker/ClassTable.h>
#include <cimom/broker/Objects.h>

#include <string>
#include <string_view>
#include <vector>

namespace cimom::xml {

/// For paths that carry none of their own. Answers to clients want both: the host by which clients reach this
/// server, and the namespace of the request.
struct Location {
  std::string host = {};
  std::string nameSpace = {};  ///< "root/cimv2"
};

enum class PathForm {
  instanceName,   ///< INSTANCENAME: EnumerateInstanceNames, CreateInstance
  instancePath,   ///< INSTANCEPATH: PullInstancePaths
  objectPath,     ///< OBJECTPATH with INSTANCEPATH: AssociatorNames, ReferenceNames
  valueReference  ///< VALUE.REFERENCE: values of properties; whole as far as host and namespace are known
};

/// Writes paths, mostly of one class. Names of keys and types are escaped once a class, not once a path.
/// Used by one thread at a time; classes whose paths it wrote must outlive it.
class PathWriter {
 public:
  explicit PathWriter(PathForm form, Location location = {});

  void append(std::string& out, const ObjectPath& path);

 private:
  struct KeyPlan {
    const char* name;  // of the schema's own text, by which the same key is known again
    CMPIType type;
    std::string prefix;  // up to the value
  };

  void prepare(const ObjectPath& path);
  void appendInstanceName(std::string& out, const ObjectPath& path);
  void appendKey(std::string& out, const NamedValue& key, std::size_t position);

  PathForm form_;
  Location location_;
  const ClassInfo* class_ = nullptr;  // whose plan this is
  std::string open_;                  // up to the first key
  std::vector<KeyPlan> keys_;
};

/// CLASSNAME.
void appendClassName(std::string& out, std::string_view className);
/// CLASSPATH.
void appendClassPath(std::string& out, std::string_view className, const Location& location);
/// OBJECTPATH with CLASSPATH: AssociatorNames and ReferenceNames of a class.
void appendClassObjectPath(std::string& out, std::string_view className, const Location& location);

}  // namespace cimom::xml
