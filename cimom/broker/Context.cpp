#include <cimom/broker/Context.h>
#include <cimom/broker/Tables.h>
#include <cimom/broker/Values.h>

#include <algorithm>

namespace cimom {

const NamedValue* NamedValues::find(std::string_view name) const {
  const auto values = all();
  const auto found = std::find_if(values.begin(), values.end(),
                                  [name](const NamedValue& value) { return sameName(value.name, name); });
  return found == values.end() ? nullptr : &*found;
}

NamedValue& NamedValues::slotFor(std::string_view name) {
  if (const NamedValue* const present = find(name); present != nullptr) {
    return values_[present - values_];
  }
  if (count_ == capacity_) {
    const std::uint32_t capacity = capacity_ == 0 ? 8 : capacity_ * 2;
    auto* const values = arena_->array<NamedValue>(capacity);
    std::copy_n(values_, count_, values);
    values_ = values;
    capacity_ = capacity;
  }
  NamedValue& slot = values_[count_++];
  slot = {arena_->copy(name), nullData(CMPI_null)};
  return slot;
}

CMPIrc NamedValues::set(std::string_view name, const CMPIValue* value, CMPIType type) {
  if (name.empty()) {
    return CMPI_RC_ERR_INVALID_PARAMETER;
  }
  CMPIData data{};
  const CMPIrc code = makeData(*arena_, value, type, data);
  if (code == CMPI_RC_OK) {
    slotFor(name).data = data;
  }
  return code;
}

void NamedValues::copyFrom(const NamedValues& other) {
  for (const NamedValue& value : other.all()) {
    slotFor(value.name).data = copyData(*arena_, value.data);
  }
}

Context::Context(Arena& arena) : CMPIContext{this, &contextTable}, entries_(arena) {}
Context* Context::create(Arena& arena) {
  return arena.make<Context>(arena);
}
Context* Context::from(const CMPIContext* handle) {
  return objectBehind<Context>(handle, contextTable);
}

CMPIrc Context::setText(std::string_view name, std::string_view text) {
  CMPIValue value{};
  value.string = String::create(*arena(), text);
  return set(name, &value, CMPI_string);
}

CMPIrc Context::setFlags(CMPIFlags flags) {
  CMPIValue value{};
  value.uint32 = flags;
  return set(CMPIInvocationFlags, &value, CMPI_uint32);
}

Context* Context::copyTo(Arena& arena) const {
  Context* const copy = create(arena);
  copy->entries_.copyFrom(entries_);
  return copy;
}

Args::Args(Arena& arena) : CMPIArgs{this, &argsTable}, entries_(arena) {}
Args* Args::create(Arena& arena) {
  return arena.make<Args>(arena);
}
Args* Args::from(const CMPIArgs* handle) {
  return objectBehind<Args>(handle, argsTable);
}

Args* Args::copyTo(Arena& arena) const {
  Args* const copy = create(arena);
  copy->entries_.copyFrom(entries_);
  return copy;
}

namespace {

// Contexts and arguments have the same functions over different handles.
template <class Object, class Handle>
struct Calls {
  static CMPIData get(const Handle* handle, const char* name, CMPIStatus* status) {
    const Object* const object = Object::from(handle);
    if (object == nullptr) {
      return noData(status, CMPI_RC_ERR_INVALID_HANDLE);
    }
    if (name == nullptr) {
      return noData(status, CMPI_RC_ERR_INVALID_PARAMETER);
    }
    const NamedValue* const value = object->entries().find(name);
    if (value == nullptr) {
      return noData(status, CMPI_RC_ERR_NOT_FOUND);
    }
    setStatus(status, CMPI_RC_OK);
    return answerWith(*object->arena(), value->data);
  }

  static CMPIData getAt(const Handle* handle, CMPICount index, CMPIString** name, CMPIStatus* status) {
    const Object* const object = Object::from(handle);
    if (object == nullptr) {
      return noData(status, CMPI_RC_ERR_INVALID_HANDLE);
    }
    if (index >= object->entries().all().size()) {
      return noData(status, CMPI_RC_ERR_NOT_FOUND);
    }
    const NamedValue& value = object->entries().all()[index];
    if (name != nullptr) {
      *name = String::create(arenaForCopies(*object->arena()), value.name);
    }
    setStatus(status, CMPI_RC_OK);
    return answerWith(*object->arena(), value.data);
  }

  static CMPICount count(const Handle* handle, CMPIStatus* status) {
    const Object* const object = Object::from(handle);
    setStatus(status, object == nullptr ? CMPI_RC_ERR_INVALID_HANDLE : CMPI_RC_OK);
    return object == nullptr ? 0 : static_cast<CMPICount>(object->entries().all().size());
  }

  static CMPIStatus add(const Handle* handle, const char* name, const CMPIValue* value, const CMPIType type) {
    Object* const object = Object::from(handle);
    if (object == nullptr) {
      return makeStatus(CMPI_RC_ERR_INVALID_HANDLE);
    }
    return makeStatus(name == nullptr ? CMPI_RC_ERR_INVALID_PARAMETER : object->set(name, value, type));
  }
};

using ContextCalls = Calls<Context, CMPIContext>;
using ArgsCalls = Calls<Args, CMPIArgs>;

}  // namespace

CMPIContextFT contextTable = {tableVersion,      releaseHandle<Context>, cloneHandle<Context>,
                              ContextCalls::get, ContextCalls::getAt,    ContextCalls::count,
                              ContextCalls::add};

CMPIArgsFT argsTable = {tableVersion,   releaseHandle<Args>, cloneHandle<Args>, ArgsCalls::add,
                        ArgsCalls::get, ArgsCalls::getAt,    ArgsCalls::count};

}  // namespace cimom
