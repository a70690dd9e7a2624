#include <cimom/broker/Objects.h>
#include <cimom/broker/Tables.h>
#include <cimom/broker/Values.h>

#include <algorithm>

namespace cimom {

namespace {

bool isListed(std::span<const std::string_view> names, std::string_view name) {
  return std::any_of(names.begin(), names.end(),
                     [name](std::string_view listed) { return sameName(listed, name); });
}

}  // namespace

Instance::Instance(Arena& arena, const ClassInfo& info)
    : CMPIInstance{this, &instanceTable}, arena_(&arena), class_(&info) {
  const std::size_t declared = info.properties().size();
  positions_ = arena.array<std::uint16_t>(declared);
  std::fill_n(positions_, declared, std::uint16_t{0});
}

Instance* Instance::create(Arena& arena, const ObjectPath& path) {
  if (path.classInfo() == nullptr) {
    return nullptr;
  }
  auto* const instance = arena.make<Instance>(arena, *path.classInfo());
  instance->path_ = path.copyTo(arena);
  instance->adoptKeys();
  return instance;
}

Instance* Instance::from(const CMPIInstance* handle) {
  return objectBehind<Instance>(handle, instanceTable);
}

const NamedValue* Instance::find(std::string_view name) const {
  const PropertyInfo* const property = class_->find(name);
  return property == nullptr ? nullptr : at(property->index);
}

NamedValue& Instance::slotFor(const PropertyInfo& property) {
  std::uint16_t& position = positions_[property.index];
  if (position != 0) {
    return properties_[position - 1];
  }
  if (count_ == capacity_) {
    constexpr std::uint32_t first = 16;
    const auto declared = static_cast<std::uint32_t>(class_->properties().size());
    const std::uint32_t capacity = std::min(declared, capacity_ == 0 ? first : capacity_ * 2);
    auto* const properties = arena_->array<NamedValue>(capacity);
    std::copy_n(properties_, count_, properties);
    properties_ = properties;
    capacity_ = capacity;
  }
  NamedValue& slot = properties_[count_++];
  slot.name = property.name;
  slot.data = nullData(property.type);
  position = static_cast<std::uint16_t>(count_);
  return slot;
}

CMPIrc Instance::setProperty(std::string_view name, const CMPIValue* value, CMPIType type) {
  const PropertyInfo* const property = class_->find(name);
  if (property == nullptr) {
    return CMPI_RC_ERR_NO_SUCH_PROPERTY;
  }
  if (type != CMPI_null && keptType(type) != property->type) {
    const bool exists = isSimpleType(static_cast<CMPIType>(type & ~CMPI_ARRAY));
    return exists ? CMPI_RC_ERR_TYPE_MISMATCH : CMPI_RC_ERR_INVALID_DATA_TYPE;
  }
  if (allowed_ != nullptr && !allowed_[property->index]) {
    return CMPI_RC_OK;
  }
  CMPIData data{};
  const CMPIrc code = makeData(*arena_, value, type, data);
  if (code != CMPI_RC_OK) {
    return code;
  }
  data.type = property->type;
  slotFor(*property).data = data;
  if (property->isKey && !isNull(data)) {
    const NamedValue* const key = path_->find(property->name);
    if (key == nullptr || !sameValue(key->data, data)) {
      return path_->addKey(property->name, &data.value, data.type);
    }
  }
  return CMPI_RC_OK;
}

void Instance::adoptKeys() {
  for (const NamedValue& key : path_->keys()) {
    const PropertyInfo* const property = class_->find(key.name);
    if (property != nullptr && property->isKey && property->type == key.data.type) {
      CMPIData& data = slotFor(*property).data;
      data = copyData(*arena_, key.data);
      data.state = CMPI_goodValue;
    }
  }
}

CMPIrc Instance::setPath(const ObjectPath& path) {
  if (path.classInfo() != class_) {
    return CMPI_RC_ERR_INVALID_PARAMETER;
  }
  path_ = path.copyTo(*arena_);
  adoptKeys();
  return CMPI_RC_OK;
}

void Instance::setFilter(std::span<const std::string_view> names) {
  const auto declared = class_->properties();
  allowed_ = arena_->array<bool>(declared.size());
  std::transform(declared.begin(), declared.end(), allowed_, [names](const PropertyInfo& property) {
    return property.isKey || isListed(names, property.name);
  });
}

void Instance::restrictTo(std::span<const std::string_view> names) {
  setFilter(names);
  std::fill_n(positions_, class_->properties().size(), std::uint16_t{0});
  const std::uint32_t before = count_;
  count_ = 0;
  for (std::uint32_t position = 0; position < before; ++position) {
    const PropertyInfo* const property = class_->find(properties_[position].name);
    if (allowed_[property->index]) {
      properties_[count_++] = properties_[position];
      positions_[property->index] = static_cast<std::uint16_t>(count_);
    }
  }
}

Instance* Instance::copyTo(Arena& arena) const {
  auto* const copy = arena.make<Instance>(arena, *class_);
  copy->path_ = path_->copyTo(arena);
  std::copy_n(positions_, class_->properties().size(), copy->positions_);
  if (allowed_ != nullptr) {
    copy->allowed_ = arena.array<bool>(class_->properties().size());
    std::copy_n(allowed_, class_->properties().size(), copy->allowed_);
  }
  copy->properties_ = arena.array<NamedValue>(count_);
  copy->count_ = count_;
  copy->capacity_ = count_;
  std::transform(properties_, properties_ + count_, copy->properties_, [&](const NamedValue& property) {
    return NamedValue{property.name, copyData(arena, property.data)};  // names are the class's own
  });
  return copy;
}

}  // namespace cimom
