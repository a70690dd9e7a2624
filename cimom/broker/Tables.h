// The function tables of the broker's objects, and what their functions have in common.
#pragma once

#include <cimom/broker/Arena.h>
#include <cimom/broker/Objects.h>
#include <cimom/broker/Request.h>
#include <cmpi/cmpidt.h>
#include <cmpi/cmpift.h>

#include <memory>
#include <string_view>

namespace cimom {

extern CMPIStringFT stringTable;
extern CMPIDateTimeFT dateTimeTable;
extern CMPIArrayFT arrayTable;
extern CMPIObjectPathFT objectPathTable;
extern CMPIInstanceFT instanceTable;
extern CMPIContextFT contextTable;
extern CMPIArgsFT argsTable;
extern CMPIEnumerationFT enumerationTable;
extern CMPIResultFT resultTable;

inline constexpr int tableVersion = CMPIVersion200;

/// A status without a text, or with one in the calling thread's request (none outside a request).
[[nodiscard]] CMPIStatus makeStatus(CMPIrc code);
[[nodiscard]] CMPIStatus makeStatus(CMPIrc code, std::string_view message);
/// Sets what the caller wants to know of; `status` may be null.
void setStatus(CMPIStatus* status, CMPIrc code);
void setStatus(CMPIStatus* status, CMPIrc code, std::string_view message);

/// Sets `status` and gives "nothing found" as CMPI's getters do.
CMPIData noData(CMPIStatus* status, CMPIrc code);
/// Sets `status` and gives null.
inline std::nullptr_t noObject(CMPIStatus* status, CMPIrc code) {
  setStatus(status, code);
  return nullptr;
}

/// Where a getter makes what it returns of an object in `home`: there, where that is memory of the calling
/// thread's request or there is no request; else in the request, so that a clone that is asked again and
/// again does not grow.
[[nodiscard]] Arena& arenaForAnswer(Arena& home);

/// The same for what is copied anew with each asking, like the path of an instance. Of what the request holds
/// to its end, copies go where they can be recycled: the answer of an upcall that is asked again for each
/// object would grow with them.
[[nodiscard]] Arena& arenaForCopies(Arena& home);

/// `data`, a part of an object in `home`, as a getter returns it: immutable objects themselves where they
/// live long enough, copies of all others.
[[nodiscard]] CMPIData answerWith(Arena& home, const CMPIData& data);

/// Who frees an object's arena: its `release`, for clones; nobody, for the objects of a request.
struct Ownership {
  template <class Object>
  static Object* clone(const Object& original) {
    auto arena = std::make_unique<Arena>(Arena::small);
    Object* const copy = original.copyTo(*arena);
    copy->ownsArena_ = true;
    (void)arena.release();  // it goes with the copy
    return copy;
  }

  template <class Object>
  static CMPIStatus release(Object* object) {
    if (object == nullptr) {
      return makeStatus(CMPI_RC_ERR_INVALID_HANDLE);
    }
    if (object->ownsArena_) {
      delete object->arena();
    }
    return makeStatus(CMPI_RC_OK);
  }
};

/// `clone` and `release` as every table has them.
template <class Object, class Handle>
Handle* cloneHandle(const Handle* handle, CMPIStatus* status) {
  const Object* const object = Object::from(handle);
  if (object == nullptr) {
    return noObject(status, CMPI_RC_ERR_INVALID_HANDLE);
  }
  setStatus(status, CMPI_RC_OK);
  return Ownership::clone(*object);
}

template <class Object, class Handle>
CMPIStatus releaseHandle(Handle* handle) {
  return Ownership::release(Object::from(handle));
}

/// The broker's object behind a handle, or null. The table's address tells its objects from foreign ones.
template <class Object, class Handle, class Table>
Object* objectBehind(const Handle* handle, const Table& table) {
  if (handle == nullptr || handle->hdl == nullptr || handle->ft != &table) {
    return nullptr;
  }
  return static_cast<Object*>(const_cast<Handle*>(handle));
}

}  // namespace cimom
