#include <cimom/broker/Objects.h>
#include <cimom/broker/Tables.h>
#include <cimom/broker/Values.h>

#include <algorithm>

namespace cimom {

ObjectPath::ObjectPath(Arena& arena, const ClassTable& classes)
    : CMPIObjectPath{this, &objectPathTable},
      arena_(&arena),
      classes_(&classes),
      nameSpace_(classes.emptyString()),
      className_(classes.emptyString()),
      hostName_(classes.emptyString()) {}

ObjectPath* ObjectPath::create(Arena& arena, const ClassTable& classes, std::string_view nameSpace,
                               std::string_view className) {
  auto* const path = arena.make<ObjectPath>(arena, classes);
  path->setClassName(className);
  path->setNameSpace(nameSpace);
  return path;
}

ObjectPath* ObjectPath::from(const CMPIObjectPath* handle) {
  return objectBehind<ObjectPath>(handle, objectPathTable);
}

const NamedValue* ObjectPath::find(std::string_view name) const {
  const auto all = keys();
  const auto found = std::find_if(all.begin(), all.end(),
                                  [name](const NamedValue& key) { return sameName(key.name, name); });
  return found == all.end() ? nullptr : &*found;
}

void ObjectPath::setNameSpace(std::string_view nameSpace) {
  nameSpace_ = nameSpace.empty() ? classes_->emptyString() : String::create(*arena_, nameSpace);
}

void ObjectPath::setHostName(std::string_view hostName) {
  hostName_ = hostName.empty() ? classes_->emptyString() : String::create(*arena_, hostName);
}

void ObjectPath::setClassName(std::string_view className) {
  class_ = classes_->find(className);
  className_ = class_ != nullptr ? class_->nameString() : String::create(*arena_, className);
}

void ObjectPath::makeRoom(std::uint32_t count) {
  if (count <= keyCapacity_) {
    return;
  }
  const std::uint32_t capacity = std::max(count, keyCount_ + 4);
  auto* const keys = arena_->array<NamedValue>(capacity);
  std::copy_n(keys_, keyCount_, keys);
  keys_ = keys;
  keyCapacity_ = capacity;
}

CMPIrc ObjectPath::addKey(std::string_view name, const CMPIValue* value, CMPIType type) {
  const bool cannotBeKey = (type & CMPI_ARRAY) != 0 || type == CMPI_instance || type == CMPI_null;
  if (cannotBeKey || !isSimpleType(type)) {
    return CMPI_RC_ERR_INVALID_DATA_TYPE;
  }
  CMPIData data{};
  const CMPIrc code = makeData(*arena_, value, type, data);
  if (code != CMPI_RC_OK) {
    return code;
  }
  if (name.empty() || isNull(data)) {
    return CMPI_RC_ERR_INVALID_PARAMETER;
  }
  data.state = CMPI_keyValue;
  if (const NamedValue* const present = find(name); present != nullptr) {
    const auto position = present - keys_;
    makeRoom(keyCount_);  // keys that another path shares stay as they are
    keys_[position].data = data;
    return CMPI_RC_OK;
  }
  const PropertyInfo* const declared = class_ == nullptr ? nullptr : class_->find(name);
  makeRoom(keyCount_ + 1);
  keys_[keyCount_++] = {declared != nullptr ? declared->name : arena_->copy(name), data};
  return CMPI_RC_OK;
}

void ObjectPath::clearKeys() {
  keys_ = nullptr;
  keyCount_ = 0;
  keyCapacity_ = 0;
}

ObjectPath* ObjectPath::copyTo(Arena& arena) const {
  auto* const copy = arena.make<ObjectPath>(arena, *classes_);
  copy->class_ = class_;
  copy->className_ = className_->in(arena);
  copy->nameSpace_ = nameSpace_->in(arena);
  copy->hostName_ = hostName_->in(arena);
  copy->keyCount_ = keyCount_;
  if (&arena == arena_) {
    copy->keys_ = keys_;
    keyCapacity_ = 0;
    return copy;
  }
  copy->keys_ = arena.array<NamedValue>(keyCount_);
  copy->keyCapacity_ = keyCount_;
  std::transform(keys_, keys_ + keyCount_, copy->keys_, [&](const NamedValue& key) {
    const PropertyInfo* const declared = class_ == nullptr ? nullptr : class_->find(key.name);
    return NamedValue{declared != nullptr ? declared->name : arena.copy(key.name), copyData(arena, key.data)};
  });
  return copy;
}

}  // namespace cimom
