// The objects behind CMPI handles: strings, arrays, datetimes, object paths, instances. Providers reach them
// through the function tables of CMPI; the object manager and its users through the members here.
//
// Lifetime: an object lives in an `Arena`, and with it. What a getter returns lives as long as the object
// that was asked, or until it is changed. `clone()` of the CMPI tables gives a deep copy with an arena of its
// own, which lives until `release()`; releasing anything else does nothing. All of them refer to the
// `ClassTable` that they were made with, which must outlive them. Threads: an object is used by one thread at
// a time; several may read it while none changes it. Names ignore case; where the class is known they come
// out as the class spells them.
#pragma once

#include <cimom/broker/Arena.h>
#include <cimom/broker/ClassTable.h>
#include <cmpi/cmpidt.h>
#include <cmpi/cmpift.h>

#include <cstddef>
#include <cstdint>
#include <memory>
#include <optional>
#include <span>
#include <string_view>

namespace cimom {

class ObjectPath;
class Instance;

/// A key, a property, a context entry or an argument. Every handle in `data` is one of this file's objects.
struct NamedValue {
  std::string_view name;
  CMPIData data;
};

// --- Reading values. Each answers "none" for a null and for a value of another type.

[[nodiscard]] bool isNull(const CMPIData& data);
/// A string's text, UTF-8. It is followed by a zero byte.
[[nodiscard]] std::optional<std::string_view> text(const CMPIData& data);
/// A CIM datetime: 25 characters, "yyyymmddhhmmss.mmmmmmsutc" or the interval form.
[[nodiscard]] std::optional<std::string_view> dateTimeText(const CMPIData& data);
/// The elements of an array, each of the array's simple type, single ones possibly null. Empty for no array.
[[nodiscard]] std::span<const CMPIData> elements(const CMPIData& data);
[[nodiscard]] const ObjectPath* objectPath(const CMPIData& data);
[[nodiscard]] const Instance* instance(const CMPIData& data);
/// The same type and the same value: strings compare byte for byte, references as `samePath`. Nulls are equal
/// to nulls.
[[nodiscard]] bool sameValue(const CMPIData& left, const CMPIData& right);

// --- The objects

/// An immutable text with a zero byte at its end.
class String final : public CMPIString {
 public:
  static String* create(Arena& arena, std::string_view text);
  /// One that nothing copies, because its arena outlives all others: the names in a `ClassTable`.
  static String* createShared(Arena& arena, std::string_view text);
  /// Null where `handle` is null or not an object of this broker; so for each class below.
  static String* from(const CMPIString* handle);

  [[nodiscard]] std::string_view view() const { return {reinterpret_cast<const char*>(this + 1), size_}; }
  /// This string where it lives in `arena` or is shared, else a copy there.
  [[nodiscard]] String* in(Arena& arena) const;
  [[nodiscard]] String* copyTo(Arena& arena) const;
  [[nodiscard]] Arena* arena() const { return arena_; }

 private:
  friend class Arena;
  friend struct Ownership;
  String(Arena* arena, std::size_t size);
  static String* place(Arena& arena, std::string_view text, Arena* owner);

  Arena* arena_;  // null: shared
  std::size_t size_;
  bool ownsArena_ = false;
};

class DateTime final : public CMPIDateTime {
 public:
  static constexpr std::size_t textSize = 25;

  /// None where `text` is no CIM datetime: wrong length, impossible fields, misplaced asterisks.
  static DateTime* create(Arena& arena, std::string_view text);
  /// Microseconds since 1970-01-01T00:00Z, or of the interval. None where 25 characters cannot hold it.
  static DateTime* create(Arena& arena, std::uint64_t microseconds, bool isInterval);
  static DateTime* from(const CMPIDateTime* handle);

  [[nodiscard]] std::string_view view() const { return {text_, textSize}; }
  [[nodiscard]] bool isInterval() const { return text_[21] == ':'; }
  /// None for a time before 1970; asterisks count as the lowest value of their field.
  [[nodiscard]] std::optional<std::uint64_t> microseconds() const;
  /// This datetime where it lives in `arena`, else a copy there.
  [[nodiscard]] DateTime* in(Arena& arena) const;
  [[nodiscard]] DateTime* copyTo(Arena& arena) const;
  [[nodiscard]] Arena* arena() const { return arena_; }

 private:
  friend class Arena;
  friend struct Ownership;
  DateTime(Arena& arena, std::string_view text);

  Arena* arena_;
  bool ownsArena_ = false;
  char text_[textSize + 1];
};

/// A fixed number of elements of one simple type.
class Array final : public CMPIArray {
 public:
  static constexpr std::size_t maximumSize = std::size_t{1} << 24U;

  /// All elements null. None where `simpleType` cannot be an element or `size` is above `maximumSize`.
  /// CMPI_chars and CMPI_charsptr elements are kept and shown as CMPI_string.
  static Array* create(Arena& arena, std::size_t size, CMPIType simpleType);
  static Array* from(const CMPIArray* handle);

  [[nodiscard]] std::span<const CMPIData> elements() const { return {elements_, size_}; }
  [[nodiscard]] CMPIType simpleType() const { return simpleType_; }
  CMPIrc set(std::size_t index, const CMPIValue* value, CMPIType type);
  [[nodiscard]] Array* copyTo(Arena& arena) const;
  [[nodiscard]] Arena* arena() const { return arena_; }

 private:
  friend class Arena;
  friend struct Ownership;
  Array(Arena& arena, CMPIData* elements, std::size_t size, CMPIType simpleType);

