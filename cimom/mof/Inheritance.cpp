#include <cimom/Names.h>
#include <cimom/mof/Inheritance.h>
#include <cimom/mof/Numbers.h>

#include <algorithm>
#include <array>
#include <utility>

namespace cimom::mof {

namespace {

/// More features than any real class has; a bound on what a hostile text can make of memory.
constexpr std::size_t mostFeatures = 4096;

/// Where a complaint points at.
struct Place {
  std::string_view file;
  int line;
};

[[noreturn]] void fail(const Place& place, const std::string& message) {
  throw MofError(place.file, place.line, message);
}

/// The value with each element as `type` has it.
void fit(Value& value, CMPIType type, const Place& place, const std::string& what) {
  const bool wantsArray = (type & CMPI_ARRAY) != 0;
  if (!value.isNull() && value.isArray != wantsArray)
    fail(place,
         what + (wantsArray ? " must be an array: put it in braces" : " must be one value, not an array"));
  for (Scalar& element : value.elements) {
    auto fitting = fitted(element, static_cast<CMPIType>(type & ~CMPI_ARRAY));
    if (!fitting)
      fail(place, what + " has a value that does not fit its type");
    element = std::move(*fitting);
  }
}

void checkQualifiers(Qualifiers& qualifiers, const Declared& known, const Place& place) {
  for (Qualifier& each : qualifiers) {
    const QualifierDeclaration* declaration = known.findQualifierDeclaration(each.name);
    if (declaration == nullptr)
      fail(place, "unknown qualifier '" + each.name + "'; declare it before its use");
    // Written without a value, it is true if it can be; else it has the declared default.
    if (each.value == Value{false, {Scalar(true)}} && declaration->type != CMPI_boolean)
      each.value = declaration->defaultValue.value_or(Value{false, {Scalar()}});
    fit(each.value, declaration->type, place, "qualifier " + each.name);
  }
}

/// The declaration of a qualifier that subclasses inherit; nullptr for any other.
const QualifierDeclaration* inheritable(const Qualifier& qualifier, const Declared& known) {
  const QualifierDeclaration* declaration = known.findQualifierDeclaration(qualifier.name);
  return declaration != nullptr && declaration->toSubclass() ? declaration : nullptr;
}

/// The qualifiers in effect where `own` stand over `inherited`.
Qualifiers merged(const Qualifiers& inherited, const Qualifiers& own, const Declared& known,
                  const Place& place) {
  Qualifiers result;
  for (const Qualifier& each : inherited) {
    const QualifierDeclaration* declaration = inheritable(each, known);
    if (declaration == nullptr)
      continue;
    const Qualifier* over = findQualifier(own, each.name);
    const auto& flavors = declaration->flavors;
    const bool fixed = std::any_of(flavors.begin(), flavors.end(), [](const std::string& flavor) {
      return sameName(flavor, "DisableOverride");
    });
    if (over != nullptr && fixed && over->value != each.value)
      fail(place, "qualifier " + each.name + " must stay as it is inherited: it cannot be overridden");
    if (over == nullptr)
      result.push_back(each);
  }
  result.insert(result.end(), own.begin(), own.end());
  return result;
}

/// Merges one class with its superclass.
class Merge {
 public:
  Merge(Class declared, const Declared& known) : known_(known) { result_.declared = std::move(declared); }

  SchemaClass run() {
    Class& own = result_.declared;
    if (known_.findClass(own.name) != nullptr) {
      const Class& earlier = known_.findClass(own.name)->declared;
      fail(here(), "class " + own.name + " is declared already, at " + earlier.file + ":" +
                       std::to_string(earlier.line));
    }
    inheritAll();
    checkQualifiers(own.qualifiers, known_, here());
    result_.qualifiers = result_.superclass == nullptr
                             ? own.qualifiers
                             : merged(result_.superclass->qualifiers, own.qualifiers, known_, here());
    for (std::size_t index = 0; index < own.properties.size(); ++index)
      addProperty(index);
    for (Method& method : own.methods)
      addMethod(method);
    if (result_.properties.size() + result_.methods.size() > mostFeatures)
      fail(here(), "class " + own.name + " has more than " + std::to_string(mostFeatures) +
                       " properties and methods");
    return std::move(result_);
  }

 private:
  [[nodiscard]] Place here() const { return {result_.declared.file, result_.declared.line}; }

  void inheritAll() {
    const Class& own = result_.declared;
    if (own.superclass.empty())
      return;
    result_.superclass = known_.findClass(own.superclass);
    if (result_.superclass == nullptr)
      fail(here(), "unknown superclass " + own.superclass + " of class " + own.name +
                       "; a superclass comes before its subclasses");
    result_.properties = result_.superclass->properties;
    result_.methods = result_.superclass->methods;
    for (Property& each : result_.properties)
      dropOwnOnly(each.qualifiers);
    for (Method& each : result_.methods)
      dropOwnOnly(each.qualifiers);
  }

  /// Leaves those that subclasses inherit.
  void dropOwnOnly(Qualifiers& qualifiers) const {
    std::erase_if(qualifiers, [this](const Qualifier& each) { return inheritable(each, known_) == nullptr; });
  }

