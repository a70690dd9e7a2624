#include <cimom/Names.h>
#include <cimom/mof/ClassRepository.h>
#include <cimom/mof/Inheritance.h>
#include <cimom/mof/Parser.h>

#include <algorithm>
#include <fstream>
#include <set>
#include <unordered_map>

namespace cimom {

namespace {

// Bounds beyond what any schema needs (the largest published one has under 2000 classes in as many files).
constexpr std::uintmax_t largestFile = 16U << 20U;
constexpr std::size_t mostFiles = 8192;
constexpr int deepestInclude = 16;
constexpr std::size_t mostFeaturesInAll = 1'000'000;

std::string readFile(const std::filesystem::path& file) {
  std::error_code error;
  const std::uintmax_t size = std::filesystem::file_size(file, error);
  if (error)
    throw MofError(file.string(), 0, "cannot be read: " + error.message());
  if (size > largestFile)
    throw MofError(file.string(), 0, "is larger than " + std::to_string(largestFile) + " bytes");
  std::ifstream stream(file, std::ios::binary);
  std::string text(static_cast<std::size_t>(size), '\0');
  stream.read(text.data(), static_cast<std::streamsize>(text.size()));
  if (!stream)
    throw MofError(file.string(), 0, "cannot be read to its end");
  return text;
}

bool isWithin(const std::filesystem::path& file, const std::filesystem::path& folder) {
  const auto [end, ignored] = std::mismatch(folder.begin(), folder.end(), file.begin(), file.end());
  return end == folder.end();
}

}  // namespace

const mof::Property* SchemaClass::property(std::string_view propertyName) const {
  const auto found = std::find_if(properties.begin(), properties.end(), [propertyName](const auto& each) {
    return sameName(each.name, propertyName);
  });
  return found == properties.end() ? nullptr : &*found;
}

std::vector<const mof::Property*> SchemaClass::keys() const {
  std::vector<const mof::Property*> result;
  for (const mof::Property& each : properties) {
    if (each.key)
      result.push_back(&each);
  }
  return result;
}

bool SchemaClass::isA(const SchemaClass& ancestor) const {
  for (const SchemaClass* each = this; each != nullptr; each = each->superclass) {
    if (each == &ancestor)
      return true;
  }
  return false;
}

bool SchemaClass::isAssociation() const {
  return mof::isTrue(qualifiers, "Association");
}

bool SchemaClass::isAbstract() const {
  return mof::isTrue(qualifiers, "Abstract");
}

struct ClassRepository::State : mof::Declared {
  std::vector<std::unique_ptr<SchemaClass>> owned;
  std::vector<const SchemaClass*> classes;
  std::unordered_map<std::string, SchemaClass*, NameHash, NameEqual> byName;
  std::unordered_map<std::string, mof::QualifierDeclaration, NameHash, NameEqual> qualifiers;
  std::vector<mof::InstanceDeclaration> instances;
  std::set<std::filesystem::path> files;
  std::size_t features = 0;

  /// Where a text comes from: what it may include, and how deep that is already.
  struct Origin {
    std::filesystem::path top;     ///< empty: nothing may be included
    std::filesystem::path folder;  ///< of the including file
    int depth = 0;
  };

  [[nodiscard]] const SchemaClass* findClass(std::string_view name) const override {
    const auto found = byName.find(name);
    return found == byName.end() ? nullptr : found->second;
  }

  [[nodiscard]] const mof::QualifierDeclaration* findQualifierDeclaration(
      std::string_view name) const override {
    const auto found = qualifiers.find(name);
    return found == qualifiers.end() ? nullptr : &found->second;
  }

  void compile(std::string_view text, std::string_view fileName, const Origin& origin) {
    mof::Parser parser(text, fileName);
    for (;;) {
      mof::Declaration declaration = parser.next();
      if (std::holds_alternative<mof::End>(declaration))
        return;
      if (auto* include = std::get_if<mof::Include>(&declaration))
        this->include(*include, fileName, origin);
      else if (auto* type = std::get_if<mof::Class>(&declaration))
        add(std::move(*type));
      else if (auto* qualifier = std::get_if<mof::QualifierDeclaration>(&declaration))
        add(std::move(*qualifier), fileName);
      else if (auto* instance = std::get_if<mof::InstanceDeclaration>(&declaration))
        add(std::move(*instance));
    }
  }

  void compileOnce(const std::filesystem::path& file, const Origin& origin) {
    if (files.contains(file))
      return;
    if (files.size() >= mostFiles)
      throw MofError(file.string(), 0, "is one file more than the " + std::to_string(mostFiles) + " allowed");
    files.insert(file);
    compile(readFile(file), file.string(), origin);
  }

