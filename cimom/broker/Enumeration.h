// CMPI's enumeration: the answer of an upcall, walked by the provider that made it.
#pragma once

#include <cimom/broker/Objects.h>
#include <cimom/broker/Result.h>
#include <cmpi/cmpidt.h>
#include <cmpi/cmpift.h>

#include <cstddef>
#include <span>

namespace cimom {

class Enumeration final : public CMPIEnumeration {
 public:
  /// Keeps the elements' handles, which must live as long as `arena`. `type` is that of every element
  /// (CMPI_instance, CMPI_ref), also when there is none.
  static Enumeration* create(Arena& arena, CMPIType type, std::span<const CMPIData> elements);
  static Enumeration* from(const CMPIEnumeration* handle);

  [[nodiscard]] std::span<const CMPIData> elements() const { return {elements_, size_}; }
  [[nodiscard]] CMPIType type() const { return type_; }
  /// Begins anew, as `clone()` does.
  [[nodiscard]] Enumeration* copyTo(Arena& arena) const;
  [[nodiscard]] Arena* arena() const { return arena_; }

 private:
  friend class Arena;
  friend struct Ownership;
  friend class EnumerationCalls;
  Enumeration(Arena& arena, CMPIType type, const CMPIData* elements, std::size_t size);

  Arena* arena_;
  const CMPIData* elements_;
  std::size_t size_;
  std::size_t next_ = 0;
  CMPIType type_;
  bool ownsArena_ = false;
};

/// A sink that keeps deep copies in an arena.
class Collector final : public ResultSink {
 public:
  explicit Collector(Arena& arena) : arena_(&arena) {}

  bool instance(Instance& instance) override;
  bool path(ObjectPath& path) override;
  bool data(const CMPIData& value) override;

  [[nodiscard]] std::span<const CMPIData> collected() const { return {elements_, size_}; }

 private:
  bool add(const CMPIData& value);

  Arena* arena_;
  CMPIData* elements_ = nullptr;
  std::size_t size_ = 0;
  std::size_t capacity_ = 0;
};

}  // namespace cimom
