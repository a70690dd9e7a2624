// CMPI 2.0 convenience names: short calls of the members of CMPI's function tables.
//
// Each CM or CB name is one call of the table member that it is named after, with the object first and, where
// the member has one, the status last; a status pointer may be null. What a call allocates belongs to the
// object manager, as with the member itself. Values are handed over by address, whatever their C type:
// `CMSetProperty(instance, "Count", &number, CMPI_uint32)`. A text of type CMPI_chars is handed over as the
// text itself. Nothing here checks its objects for null, except where it says so.
//
// What the standard's use allows is an inline function; what returns from its caller or pastes names is a
// macro.
#pragma once

#include <cmpi/cmpidt.h>
#include <cmpi/cmpift.h>

// Status, values and objects.

/// Sets a code without a message. No effect on a null status.
inline void CMSetStatus(CMPIStatus* status, CMPIrc rc) {
  if (status != nullptr) {
    status->rc = rc;
    status->msg = nullptr;
  }
}
/// Sets a code and a message. No effect on a null status.
inline void CMSetStatusWithString(CMPIStatus* status, CMPIrc rc, CMPIString* message) {
  if (status != nullptr) {
    status->rc = rc;
    status->msg = message;
  }
}
/// Sets a code and a message made from a text. No effect on a null status.
inline void CMSetStatusWithChars(const CMPIBroker* broker, CMPIStatus* status, CMPIrc rc, const char* text) {
  if (status != nullptr) {
    status->rc = rc;
    status->msg = broker->eft->newString(broker, text, nullptr);
  }
}

/// Is the value null?
inline bool CMIsNullValue(const CMPIData& data) {
  return (data.state & CMPI_nullValue) != 0;
}
/// Is the value an array, by its type?
inline bool CMIsArray(const CMPIData& data) {
  return (data.type & CMPI_ARRAY) != 0;
}
/// Is there no object: a null pointer, or one with nothing behind it?
template <typename Object>
bool CMIsNullObject(const Object* object) {
  return object == nullptr || object->hdl == nullptr;
}
/// A copy of any object; the caller releases it.
template <typename Object>
Object* CMClone(const Object* object, CMPIStatus* status) {
  return object->ft->clone(object, status);
}
/// Releases a cloned object.
template <typename Object>
CMPIStatus CMRelease(Object* object) {
  return object->ft->release(object);
}

// New objects.

inline CMPIInstance* CMNewInstance(const CMPIBroker* broker, const CMPIObjectPath* path, CMPIStatus* status) {
  return broker->eft->newInstance(broker, path, status);
}
inline CMPIObjectPath* CMNewObjectPath(const CMPIBroker* broker, const char* nameSpace, const char* className,
                                       CMPIStatus* status) {
  return broker->eft->newObjectPath(broker, nameSpace, className, status);
}
inline CMPIArgs* CMNewArgs(const CMPIBroker* broker, CMPIStatus* status) {
  return broker->eft->newArgs(broker, status);
}
inline CMPIString* CMNewString(const CMPIBroker* broker, const char* text, CMPIStatus* status) {
  return broker->eft->newString(broker, text, status);
}
inline CMPIArray* CMNewArray(const CMPIBroker* broker, CMPICount size, CMPIType type, CMPIStatus* status) {
  return broker->eft->newArray(broker, size, type, status);
}
inline CMPIDateTime* CMNewDateTime(const CMPIBroker* broker, CMPIStatus* status) {
  return broker->eft->newDateTime(broker, status);
}
/// From microseconds: since 1970 (UTC), or the length of an interval.
inline CMPIDateTime* CMNewDateTimeFromBinary(const CMPIBroker* broker, CMPIUint64 microseconds,
                                             CMPIBoolean isInterval, CMPIStatus* status) {
  return broker->eft->newDateTimeFromBinary(broker, microseconds, isInterval, status);
}
/// From a CIM datetime text of 25 characters.
inline CMPIDateTime* CMNewDateTimeFromChars(const CMPIBroker* broker, const char* text, CMPIStatus* status) {
  return broker->eft->newDateTimeFromChars(broker, text, status);
}
/// Is the path's class `className`, or derived from it?
inline CMPIBoolean CMClassPathIsA(const CMPIBroker* broker, const CMPIObjectPath* path, const char* className,
                                  CMPIStatus* status) {
  return broker->eft->classPathIsA(broker, path, className, status);
}