  void include(const mof::Include& include, std::string_view fileName, const Origin& origin) {
    if (origin.top.empty())
      throw MofError(fileName, include.line, "a text that is no file cannot include '" + include.file + "'");
    if (origin.depth >= deepestInclude)
      throw MofError(fileName, include.line, "files include each other too deeply");
    std::error_code error;
    const auto file = std::filesystem::canonical(origin.folder / include.file, error);
    if (error)
      throw MofError(fileName, include.line,
                     "included file '" + include.file + "' cannot be read: " + error.message());
    if (!isWithin(file, origin.top))
      throw MofError(fileName, include.line,
                     "included file '" + include.file + "' lies outside of folder " + origin.top.string());
    compileOnce(file, {origin.top, file.parent_path(), origin.depth + 1});
  }

  void add(mof::Class&& declared) {
    auto made = std::make_unique<SchemaClass>(mof::inEffect(std::move(declared), *this));
    features += made->properties.size() + made->methods.size() + 1;
    if (features > mostFeaturesInAll)
      throw MofError(made->declared.file, made->declared.line,
                     "the schema is too large: more than " + std::to_string(mostFeaturesInAll) + " features");
    if (made->superclass != nullptr)
      byName.find(made->superclass->name())->second->subclasses.push_back(made.get());
    classes.push_back(made.get());
    byName.emplace(made->name(), made.get());
    owned.push_back(std::move(made));
  }

  void add(mof::QualifierDeclaration&& declared, std::string_view fileName) {
    mof::checkQualifierDeclaration(declared, fileName);
    if (qualifiers.contains(declared.name))
      throw MofError(fileName, declared.line, "qualifier " + declared.name + " is declared already");
    std::string name = declared.name;
    qualifiers.emplace(std::move(name), std::move(declared));
  }

  void add(mof::InstanceDeclaration&& declared) {
    mof::checkInstance(declared, *this);
    instances.push_back(std::move(declared));
  }
};

ClassRepository::ClassRepository() : state_(std::make_unique<State>()) {}
ClassRepository::~ClassRepository() = default;
ClassRepository::ClassRepository(ClassRepository&&) noexcept = default;
ClassRepository& ClassRepository::operator=(ClassRepository&&) noexcept = default;

void ClassRepository::compileFile(const std::filesystem::path& file) {
  std::error_code error;
  const auto whole = std::filesystem::canonical(file, error);
  if (error)
    throw MofError(file.string(), 0, "cannot be read: " + error.message());
  state_->compileOnce(whole, {whole.parent_path(), whole.parent_path(), 0});
}

void ClassRepository::compileText(std::string_view text, std::string_view fileName) {
  state_->compile(text, fileName, {});
}

void ClassRepository::checkReferences() const {
  for (const SchemaClass* each : state_->classes) {
    for (const mof::Property& property : each->declared.properties) {
      if (property.isReference() && find(property.referenceClass) == nullptr)
        throw MofError(each->declared.file, property.line,
                       "reference " + property.name + " is to an unknown class " + property.referenceClass);
    }
  }
}

const SchemaClass* ClassRepository::find(std::string_view name) const {
  return state_->findClass(name);
}

const std::vector<const SchemaClass*>& ClassRepository::all() const {
  return state_->classes;
}

std::vector<const SchemaClass*> ClassRepository::withSubclasses(const SchemaClass& top) {
  std::vector<const SchemaClass*> result{&top};
  for (std::size_t index = 0; index < result.size(); ++index)
    result.insert(result.end(), result[index]->subclasses.begin(), result[index]->subclasses.end());
  return result;
}

bool ClassRepository::isA(std::string_view name, std::string_view ancestor) const {
  const SchemaClass* own = find(name);
  const SchemaClass* top = find(ancestor);
  return own != nullptr && top != nullptr && own->isA(*top);
}

const mof::QualifierDeclaration* ClassRepository::qualifier(std::string_view name) const {
  return state_->findQualifierDeclaration(name);
}

const std::vector<mof::InstanceDeclaration>& ClassRepository::instances() const {
  return state_->instances;
}

std::vector<std::string> ClassRepository::classNames() const {
  std::vector<std::string> names;
  for (const SchemaClass* each : state_->classes)
    names.push_back(each->name());
  return names;
}

std::optional<ClassDeclaration> ClassRepository::declaration(std::string_view className) const {
  const SchemaClass* found = find(className);
  if (found == nullptr)
    return std::nullopt;
  ClassDeclaration result{found->name(), found->superclass == nullptr ? "" : found->superclass->name(), {}};
  for (const mof::Property& each : found->properties)
    result.properties.push_back({each.name, each.type, each.key});
  return result;
}

}  // namespace cimom
