#include <cimom/broker/Arena.h>
#include <cimom/broker/ClassTable.h>
#include <cimom/broker/Objects.h>

#include <cstring>
#include <limits>
#include <stdexcept>

namespace cimom {

namespace {

std::uint64_t load(const char* from, std::size_t size) {
  std::uint64_t bytes = 0;
  std::memcpy(&bytes, from, size);
  return bytes;
}

}  // namespace

// Length, the first eight bytes and the last eight tell the names of a schema apart well enough. Setting bit
// 5 folds the case of letters; that it makes some other characters equal only costs a comparison.
std::size_t NameIndex::hash(std::string_view name) {
  constexpr std::uint64_t fold = 0x2020202020202020U;
  constexpr std::uint64_t spread = 0x9e3779b97f4a7c15U;
  const std::size_t size = name.size();
  std::uint64_t head = 0;
  std::uint64_t tail = 0;
  if (size >= 8) {
    head = load(name.data(), 8);
    tail = load(name.data() + size - 8, 8);
  } else {
    head = load(name.data(), size);
  }
  const std::uint64_t mixed = ((head | fold) * spread) ^ (((tail | fold) + size) * 0xc2b2ae3d27d4eb4fU);
  return static_cast<std::size_t>((mixed * spread) >> 32U);
}

void NameIndex::build(std::vector<std::string_view> names) {
  names_ = std::move(names);
  std::size_t capacity = 4;
  while (capacity < names_.size() * 2) {
    capacity *= 2;
  }
  slots_.assign(capacity, 0);
  for (std::size_t position = 0; position < names_.size(); ++position) {
    if (find(names_[position]) != none) {
      continue;
    }
    std::size_t slot = hash(names_[position]) & (capacity - 1);
    while (slots_[slot] != 0) {
      slot = (slot + 1) & (capacity - 1);
    }
    slots_[slot] = static_cast<std::uint32_t>(position + 1);
  }
}

std::size_t NameIndex::find(std::string_view name) const {
  if (slots_.empty()) {
    return none;
  }
  const std::size_t mask = slots_.size() - 1;
  for (std::size_t slot = hash(name) & mask; slots_[slot] != 0; slot = (slot + 1) & mask) {
    const std::string_view candidate = names_[slots_[slot] - 1];
    if (candidate == name || sameName(candidate, name)) {
      return slots_[slot] - 1;
    }
  }
  return none;
}

std::string_view ClassInfo::name() const {
  return nameString_->view();
}

bool ClassInfo::isA(const ClassInfo& ancestor) const {
  for (const ClassInfo* info = this; info != nullptr; info = info->superClass_) {
    if (info == &ancestor) {
      return true;
    }
  }
  return false;
}

const PropertyInfo* ClassInfo::find(std::string_view propertyName) const {
  const std::size_t position = index_.find(propertyName);
  return position == NameIndex::none ? nullptr : &properties_[position];
}

ClassTable::ClassTable(const ClassModel& model) : arena_(std::make_unique<Arena>()) {
  emptyString_ = String::createShared(*arena_, {});
  std::vector<ClassDeclaration> declarations;
  for (const std::string& name : model.classNames()) {
    auto declaration = model.declaration(name);
    if (!declaration) {
      throw std::invalid_argument("class " + name + " is listed but not declared");
    }
    declarations.push_back(std::move(*declaration));
  }
  std::vector<std::string_view> names;
  for (const ClassDeclaration& declaration : declarations) {
    auto info = std::make_unique<ClassInfo>();
    fill(*info, declaration);
    names.push_back(info->name());
    classes_.push_back(std::move(info));
  }
  index_.build(std::move(names));
  connect(declarations);
  checkAncestry();
}

ClassTable::~ClassTable() = default;

void ClassTable::fill(ClassInfo& info, const ClassDeclaration& declaration) {
  info.nameString_ = String::createShared(*arena_, declaration.name);
  if (declaration.properties.size() >= std::numeric_limits<std::uint16_t>::max()) {
    throw std::invalid_argument("class " + declaration.name + " declares too many properties");
  }
  std::vector<std::string_view> names;
  for (const PropertyDeclaration& property : declaration.properties) {
    const auto index = static_cast<std::uint16_t>(info.properties_.size());
    String* const name = String::createShared(*arena_, property.name);
    info.properties_.push_back({name->view(), name, property.type, property.isKey, index});
    names.push_back(name->view());
    if (property.isKey) {
      info.keys_.push_back(index);
    }
  }
  info.index_.build(std::move(names));
}

void ClassTable::connect(const std::vector<ClassDeclaration>& declarations) {
  for (std::size_t position = 0; position < declarations.size(); ++position) {
    const ClassDeclaration& declaration = declarations[position];
    if (declaration.superClass.empty()) {
      continue;
    }
    const ClassInfo* const superClass = find(declaration.superClass);
    if (superClass == nullptr) {
      throw std::invalid_argument("class " + declaration.name + ": its superclass " + declaration.superClass +
                                  " is not declared");
    }
    classes_[position]->superClass_ = superClass;
  }
}

void ClassTable::checkAncestry() const {
  for (const auto& info : classes_) {
    std::size_t steps = 0;
    for (const ClassInfo* ancestor = info.get(); ancestor != nullptr; ancestor = ancestor->superClass_) {
      if (++steps > classes_.size()) {
        throw std::invalid_argument("class " + std::string(info->name()) + " is its own ancestor");
      }
    }
  }
}

const ClassInfo* ClassTable::find(std::string_view className) const {
  const std::size_t position = index_.find(className);
  return position == NameIndex::none ? nullptr : classes_[position].get();
}

bool ClassTable::isA(std::string_view className, std::string_view ancestor) const {
  const ClassInfo* const info = find(className);
  const ClassInfo* const above = find(ancestor);
  if (info == nullptr || above == nullptr) {
    return sameName(className, ancestor);
  }
  return info->isA(*above);
}

}  // namespace cimom
