// The classes that a schema declares, with what each inherits.
//
// Compiling adds to the repository, one file or text after the other; a superclass comes before its
// subclasses, a qualifier's declaration before its use. From then on the repository is only read, and may be
// read from any number of threads. References and pointers that it hands out live as long as the repository.
#pragma once

#include <cimom/broker/ClassModel.h>
#include <cimom/mof/Declarations.h>
#include <cimom/mof/MofError.h>

#include <filesystem>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace cimom {

/// A class with everything that it inherits.
struct SchemaClass {
  mof::Class declared;                         ///< as the MOF text has it: its own features alone
  const SchemaClass* superclass = nullptr;     ///< nullptr: none
  std::vector<const SchemaClass*> subclasses;  ///< direct ones, in the order of declaration
  mof::Qualifiers qualifiers;                  ///< in effect: its own and those inherited
  /// In effect: inherited ones first, in the order of their declaration, an override in the place of what it
  /// overrides, with its qualifiers over those inherited and its default, if it has one.
  std::vector<mof::Property> properties;
  std::vector<mof::Method> methods;  ///< in effect, likewise

  [[nodiscard]] const std::string& name() const { return declared.name; }
  [[nodiscard]] const mof::Property* property(std::string_view propertyName) const;  ///< or nullptr
  [[nodiscard]] std::vector<const mof::Property*> keys() const;
  [[nodiscard]] bool isA(const SchemaClass& ancestor) const;  ///< this class, or one below the ancestor
  [[nodiscard]] bool isAssociation() const;
  [[nodiscard]] bool isAbstract() const;
};

class ClassRepository : public ClassModel {
 public:
  ClassRepository();
  ~ClassRepository() override;
  ClassRepository(ClassRepository&&) noexcept;
  ClassRepository& operator=(ClassRepository&&) noexcept;

  /// Compiles a file and what it includes, all within the file's folder; a file that was compiled before adds
  /// nothing. Throws `MofError`; what was declared before the error stays.
  void compileFile(const std::filesystem::path& file);

  /// Compiles a text; `fileName` is for messages. A text may include nothing. Throws `MofError`.
  void compileText(std::string_view text, std::string_view fileName);

  /// To be called after the last text: every class that a reference names must be declared by now. Throws
  /// `MofError`.
  void checkReferences() const;

  /// The class of this name, or nullptr.
  [[nodiscard]] const SchemaClass* find(std::string_view name) const;

  /// Every class, in the order of declaration.
  [[nodiscard]] const std::vector<const SchemaClass*>& all() const;

  /// The class and everything below it, each superclass before its subclasses.
  [[nodiscard]] static std::vector<const SchemaClass*> withSubclasses(const SchemaClass& top);

  /// Whether `name` is `ancestor` or descends from it. False where either is unknown.
  [[nodiscard]] bool isA(std::string_view name, std::string_view ancestor) const;

  /// The declaration of this qualifier, or nullptr.
  [[nodiscard]] const mof::QualifierDeclaration* qualifier(std::string_view name) const;

  /// Instances that the texts declare, their properties checked against their classes.
  [[nodiscard]] const std::vector<mof::InstanceDeclaration>& instances() const;

  [[nodiscard]] std::vector<std::string> classNames() const override;
  [[nodiscard]] std::optional<ClassDeclaration> declaration(std::string_view className) const override;

 private:
  struct State;
  std::unique_ptr<State> state_;
};

}  // namespace cimom