  Arena* arena_;
  CMPIData* elements_;
  std::size_t size_;
  CMPIType simpleType_;
  bool ownsArena_ = false;
};

class ObjectPath final : public CMPIObjectPath {
 public:
  /// The class need not be known; where it is, `className()` has its own spelling.
  static ObjectPath* create(Arena& arena, const ClassTable& classes, std::string_view nameSpace,
                            std::string_view className);
  static ObjectPath* from(const CMPIObjectPath* handle);

  [[nodiscard]] std::string_view className() const { return className_->view(); }
  [[nodiscard]] std::string_view nameSpace() const { return nameSpace_->view(); }
  /// Empty where none was set.
  [[nodiscard]] std::string_view hostName() const { return hostName_->view(); }
  [[nodiscard]] std::span<const NamedValue> keys() const { return {keys_, keyCount_}; }
  /// Null where there is no such key.
  [[nodiscard]] const NamedValue* find(std::string_view name) const;
  /// Null for a class that the schema lacks.
  [[nodiscard]] const ClassInfo* classInfo() const { return class_; }
  [[nodiscard]] const ClassTable& classes() const { return *classes_; }

  void setNameSpace(std::string_view nameSpace);
  void setHostName(std::string_view hostName);
  void setClassName(std::string_view className);
  /// `value` as CMPI passes it: of type CMPI_chars it is the text itself, not a union with a pointer to it.
  /// Replaces a key of the same name. Names and types are not held against the class: paths carry what a
  /// client sent. CMPI_RC_ERR_INVALID_DATA_TYPE for what no key can be (arrays, instances), as CMPI has it;
  /// CMPI_RC_ERR_INVALID_PARAMETER for an empty name, CMPI_RC_ERR_INVALID_HANDLE for a foreign object.
  CMPIrc addKey(std::string_view name, const CMPIValue* value, CMPIType type);
  void clearKeys();
  [[nodiscard]] ObjectPath* copyTo(Arena& arena) const;
  [[nodiscard]] Arena* arena() const { return arena_; }

 private:
  friend class Arena;
  friend struct Ownership;
  friend class ObjectPathCalls;
  ObjectPath(Arena& arena, const ClassTable& classes);
  void makeRoom(std::uint32_t count);

  Arena* arena_;
  const ClassTable* classes_;
  const ClassInfo* class_ = nullptr;
  String* nameSpace_ = nullptr;
  String* className_ = nullptr;
  String* hostName_ = nullptr;
  NamedValue* keys_ = nullptr;
  std::uint32_t keyCount_ = 0;
  mutable std::uint32_t keyCapacity_ = 0;  // 0 also while another path shares the keys: a change copies them
  bool ownsArena_ = false;
};

/// Same class and same keys, in any order; namespaces and host names do not count. Integer keys compare by
/// value whatever their type, because clients cannot write the type.
[[nodiscard]] bool samePath(const ObjectPath& left, const ObjectPath& right);
/// The same for paths that are `samePath`.
[[nodiscard]] std::size_t pathHash(const ObjectPath& path);

class Instance final : public CMPIInstance {
 public:
  /// Takes the keys of `path` as properties where the class declares them with the path's types. None for a
  /// class that the schema lacks.
  static Instance* create(Arena& arena, const ObjectPath& path);
  static Instance* from(const CMPIInstance* handle);

  /// With the keys that were set as properties.
  [[nodiscard]] const ObjectPath& path() const { return *path_; }
  [[nodiscard]] std::string_view className() const { return path_->className(); }
  [[nodiscard]] const ClassInfo& classInfo() const { return *class_; }
  /// What was set, explicit nulls included, in the order of setting. Declared properties that nobody set are
  /// not among them.
  [[nodiscard]] std::span<const NamedValue> properties() const { return {properties_, count_}; }
  /// Null where it was not set.
  [[nodiscard]] const NamedValue* find(std::string_view name) const;
  /// The same by position among the properties of `classInfo()`, without a look-up.
  [[nodiscard]] const NamedValue* at(std::uint16_t index) const {
    return positions_[index] == 0 ? nullptr : &properties_[positions_[index] - 1];
  }

  /// CMPI_RC_ERR_NO_SUCH_PROPERTY, CMPI_RC_ERR_TYPE_MISMATCH (not the declared type: nothing is widened),
  /// CMPI_RC_ERR_INVALID_DATA_TYPE (no type of a property), CMPI_RC_ERR_INVALID_HANDLE (foreign object). A
  /// null `value`, or a null object in it, sets a null. A key is also set in the path.
  CMPIrc setProperty(std::string_view name, const CMPIValue* value, CMPIType type);
  /// Removes what is neither named nor a key, and ignores it when it is set from now on.
  void restrictTo(std::span<const std::string_view> names);
  /// The path of another instance of the same class; CMPI_RC_ERR_INVALID_PARAMETER for any other.
  CMPIrc setPath(const ObjectPath& path);
  [[nodiscard]] Instance* copyTo(Arena& arena) const;
  [[nodiscard]] Arena* arena() const { return arena_; }

 private:
  friend class Arena;
  friend struct Ownership;
  friend class InstanceCalls;
  Instance(Arena& arena, const ClassInfo& info);
  void adoptKeys();
  NamedValue& slotFor(const PropertyInfo& property);
  void setFilter(std::span<const std::string_view> names);

  Arena* arena_;
  const ClassInfo* class_;
  ObjectPath* path_ = nullptr;
  NamedValue* properties_ = nullptr;
  std::uint16_t* positions_ = nullptr;  // by index of declaration: position in properties_ + 1, 0 for unset
  bool* allowed_ = nullptr;             // by index of declaration; null: everything is
  std::uint32_t count_ = 0;
  std::uint32_t capacity_ = 0;
  bool ownsArena_ = false;
};

}  // namespace cimom
