#include <cimom/broker/Objects.h>
#include <cimom/broker/Tables.h>
#include <cimom/broker/Values.h>
#include <cimom/broker/WbemUri.h>

namespace cimom {

class ObjectPathCalls {
 public:
  using Member = String* ObjectPath::*;
  static constexpr Member nameSpace = &ObjectPath::nameSpace_;
  static constexpr Member hostName = &ObjectPath::hostName_;
  static constexpr Member className = &ObjectPath::className_;

  static CMPIString* get(const CMPIObjectPath* handle, CMPIStatus* status, Member member) {
    const ObjectPath* const path = ObjectPath::from(handle);
    if (path == nullptr) {
      return noObject(status, CMPI_RC_ERR_INVALID_HANDLE);
    }
    setStatus(status, CMPI_RC_OK);
    return (path->*member)->in(arenaForAnswer(*path->arena()));
  }
};

namespace {

CMPIStatus setText(CMPIObjectPath* handle, const char* text, void (ObjectPath::*set)(std::string_view)) {
  ObjectPath* const path = ObjectPath::from(handle);
  if (path == nullptr) {
    return makeStatus(CMPI_RC_ERR_INVALID_HANDLE);
  }
  if (text == nullptr) {
    return makeStatus(CMPI_RC_ERR_INVALID_PARAMETER);
  }
  (path->*set)(text);
  return makeStatus(CMPI_RC_OK);
}

CMPIStatus setNameSpace(CMPIObjectPath* handle, const char* text) {
  return setText(handle, text, &ObjectPath::setNameSpace);
}

CMPIString* getNameSpace(const CMPIObjectPath* handle, CMPIStatus* status) {
  return ObjectPathCalls::get(handle, status, ObjectPathCalls::nameSpace);
}

CMPIStatus setHostname(CMPIObjectPath* handle, const char* text) {
  return setText(handle, text, &ObjectPath::setHostName);
}

CMPIString* getHostname(const CMPIObjectPath* handle, CMPIStatus* status) {
  return ObjectPathCalls::get(handle, status, ObjectPathCalls::hostName);
}

CMPIStatus setClassName(CMPIObjectPath* handle, const char* text) {
  return setText(handle, text, &ObjectPath::setClassName);
}

CMPIString* getClassName(const CMPIObjectPath* handle, CMPIStatus* status) {
  return ObjectPathCalls::get(handle, status, ObjectPathCalls::className);
}

CMPIStatus addKey(CMPIObjectPath* handle, const char* name, const CMPIValue* value, const CMPIType type) {
  ObjectPath* const path = ObjectPath::from(handle);
  if (path == nullptr) {
    return makeStatus(CMPI_RC_ERR_INVALID_HANDLE);
  }
  return makeStatus(name == nullptr ? CMPI_RC_ERR_INVALID_PARAMETER : path->addKey(name, value, type));
}

CMPIData getKey(const CMPIObjectPath* handle, const char* name, CMPIStatus* status) {
  const ObjectPath* const path = ObjectPath::from(handle);
  if (path == nullptr) {
    return noData(status, CMPI_RC_ERR_INVALID_HANDLE);
  }
  if (name == nullptr) {
    return noData(status, CMPI_RC_ERR_INVALID_PARAMETER);
  }
  const NamedValue* const key = path->find(name);
  if (key == nullptr) {
    return noData(status, CMPI_RC_ERR_NOT_FOUND);
  }
  setStatus(status, CMPI_RC_OK);
  return answerWith(*path->arena(), key->data);
}

CMPIData getKeyAt(const CMPIObjectPath* handle, CMPICount index, CMPIString** name, CMPIStatus* status) {
  const ObjectPath* const path = ObjectPath::from(handle);
  if (path == nullptr) {
    return noData(status, CMPI_RC_ERR_INVALID_HANDLE);
  }
  if (index >= path->keys().size()) {
    return noData(status, CMPI_RC_ERR_NOT_FOUND);
  }
  const NamedValue& key = path->keys()[index];
  if (name != nullptr) {
    *name = String::create(arenaForCopies(*path->arena()), key.name);
  }
  setStatus(status, CMPI_RC_OK);
  return answerWith(*path->arena(), key.data);
}

CMPICount getKeyCount(const CMPIObjectPath* handle, CMPIStatus* status) {
  const ObjectPath* const path = ObjectPath::from(handle);
  setStatus(status, path == nullptr ? CMPI_RC_ERR_INVALID_HANDLE : CMPI_RC_OK);
  return path == nullptr ? 0 : static_cast<CMPICount>(path->keys().size());
}

CMPIStatus setNameSpaceFromObjectPath(CMPIObjectPath* handle, const CMPIObjectPath* source) {
  ObjectPath* const path = ObjectPath::from(handle);
  const ObjectPath* const from = ObjectPath::from(source);
  if (path == nullptr) {
    return makeStatus(CMPI_RC_ERR_INVALID_HANDLE);
  }
  if (from == nullptr) {
    return makeStatus(CMPI_RC_ERR_INVALID_PARAMETER);
  }
  path->setNameSpace(from->nameSpace());
  return makeStatus(CMPI_RC_OK);
}

CMPIStatus setHostAndNameSpaceFromObjectPath(CMPIObjectPath* handle, const CMPIObjectPath* source) {
  const CMPIStatus status = setNameSpaceFromObjectPath(handle, source);
  if (status.rc == CMPI_RC_OK) {
    ObjectPath::from(handle)->setHostName(ObjectPath::from(source)->hostName());
  }
  return status;
}

// Qualifiers stay with the schema: the broker's capabilities do not promise them.
CMPIData noQualifier(const CMPIObjectPath* handle, CMPIStatus* status) {
  return noData(status,
                ObjectPath::from(handle) == nullptr ? CMPI_RC_ERR_INVALID_HANDLE : CMPI_RC_ERR_NOT_SUPPORTED);
}

CMPIData getClassQualifier(const CMPIObjectPath* handle, const char* /*name*/, CMPIStatus* status) {
  return noQualifier(handle, status);
}

CMPIData getPropertyQualifier(const CMPIObjectPath* handle, const char* /*property*/, const char* /*name*/,
                              CMPIStatus* status) {
  return noQualifier(handle, status);
}

CMPIData getMethodQualifier(const CMPIObjectPath* handle, const char* /*method*/, const char* /*name*/,
                            CMPIStatus* status) {
  return noQualifier(handle, status);
}

CMPIData getParameterQualifier(const CMPIObjectPath* handle, const char* /*method*/,
                               const char* /*parameter*/, const char* /*name*/, CMPIStatus* status) {
  return noQualifier(handle, status);
}

CMPIString* toString(const CMPIObjectPath* handle, CMPIStatus* status) {
  const ObjectPath* const path = ObjectPath::from(handle);
  if (path == nullptr) {
    return noObject(status, CMPI_RC_ERR_INVALID_HANDLE);
  }
  setStatus(status, CMPI_RC_OK);
  return String::create(arenaForCopies(*path->arena()), formatWbemUri(*path));
}

}  // namespace

CMPIObjectPathFT objectPathTable = {
    tableVersion,
    releaseHandle<ObjectPath>,
    cloneHandle<ObjectPath>,
    setNameSpace,
    getNameSpace,
    setHostname,
    getHostname,
    setClassName,
    getClassName,
    addKey,
    getKey,
    getKeyAt,
    getKeyCount,
    setNameSpaceFromObjectPath,
    setHostAndNameSpaceFromObjectPath,
    getClassQualifier,
    getPropertyQualifier,
    getMethodQualifier,
    getParameterQualifier,
    toString,
};

}  // namespace cimom
