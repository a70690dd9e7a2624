// The memory table: marks, and memory that goes with the request.
#include <cimom/broker/BrokerState.h>
#include <cimom/broker/Context.h>
#include <cimom/broker/Objects.h>

#include <algorithm>
#include <cstring>
#include <string_view>

namespace cimom {

namespace {

CMPIGcStat* mark(const CMPIBroker* broker, CMPIStatus* status) {
  const Call call = callOn(broker);
  setStatus(status, call.code);
  return call.code == CMPI_RC_OK ? call.request->mark() : nullptr;
}

CMPIStatus release(const CMPIBroker* broker, const CMPIGcStat* mark) {
  const Call call = callOn(broker);
  if (call.code != CMPI_RC_OK) {
    return makeStatus(call.code);
  }
  return makeStatus(call.request->release(mark) ? CMPI_RC_OK : CMPI_RC_ERR_INVALID_HANDLE);
}

// The size stands before the memory, for whoever wants it larger.
struct alignas(std::max_align_t) Header {
  std::size_t size;
};
constexpr std::size_t largest = std::size_t{1} << 30U;

void* cmpiMalloc(const CMPIBroker* broker, std::size_t size) {
  const Call call = callOn(broker);
  if (call.code != CMPI_RC_OK || size > largest) {
    return nullptr;
  }
  auto* const header = ::new (call.request->arena().allocate(sizeof(Header) + size)) Header{size};
  return header + 1;
}

void* cmpiCalloc(const CMPIBroker* broker, std::size_t count, std::size_t size) {
  if (size != 0 && count > largest / size) {
    return nullptr;
  }
  void* const memory = cmpiMalloc(broker, count * size);
  return memory == nullptr ? nullptr : std::memset(memory, 0, count * size);
}

void* cmpiRealloc(const CMPIBroker* broker, void* memory, std::size_t size) {
  void* const larger = cmpiMalloc(broker, size);
  if (larger != nullptr && memory != nullptr) {
    std::memcpy(larger, memory, std::min(size, (static_cast<Header*>(memory) - 1)->size));
  }
  return larger;
}

char* cmpiStrDup(const CMPIBroker* broker, const char* text) {
  if (text == nullptr) {
    return nullptr;
  }
  const std::size_t size = std::string_view(text).size() + 1;
  void* const copy = cmpiMalloc(broker, size);
  return copy == nullptr ? nullptr : static_cast<char*>(std::memcpy(copy, text, size));
}

// It goes with its request.
void cmpiFree(const CMPIBroker* /*broker*/, void* /*memory*/) {}

template <class Object, class Handle>
void freeHandle(const CMPIBroker* /*broker*/, Handle* handle) {
  (void)Ownership::release(Object::from(handle));
}

void freeSelectExp(const CMPIBroker* /*broker*/, CMPISelectExp* /*handle*/) {}

}  // namespace

CMPIBrokerMemFT memoryTable = {
    tableVersion,
    mark,
    release,
    cmpiMalloc,
    cmpiCalloc,
    cmpiRealloc,
    cmpiStrDup,
    cmpiFree,
    freeHandle<Instance>,
    freeHandle<ObjectPath>,
    freeHandle<Args>,
    freeHandle<String>,
    freeHandle<Array>,
    freeHandle<DateTime>,
    freeSelectExp,
};

}  // namespace cimom