// Results.

inline CMPIStatus CMReturnData(const CMPIResult* result, const void* value, CMPIType type) {
  return result->ft->returnData(result, static_cast<const CMPIValue*>(value), type);
}
inline CMPIStatus CMReturnInstance(const CMPIResult* result, const CMPIInstance* instance) {
  return result->ft->returnInstance(result, instance);
}
inline CMPIStatus CMReturnObjectPath(const CMPIResult* result, const CMPIObjectPath* path) {
  return result->ft->returnObjectPath(result, path);
}
inline CMPIStatus CMReturnDone(const CMPIResult* result) {
  return result->ft->returnDone(result);
}

// Strings.

inline const char* CMGetCharsPtr(const CMPIString* string, CMPIStatus* status) {
  return string->ft->getCharPtr(string, status);
}
inline const char* CMGetCharPtr(const CMPIString* string) {
  return CMGetCharsPtr(string, nullptr);
}

// Instances.

inline CMPIData CMGetProperty(const CMPIInstance* instance, const char* name, CMPIStatus* status) {
  return instance->ft->getProperty(instance, name, status);
}
inline CMPIData CMGetPropertyAt(const CMPIInstance* instance, CMPICount index, CMPIString** name,
                                CMPIStatus* status) {
  return instance->ft->getPropertyAt(instance, index, name, status);
}
inline CMPICount CMGetPropertyCount(const CMPIInstance* instance, CMPIStatus* status) {
  return instance->ft->getPropertyCount(instance, status);
}
inline CMPIStatus CMSetProperty(const CMPIInstance* instance, const char* name, const void* value,
                                CMPIType type) {
  return instance->ft->setProperty(instance, name, static_cast<const CMPIValue*>(value), type);
}
inline CMPIStatus CMSetPropertyFilter(CMPIInstance* instance, const char** properties, const char** keys) {
  return instance->ft->setPropertyFilter(instance, properties, keys);
}
inline CMPIObjectPath* CMGetObjectPath(const CMPIInstance* instance, CMPIStatus* status) {
  return instance->ft->getObjectPath(instance, status);
}

// Object paths.

inline CMPIStatus CMAddKey(CMPIObjectPath* path, const char* name, const void* value, CMPIType type) {
  return path->ft->addKey(path, name, static_cast<const CMPIValue*>(value), type);
}
inline CMPIData CMGetKey(const CMPIObjectPath* path, const char* name, CMPIStatus* status) {
  return path->ft->getKey(path, name, status);
}
inline CMPIData CMGetKeyAt(const CMPIObjectPath* path, CMPICount index, CMPIString** name,
                           CMPIStatus* status) {
  return path->ft->getKeyAt(path, index, name, status);
}
inline CMPICount CMGetKeyCount(const CMPIObjectPath* path, CMPIStatus* status) {
  return path->ft->getKeyCount(path, status);
}
inline CMPIString* CMGetClassName(const CMPIObjectPath* path, CMPIStatus* status) {
  return path->ft->getClassName(path, status);
}
inline CMPIStatus CMSetClassName(CMPIObjectPath* path, const char* className) {
  return path->ft->setClassName(path, className);
}
inline CMPIString* CMGetNameSpace(const CMPIObjectPath* path, CMPIStatus* status) {
  return path->ft->getNameSpace(path, status);
}
inline CMPIStatus CMSetNameSpace(CMPIObjectPath* path, const char* nameSpace) {
  return path->ft->setNameSpace(path, nameSpace);
}
inline CMPIStatus CMSetNameSpaceFromObjectPath(CMPIObjectPath* path, const CMPIObjectPath* source) {
  return path->ft->setNameSpaceFromObjectPath(path, source);
}
inline CMPIString* CMGetHostname(const CMPIObjectPath* path, CMPIStatus* status) {
  return path->ft->getHostname(path, status);
}
inline CMPIStatus CMSetHostname(CMPIObjectPath* path, const char* hostname) {
  return path->ft->setHostname(path, hostname);
}
inline CMPIString* CMObjectPathToString(const CMPIObjectPath* path, CMPIStatus* status) {
  return path->ft->toString(path, status);
}

