// The broker's own table of classes, made once from a `ClassModel` for look-ups that cost nanoseconds.
//
// Immutable after construction: any number of threads may read it.
#pragma once

#include <cimom/Names.h>
#include <cimom/broker/ClassModel.h>
#include <cmpi/cmpidt.h>

#include <cstddef>
#include <cstdint>
#include <memory>
#include <span>
#include <string>
#include <string_view>
#include <vector>

namespace cimom {

class Arena;
class String;
class ClassInfo;

/// Finds one of a fixed list of names, whatever their case.
class NameIndex {
 public:
  static constexpr std::size_t none = static_cast<std::size_t>(-1);

  /// Keeps the views: the texts must outlive the index. Of equal names the first counts.
  void build(std::vector<std::string_view> names);
  [[nodiscard]] std::size_t find(std::string_view name) const;

 private:
  [[nodiscard]] static std::size_t hash(std::string_view name);

  std::vector<std::string_view> names_;
  std::vector<std::uint32_t> slots_;  // open addressing: position in names_ + 1, 0 for free
};

struct PropertyInfo {
  std::string_view name;  ///< as declared
  String* nameString;     ///< the same, as CMPI hands it out
  CMPIType type;
  bool isKey;
  std::uint16_t index;  ///< position among the class's properties
};

class ClassInfo {
 public:
  [[nodiscard]] std::string_view name() const;
  [[nodiscard]] String* nameString() const { return nameString_; }
  [[nodiscard]] const ClassInfo* superClass() const { return superClass_; }
  /// This class or one below it.
  [[nodiscard]] bool isA(const ClassInfo& ancestor) const;
  [[nodiscard]] std::span<const PropertyInfo> properties() const { return properties_; }
  /// Indexes into `properties()`.
  [[nodiscard]] std::span<const std::uint16_t> keys() const { return keys_; }
  /// Null where the class declares no such property.
  [[nodiscard]] const PropertyInfo* find(std::string_view propertyName) const;

 private:
  friend class ClassTable;

  String* nameString_ = nullptr;
  const ClassInfo* superClass_ = nullptr;
  std::vector<PropertyInfo> properties_;
  std::vector<std::uint16_t> keys_;
  NameIndex index_;
};

class ClassTable {
 public:
  /// Throws `std::invalid_argument` where the model contradicts itself: a superclass that is no class,
  /// ancestry in a circle, more properties than a class can have.
  explicit ClassTable(const ClassModel& model);
  ~ClassTable();
  ClassTable(const ClassTable&) = delete;
  ClassTable& operator=(const ClassTable&) = delete;

  /// Null for a name that is no class.
  [[nodiscard]] const ClassInfo* find(std::string_view className) const;
  /// False also where one of them is no class; a name is always the same class as itself.
  [[nodiscard]] bool isA(std::string_view className, std::string_view ancestor) const;
  [[nodiscard]] String* emptyString() const { return emptyString_; }

 private:
  void fill(ClassInfo& info, const ClassDeclaration& declaration);
  void connect(const std::vector<ClassDeclaration>& declarations);
  void checkAncestry() const;

  std::unique_ptr<Arena> arena_;
  std::vector<std::unique_ptr<ClassInfo>> classes_;
  NameIndex index_;
  String* emptyString_ = nullptr;
};

}  // namespace cimom
