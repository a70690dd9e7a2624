#include <cimom/broker/Objects.h>
#include <cimom/broker/Tables.h>
#include <cimom/broker/Values.h>

#include <algorithm>

namespace cimom {

Array::Array(Arena& arena, CMPIData* elements, std::size_t size, CMPIType simpleType)
    : CMPIArray{}, arena_(&arena), elements_(elements), size_(size), simpleType_(simpleType) {
  hdl = this;
  ft = &arrayTable;
}

Array* Array::create(Arena& arena, std::size_t size, CMPIType simpleType) {
  if (size > maximumSize || !isSimpleType(simpleType)) {
    return nullptr;
  }
  auto* const elements = arena.array<CMPIData>(size);
  std::fill_n(elements, size, nullData(keptType(simpleType)));
  return arena.make<Array>(arena, elements, size, keptType(simpleType));
}

Array* Array::from(const CMPIArray* handle) {
  return objectBehind<Array>(handle, arrayTable);
}

CMPIrc Array::set(std::size_t index, const CMPIValue* value, CMPIType type) {
  if (index >= size_) {
    return CMPI_RC_ERR_NO_SUCH_PROPERTY;
  }
  if (type != CMPI_null && !isSimpleType(type)) {
    return CMPI_RC_ERR_INVALID_DATA_TYPE;
  }
  if (type != CMPI_null && keptType(type) != simpleType_) {
    return CMPI_RC_ERR_TYPE_MISMATCH;
  }
  const CMPIrc code = makeData(*arena_, value, type, elements_[index]);
  elements_[index].type = simpleType_;
  return code;
}

Array* Array::copyTo(Arena& arena) const {
  auto* const copies = arena.array<CMPIData>(size_);
  std::transform(elements_, elements_ + size_, copies,
                 [&](const CMPIData& element) { return copyData(arena, element); });
  return arena.make<Array>(arena, copies, size_, simpleType_);
}

namespace {

CMPICount getSize(const CMPIArray* handle, CMPIStatus* status) {
  const Array* const array = Array::from(handle);
  setStatus(status, array == nullptr ? CMPI_RC_ERR_INVALID_HANDLE : CMPI_RC_OK);
  return array == nullptr ? 0 : static_cast<CMPICount>(array->elements().size());
}

CMPIType getSimpleType(const CMPIArray* handle, CMPIStatus* status) {
  const Array* const array = Array::from(handle);
  setStatus(status, array == nullptr ? CMPI_RC_ERR_INVALID_HANDLE : CMPI_RC_OK);
  return array == nullptr ? CMPI_null : array->simpleType();
}

CMPIData getElementAt(const CMPIArray* handle, CMPICount index, CMPIStatus* status) {
  const Array* const array = Array::from(handle);
  if (array == nullptr) {
    return noData(status, CMPI_RC_ERR_INVALID_HANDLE);
  }
  if (index >= array->elements().size()) {
    return noData(status, CMPI_RC_ERR_NO_SUCH_PROPERTY);
  }
  setStatus(status, CMPI_RC_OK);
  return answerWith(*array->arena(), array->elements()[index]);
}

CMPIStatus setElementAt(CMPIArray* handle, CMPICount index, const CMPIValue* value, CMPIType type) {
  Array* const array = Array::from(handle);
  return makeStatus(array == nullptr ? CMPI_RC_ERR_INVALID_HANDLE : array->set(index, value, type));
}

}  // namespace

CMPIArrayFT arrayTable = {tableVersion,  releaseHandle<Array>, cloneHandle<Array>, getSize,
                          getSimpleType, getElementAt,         setElementAt};

}  // namespace cimom