// Arrays.

inline CMPICount CMGetArrayCount(const CMPIArray* array, CMPIStatus* status) {
  return array->ft->getSize(array, status);
}
inline CMPIType CMGetArrayType(const CMPIArray* array, CMPIStatus* status) {
  return array->ft->getSimpleType(array, status);
}
inline CMPIData CMGetArrayElementAt(const CMPIArray* array, CMPICount index, CMPIStatus* status) {
  return array->ft->getElementAt(array, index, status);
}
inline CMPIStatus CMSetArrayElementAt(CMPIArray* array, CMPICount index, const void* value, CMPIType type) {
  return array->ft->setElementAt(array, index, static_cast<const CMPIValue*>(value), type);
}

// Datetimes.

inline CMPIString* CMGetStringFormat(const CMPIDateTime* dateTime, CMPIStatus* status) {
  return dateTime->ft->getStringFormat(dateTime, status);
}
inline CMPIUint64 CMGetBinaryFormat(const CMPIDateTime* dateTime, CMPIStatus* status) {
  return dateTime->ft->getBinaryFormat(dateTime, status);
}
inline CMPIBoolean CMIsInterval(const CMPIDateTime* dateTime, CMPIStatus* status) {
  return dateTime->ft->isInterval(dateTime, status);
}

// Enumerations.

inline CMPIBoolean CMHasNext(const CMPIEnumeration* enumeration, CMPIStatus* status) {
  return enumeration->ft->hasNext(enumeration, status);
}
inline CMPIData CMGetNext(const CMPIEnumeration* enumeration, CMPIStatus* status) {
  return enumeration->ft->getNext(enumeration, status);
}
inline CMPIArray* CMToArray(const CMPIEnumeration* enumeration, CMPIStatus* status) {
  return enumeration->ft->toArray(enumeration, status);
}

// Contexts.

inline CMPIData CMGetContextEntry(const CMPIContext* context, const char* name, CMPIStatus* status) {
  return context->ft->getEntry(context, name, status);
}
inline CMPIData CMGetContextEntryAt(const CMPIContext* context, CMPICount index, CMPIString** name,
                                    CMPIStatus* status) {
  return context->ft->getEntryAt(context, index, name, status);
}
inline CMPICount CMGetContextEntryCount(const CMPIContext* context, CMPIStatus* status) {
  return context->ft->getEntryCount(context, status);
}
inline CMPIStatus CMAddContextEntry(const CMPIContext* context, const char* name, const void* value,
                                    CMPIType type) {
  return context->ft->addEntry(context, name, static_cast<const CMPIValue*>(value), type);
}

// Requests to other providers through the broker.

inline CMPIEnumeration* CBEnumInstances(const CMPIBroker* broker, const CMPIContext* context,
                                        const CMPIObjectPath* path, const char** properties,
                                        CMPIStatus* status) {
  return broker->bft->enumerateInstances(broker, context, path, properties, status);
}
inline CMPIEnumeration* CBEnumInstanceNames(const CMPIBroker* broker, const CMPIContext* context,
                                            const CMPIObjectPath* path, CMPIStatus* status) {
  return broker->bft->enumerateInstanceNames(broker, context, path, status);
}
inline CMPIInstance* CBGetInstance(const CMPIBroker* broker, const CMPIContext* context,
                                   const CMPIObjectPath* path, const char** properties, CMPIStatus* status) {
  return broker->bft->getInstance(broker, context, path, properties, status);
}
inline CMPIEnumeration* CBAssociators(const CMPIBroker* broker, const CMPIContext* context,
                                      const CMPIObjectPath* path, const char* assocClass,
                                      const char* resultClass, const char* role, const char* resultRole,
                                      const char** properties, CMPIStatus* status) {
  return broker->bft->associators(broker, context, path, assocClass, resultClass, role, resultRole,
                                  properties, status);
}
inline CMPIEnumeration* CBAssociatorNames(const CMPIBroker* broker, const CMPIContext* context,
                                          const CMPIObjectPath* path, const char* assocClass,
                                          const char* resultClass, const char* role, const char* resultRole,
                                          CMPIStatus* status) {
  return broker->bft->associatorNames(broker, context, path, assocClass, resultClass, role, resultRole,
                                      status);
}
inline CMPIEnumeration* CBReferences(const CMPIBroker* broker, const CMPIContext* context,
                                     const CMPIObjectPath* path, const char* resultClass, const char* role,
                                     const char** properties, CMPIStatus* status) {
  return broker->bft->references(broker, context, path, resultClass, role, properties, status);
}
inline CMPIEnumeration* CBReferenceNames(const CMPIBroker* broker, const CMPIContext* context,
                                         const CMPIObjectPath* path, const char* resultClass,
                                         const char* role, CMPIStatus* status) {
  return broker->bft->referenceNames(broker, context, path, resultClass, role, status);
}