  void addProperty(std::size_t index) {
    auto& properties = result_.declared.properties;
    Property& own = properties[index];
    const Place place{result_.declared.file, own.line};
    const auto sameAsOwn = [&own](const Property& each) { return sameName(each.name, own.name); };
    const auto upToHere = properties.begin() + static_cast<std::ptrdiff_t>(index);
    if (std::any_of(properties.begin(), upToHere, sameAsOwn))
      fail(place, "property " + own.name + " is declared twice in class " + result_.name());
    checkQualifiers(own.qualifiers, known_, place);
    if (own.defaultValue)
      fit(*own.defaultValue, own.type, place, "property " + own.name);
    const auto inherited = std::find_if(result_.properties.begin(), result_.properties.end(), sameAsOwn);
    checkOverrideName(own.qualifiers, own.name, inherited != result_.properties.end(), place);
    checkKey(own, place);
    if (inherited == result_.properties.end()) {
      result_.properties.push_back(own);
      return;
    }
    override(*inherited, own, place);
  }

  /// Keys are settled where a hierarchy first has some: a subclass can add none.
  void checkKey(const Property& own, const Place& place) const {
    if (!own.key || result_.superclass == nullptr)
      return;
    const mof::Property* inherited = result_.superclass->property(own.name);
    const auto keys = result_.superclass->keys();
    if (!keys.empty() && (inherited == nullptr || !inherited->key))
      fail(place, "property " + own.name + " cannot be a key: class " + result_.superclass->name() +
                      " has its keys already");
  }

  void override(Property& inherited, const Property& own, const Place& place) {
    if (own.type != inherited.type)
      fail(place, "property " + own.name + " overrides one of another type");
    if (own.isReference() && !refersWithin(own.referenceClass, inherited.referenceClass))
      fail(place, "type mismatch: reference " + own.name + " must stay with class " +
                      inherited.referenceClass + " or one below it, not " + own.referenceClass);
    Property over = own;
    over.origin = inherited.origin;
    over.qualifiers = merged(inherited.qualifiers, own.qualifiers, known_, place);
    over.key = isTrue(over.qualifiers, "Key");
    if (!over.defaultValue)
      over.defaultValue = inherited.defaultValue;
    inherited = std::move(over);
  }

  /// Also within a class that is being declared: an association may refer to itself.
  [[nodiscard]] bool refersWithin(const std::string& name, const std::string& ancestor) const {
    if (sameName(name, ancestor))
      return true;
    const SchemaClass* own = sameName(name, result_.name()) ? &result_ : known_.findClass(name);
    const SchemaClass* top = known_.findClass(ancestor);
    return own != nullptr && top != nullptr && own->isA(*top);
  }

  static void checkOverrideName(const Qualifiers& qualifiers, const std::string& name, bool inherited,
                                const Place& place) {
    const std::string_view overridden = textOf(qualifiers, "Override");
    if (overridden.empty())
      return;
    if (!sameName(overridden, name) || !inherited)
      fail(place,
           name + " overrides " + std::string(overridden) + ", which is not inherited under that name");
  }

  void addMethod(Method& own) {
    checkQualifiers(own.qualifiers, known_, here());
    for (Parameter& parameter : own.parameters)
      checkQualifiers(parameter.qualifiers, known_, here());
    const auto inherited = std::find_if(result_.methods.begin(), result_.methods.end(),
                                        [&own](const Method& each) { return sameName(each.name, own.name); });
    const bool isInherited = inherited != result_.methods.end();
    if (isInherited && inherited->origin == result_.name())
      fail(here(), "method " + own.name + " is declared twice in class " + result_.name());
    checkOverrideName(own.qualifiers, own.name, isInherited, here());
    if (!isInherited) {
      result_.methods.push_back(own);
      return;
    }
    Method over = own;
    over.qualifiers = merged(inherited->qualifiers, own.qualifiers, known_, here());
    *inherited = std::move(over);
  }

  const Declared& known_;
  SchemaClass result_;
};

}  // namespace

SchemaClass inEffect(Class declared, const Declared& known) {
  return Merge(std::move(declared), known).run();
}

void checkInstance(const InstanceDeclaration& instance, const Declared& known) {
  const Place place{instance.file, instance.line};
  const SchemaClass* type = known.findClass(instance.className);
  if (type == nullptr)
    fail(place, "unknown class " + instance.className + " of an instance");
  if (type->isAbstract())
    fail(place, "class " + type->name() + " is abstract: it has no instances");
  for (auto each = instance.values.begin(); each != instance.values.end(); ++each) {
    const Property* property = type->property(each->first);
    if (property == nullptr)
      fail(place, "class " + type->name() + " has no property " + each->first);
    const bool twice = std::any_of(instance.values.begin(), each,
                                   [each](const auto& one) { return sameName(one.first, each->first); });
    if (twice)
      fail(place, "property " + each->first + " is there twice in an instance of " + type->name());
    Value value = each->second;
    fit(value, property->type, place, "property " + each->first);
  }
}

void checkQualifierDeclaration(const QualifierDeclaration& declaration, std::string_view file) {
  constexpr std::array known = {"EnableOverride", "DisableOverride", "ToSubclass",
                                "Restricted",     "ToInstance",      "Translatable"};
  const Place place{file, declaration.line};
  for (const std::string& flavor : declaration.flavors) {
    if (std::none_of(known.begin(), known.end(),
                     [&flavor](const char* each) { return sameName(each, flavor); }))
      fail(place, "unknown flavor '" + flavor + "' of qualifier " + declaration.name);
  }
  if (declaration.defaultValue) {
    Value value = *declaration.defaultValue;
    fit(value, declaration.type, place, "the default of qualifier " + declaration.name);
  }
}

}  // namespace cimom::mof
