// Named values: the context of a request, and the arguments of a method.
#pragma once

#include <cimom/broker/Objects.h>
#include <cmpi/cmpidt.h>
#include <cmpi/cmpift.h>

#include <cstdint>
#include <span>
#include <string_view>

namespace cimom {

/// A list of values in an arena; names ignore case.
class NamedValues {
 public:
  explicit NamedValues(Arena& arena) : arena_(&arena) {}

  [[nodiscard]] std::span<const NamedValue> all() const { return {values_, count_}; }
  [[nodiscard]] const NamedValue* find(std::string_view name) const;
  /// Replaces a value of the same name. CMPI_RC_ERR_INVALID_DATA_TYPE for a type that
  /// no property could have, CMPI_RC_ERR_INVALID_PARAMETER for an empty name, CMPI_RC_ERR_INVALID_HANDLE for
  /// a foreign object.
  CMPIrc set(std::string_view name, const CMPIValue* value, CMPIType type);
  void copyFrom(const NamedValues& other);
  [[nodiscard]] Arena* arena() const { return arena_; }

 private:
  NamedValue& slotFor(std::string_view name);

  Arena* arena_;
  NamedValue* values_ = nullptr;
  std::uint32_t count_ = 0;
  std::uint32_t capacity_ = 0;
};

class Context final : public CMPIContext {
 public:
  static Context* create(Arena& arena);
  static Context* from(const CMPIContext* handle);

  [[nodiscard]] const NamedValues& entries() const { return entries_; }
  CMPIrc set(std::string_view name, const CMPIValue* value, CMPIType type) {
    return entries_.set(name, value, type);
  }
  CMPIrc setText(std::string_view name, std::string_view text);
  CMPIrc setFlags(CMPIFlags flags);  ///< the entry CMPIInvocationFlags
  [[nodiscard]] Context* copyTo(Arena& arena) const;
  [[nodiscard]] Arena* arena() const { return entries_.arena(); }

 private:
  friend class Arena;
  friend struct Ownership;
  explicit Context(Arena& arena);

  NamedValues entries_;
  bool ownsArena_ = false;
};

class Args final : public CMPIArgs {
 public:
  static Args* create(Arena& arena);
  static Args* from(const CMPIArgs* handle);

  [[nodiscard]] const NamedValues& entries() const { return entries_; }
  CMPIrc set(std::string_view name, const CMPIValue* value, CMPIType type) {
    return entries_.set(name, value, type);
  }
  [[nodiscard]] Args* copyTo(Arena& arena) const;
  [[nodiscard]] Arena* arena() const { return entries_.arena(); }

 private:
  friend class Arena;
  friend struct Ownership;
  explicit Args(Arena& arena);

  NamedValues entries_;
  bool ownsArena_ = false;
};

}  // namespace cimom
