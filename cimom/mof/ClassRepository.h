// The classes that a schema declares, with what each inherits.
//
// Compiling adds to the repository, one file or text after the other; a superclass comes before its
// subclasses. From then on it is only read, and may be read from any number of threads. References and
// pointers that it hands out live as long as the repository.
#pragma once

#include <cimom/Names.h>
#include <cimom/broker/ClassModel.h>
#include <cimom/mof/Declarations.h>
#include <cimom/mof/MofError.h>

#include <filesystem>
#include <memory>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

namespace cimom {

/// A class with everything that it inherits.
struct ClassInfo {
  mof::Class declared;                       ///< as the MOF text has it; `properties` are its own alone
  const ClassInfo* superclass = nullptr;     ///< nullptr: none
  std::vector<const ClassInfo*> subclasses;  ///< direct ones, in the order of declaration
  mof::Qualifiers qualifiers;                ///< in effect: its own and those inherited
  /// In effect: inherited ones first, in the order of their declaration, an override in the place of what it
  /// overrides, with its qualifiers over those inherited.
  std::vector<mof::Property> properties;
  std::vector<mof::Method> methods;  ///< in effect, likewise
  std::vector<std::size_t> keys;     ///< indices of the key properties in `properties`
  std::unordered_map<std::string_view, std::size_t, NameHash, NameEqual> propertyIndex;

  [[nodiscard]] const std::string& name() const { return declared.name; }
  [[nodiscard]] const mof::Property* property(std::string_view propertyName) const;  ///< or nullptr
  [[nodiscard]] bool isA(const ClassInfo& other) const;  ///< other is this class or an ancestor of it
  [[nodiscard]] bool isAssociation() const;
  [[nodiscard]] bool isAbstract() const;
};

class ClassRepository : public ClassModel {
 public:
  ClassRepository();
  ~ClassRepository() override;
  ClassRepository(ClassRepository&&) noexcept;
  ClassRepository& operator=(ClassRepository&&) noexcept;

  /// Compiles a file and what it includes, all within the file's folder. Throws `MofError`; what was declared
  /// before the error stays.
  void compileFile(const std::filesystem::path& file);

  /// Compiles a text; `fileName` is for messages. A text may include nothing. Throws `MofError`.
  void compileText(std::string_view text, std::string_view fileName);

  /// The class of this name, or nullptr.
  [[nodiscard]] const ClassInfo* find(std::string_view name) const;

  /// Every class, in the order of declaration.
  [[nodiscard]] const std::vector<const ClassInfo*>& all() const;

  /// The class and everything below it, each superclass before its subclasses.
  [[nodiscard]] std::vector<const ClassInfo*> withSubclasses(const ClassInfo& top) const;

  /// Whether `name` is `ancestor` or descends from it. False where either is unknown.
  [[nodiscard]] bool isA(std::string_view name, std::string_view ancestor) const;

  [[nodiscard]] const std::vector<mof::QualifierDeclaration>& qualifierDeclarations() const;

  /// Instances that the texts declare, checked against their classes.
  [[nodiscard]] const std::vector<mof::InstanceDeclaration>& instances() const;

 private:
  struct State;
  std::unique_ptr<State> state_;
};

}  // namespace cimom