// Returns from the function that uses it, with a code alone or with a message too.

#define CMReturn(code)                          \
  do {                                          \
    const CMPIStatus cmStatus{(code), nullptr}; \
    return cmStatus;                            \
  } while (false)

#define CMReturnWithString(code, message)         \
  do {                                            \
    const CMPIStatus cmStatus{(code), (message)}; \
    return cmStatus;                              \
  } while (false)

#define CMReturnWithChars(broker, code, text)                  \
  do {                                                         \
    CMPIStatus cmStatus{(code), nullptr};                      \
    CMSetStatusWithChars((broker), &cmStatus, (code), (text)); \
    return cmStatus;                                           \
  } while (false)

// The entry points of a provider library.
//
// `prefix` starts the names of the functions that serve requests: prefixEnumInstances and so on, visible
// where the stub stands. `provider` names the library's factory, provider_Create_InstanceMI, and with the
// kind before it the provider itself. `brokerVariable` takes the broker of each call of a factory. `hook` is
// a statement that each call of the factory runs, with its parameters brkr, ctx and rc in sight; CMNoHook
// where there is none.

#define CMNoHook

#define CMInstanceMIStub(prefix, provider, brokerVariable, hook)                                          \
  static CMPIInstanceMIFT instMIFT__{                                                                     \
      CMPICurrentVersion,        CMPICurrentVersion,     "instance" #provider, prefix##Cleanup,           \
      prefix##EnumInstanceNames, prefix##EnumInstances,  prefix##GetInstance,  prefix##CreateInstance,    \
      prefix##ModifyInstance,    prefix##DeleteInstance, prefix##ExecQuery};                              \
  extern "C" [[gnu::visibility("default")]] CMPIInstanceMI* provider##_Create_InstanceMI(                 \
      const CMPIBroker* brkr, [[maybe_unused]] const CMPIContext* ctx, [[maybe_unused]] CMPIStatus* rc) { \
    static CMPIInstanceMI mi{nullptr, &instMIFT__};                                                       \
    (brokerVariable) = brkr;                                                                              \
    hook;                                                                                                 \
    return &mi;                                                                                           \
  }

#define CMAssociationMIStub(prefix, provider, brokerVariable, hook)                                       \
  static CMPIAssociationMIFT assocMIFT__{                                                                 \
      CMPICurrentVersion,  CMPICurrentVersion,      "association" #provider, prefix##AssociationCleanup,  \
      prefix##Associators, prefix##AssociatorNames, prefix##References,      prefix##ReferenceNames};     \
  extern "C" [[gnu::visibility("default")]] CMPIAssociationMI* provider##_Create_AssociationMI(           \
      const CMPIBroker* brkr, [[maybe_unused]] const CMPIContext* ctx, [[maybe_unused]] CMPIStatus* rc) { \
    static CMPIAssociationMI mi{nullptr, &assocMIFT__};                                                   \
    (brokerVariable) = brkr;                                                                              \
    hook;                                                                                                 \
    return &mi;                                                                                           \
  }
