#include <cimom/broker/Enumeration.h>
#include <cimom/broker/Tables.h>
#include <cimom/broker/Values.h>

#include <algorithm>

namespace cimom {

Enumeration::Enumeration(Arena& arena, CMPIType type, const CMPIData* elements, std::size_t size)
    : CMPIEnumeration{}, arena_(&arena), elements_(elements), size_(size), type_(type) {
  hdl = this;
  ft = &enumerationTable;
}

Enumeration* Enumeration::create(Arena& arena, CMPIType type, std::span<const CMPIData> elements) {
  auto* const kept = arena.array<CMPIData>(elements.size());
  std::copy(elements.begin(), elements.end(), kept);
  return arena.make<Enumeration>(arena, type, kept, elements.size());
}

Enumeration* Enumeration::from(const CMPIEnumeration* handle) {
  return objectBehind<Enumeration>(handle, enumerationTable);
}

Enumeration* Enumeration::copyTo(Arena& arena) const {
  auto* const copies = arena.array<CMPIData>(size_);
  std::transform(elements_, elements_ + size_, copies,
                 [&](const CMPIData& element) { return copyData(arena, element); });
  return arena.make<Enumeration>(arena, type_, copies, size_);
}

class EnumerationCalls {
 public:
  static CMPIData getNext(const CMPIEnumeration* handle, CMPIStatus* status) {
    Enumeration* const enumeration = Enumeration::from(handle);
    if (enumeration == nullptr) {
      return noData(status, CMPI_RC_ERR_INVALID_HANDLE);
    }
    if (enumeration->next_ == enumeration->size_) {
      return noData(status, CMPI_RC_ERR_NOT_FOUND);
    }
    setStatus(status, CMPI_RC_OK);
    return enumeration->elements_[enumeration->next_++];
  }

  static CMPIBoolean hasNext(const CMPIEnumeration* handle, CMPIStatus* status) {
    const Enumeration* const enumeration = Enumeration::from(handle);
    setStatus(status, enumeration == nullptr ? CMPI_RC_ERR_INVALID_HANDLE : CMPI_RC_OK);
    return enumeration != nullptr && enumeration->next_ < enumeration->size_ ? 1 : 0;
  }

  // All elements, the walked ones too.
  static CMPIArray* toArray(const CMPIEnumeration* handle, CMPIStatus* status) {
    const Enumeration* const enumeration = Enumeration::from(handle);
    if (enumeration == nullptr) {
      return noObject(status, CMPI_RC_ERR_INVALID_HANDLE);
    }
    Array* const array =
        Array::create(arenaForCopies(*enumeration->arena()), enumeration->size_, enumeration->type_);
    if (array == nullptr) {
      return noObject(status, CMPI_RC_ERR_FAILED);
    }
    for (std::size_t index = 0; index < enumeration->size_; ++index) {
      const CMPIData& element = enumeration->elements_[index];
      (void)array->set(index, isNull(element) ? nullptr : &element.value, enumeration->type_);
    }
    setStatus(status, CMPI_RC_OK);
    return array;
  }
};

CMPIEnumerationFT enumerationTable = {
    tableVersion,
    releaseHandle<Enumeration>,
    cloneHandle<Enumeration>,
    EnumerationCalls::getNext,
    EnumerationCalls::hasNext,
    EnumerationCalls::toArray,
};

bool Collector::instance(Instance& instance) {
  CMPIData data{};
  data.type = CMPI_instance;
  data.value.inst = instance.copyTo(*arena_);
  return add(data);
}

bool Collector::path(ObjectPath& path) {
  CMPIData data{};
  data.type = CMPI_ref;
  data.value.ref = path.copyTo(*arena_);
  return add(data);
}

bool Collector::data(const CMPIData& value) {
  return add(copyData(*arena_, value));
}

bool Collector::add(const CMPIData& value) {
  if (size_ == capacity_) {
    const std::size_t capacity = capacity_ == 0 ? 16 : capacity_ * 2;
    auto* const elements = arena_->array<CMPIData>(capacity);
    std::copy_n(elements_, size_, elements);
    elements_ = elements;
    capacity_ = capacity;
  }
  elements_[size_++] = value;
  return true;
}

}  // namespace cimom
