#include <cimom/DeclaredInstances.h>
#include <cimom/KeyCheck.h>
#include <cimom/Names.h>
#include <cimom/broker/WbemUri.h>
#include <cimom/mof/Numbers.h>

#include <algorithm>
#include <cstddef>
#include <cstdint>

namespace cimom {

namespace {

/// What an integer, real, boolean or character of MOF is in CMPI. It fits `type`.
CMPIValue simpleValue(const mof::Scalar& scalar, CMPIType type) {
  CMPIValue result{};
  if (const auto* truth = std::get_if<bool>(&scalar))
    result.boolean = *truth ? 1 : 0;
  else if (const auto* character = std::get_if<CMPIChar16>(&scalar))
    result.char16 = *character;
  else if (const auto* real = std::get_if<double>(&scalar))
    type == CMPI_real32 ? void(result.real32 = static_cast<CMPIReal32>(*real)) : void(result.real64 = *real);
  else {
    const auto* signedNumber = std::get_if<std::int64_t>(&scalar);
    // The bits of a smaller number are the lowest ones of the largest.
    const std::uint64_t bits =
        signedNumber != nullptr ? static_cast<std::uint64_t>(*signedNumber) : std::get<std::uint64_t>(scalar);
    switch (type) {
      case CMPI_uint8:
      case CMPI_sint8:
        result.uint8 = static_cast<CMPIUint8>(bits);
        break;
      case CMPI_uint16:
      case CMPI_sint16:
        result.uint16 = static_cast<CMPIUint16>(bits);
        break;
      case CMPI_uint32:
      case CMPI_sint32:
        result.uint32 = static_cast<CMPIUint32>(bits);
        break;
      default:
        result.uint64 = bits;
    }
  }
  return result;
}

}  // namespace

/// Makes one instance after the other.
class DeclaredInstances::Builder {
 public:
  Builder(const ClassRepository& schema, const ClassTable& classes, DeclaredInstances& result)
      : schema_(schema), classes_(classes), result_(result) {}

  void add(const mof::InstanceDeclaration& declaration) {
    declaration_ = &declaration;
    const SchemaClass* const type = schema_.find(declaration.className);
    if (type == nullptr)
      fail("unknown class " + declaration.className + " of an instance");
    const ObjectPath& path =
        *ObjectPath::create(result_.arena_, classes_, declaration.nameSpace, declaration.className);
    instance_ = Instance::create(result_.arena_, path);
    for (const mof::Property& property : type->properties) {
      if (const mof::Value* value = valueOf(property); value != nullptr && !value->isNull())
        set(property, *value);
    }
    keep();
  }

 private:
  [[noreturn]] void fail(const std::string& message) const {
    throw MofError(declaration_->file, declaration_->line, message);
  }

  [[nodiscard]] const mof::Value* valueOf(const mof::Property& property) const {
    for (const auto& [name, value] : declaration_->values) {
      if (sameName(name, property.name))
        return &value;
    }
    return property.defaultValue ? &*property.defaultValue : nullptr;
  }

  void set(const mof::Property& property, const mof::Value& value) {
    property_ = &property;
    if (!property.isArray()) {
      with(value.elements.front(), property.type, [&](const CMPIValue* given, CMPIType type) {
        return instance_->setProperty(property.name, given, type);
      });
      return;
    }
    const auto simple = static_cast<CMPIType>(property.type & ~CMPI_ARRAY);
    Array* const array = Array::create(result_.arena_, value.elements.size(), simple);
    if (array == nullptr)
      failHere("cannot be an array of this size");
    for (std::size_t index = 0; index < value.elements.size(); ++index)
      with(value.elements[index], simple,
           [&](const CMPIValue* given, CMPIType type) { return array->set(index, given, type); });
    CMPIValue whole{};
    whole.array = array;
    check(instance_->setProperty(property.name, &whole, property.type));
  }

  /// Hands the value, as CMPI passes one, to `setter(value, type)`.
  template <class Setter>
  void with(const mof::Scalar& scalar, CMPIType type, const Setter& setter) {
    const auto fitting = mof::fitted(scalar, type);
    if (!fitting)
      failHere("has a value that does not fit its type");
    const auto* const text = std::get_if<std::string>(&*fitting);
    CMPIValue value{};
    if (std::holds_alternative<std::monostate>(*fitting)) {
      check(setter(nullptr, type));
    } else if (text == nullptr) {
      value = simpleValue(*fitting, type);
      check(setter(&value, type));
    } else if (type == CMPI_string) {
      check(setter(reinterpret_cast<const CMPIValue*>(text->c_str()), CMPI_chars));
    } else if (type == CMPI_dateTime) {
      value.dateTime = DateTime::create(result_.arena_, *text);
      if (value.dateTime == nullptr)
        failHere("is no datetime: '" + *text + "'");
      check(setter(&value, type));
    } else {
      value.ref = reference(*text);
      check(setter(&value, type));
    }
  }

  [[nodiscard]] ObjectPath* reference(const std::string& text) {
    if (text.starts_with('$')) {
      const auto found = aliases_.find(text);
      if (found == aliases_.end())
        failHere("is " + text + ", which no instance before this one is declared as");
      return found->second->path().copyTo(result_.arena_);
    }
    try {
      ObjectPath* const path = parseWbemUri(result_.arena_, classes_, text, declaration_->nameSpace);
      if (path->classInfo() == nullptr)
        failHere("refers to an unknown class " + std::string(path->className()));
      return path;
    } catch (const WbemUriError& error) {
      failHere("is no object path: " + std::string(error.what()));
    }
  }

  void keep() {
    DeclaredInstance made{instance_, nullptr};
    if (const Status status = checkKeys(instance_->path(), instance_->classInfo()); status.code != CMPI_RC_OK)
      fail("an instance cannot be declared so: " + status.description);
    for (const NamedValue& property : instance_->properties()) {
      const ObjectPath* const end = objectPath(property.data);
      if (end == nullptr || !end->keys().empty())
        continue;
      if (made.pattern != nullptr)
        fail("only one reference of an association may be a class; " + std::string(property.name) +
             " is the second");
      made.pattern = &property;
    }
    for (const DeclaredInstance& other : result_.all_) {
      if (sameName(other.nameSpace(), made.nameSpace()) &&
          samePath(other.instance->path(), instance_->path()))
        fail("the instance is declared already: " + formatWbemUri(instance_->path()));
    }
    result_.all_.push_back(made);
    if (!declaration_->alias.empty())
      aliases_.insert_or_assign(declaration_->alias, instance_);
  }

  void check(CMPIrc code) const {
    if (code != CMPI_RC_OK)
      failHere("cannot be set: status " + std::to_string(code));
  }

  [[noreturn]] void failHere(const std::string& what) const {
    fail("property " + property_->name + " of an instance of " + declaration_->className + " " + what);
  }

  const ClassRepository& schema_;
  const ClassTable& classes_;
  DeclaredInstances& result_;
  std::map<std::string, const Instance*> aliases_;
  const mof::InstanceDeclaration* declaration_ = nullptr;
  const mof::Property* property_ = nullptr;
  Instance* instance_ = nullptr;
};

DeclaredInstances::DeclaredInstances(const ClassRepository& schema, const ClassTable& classes,
                                     std::span<const mof::InstanceDeclaration> declarations) {
  Builder builder(schema, classes, *this);
  for (const mof::InstanceDeclaration& each : declarations)
    builder.add(each);
}

}  // namespace cimom
