// What stands between the providers' answers to an association request and whoever asked.
#pragma once

#include <cimom/Delivery.h>
#include <cimom/Roles.h>

#include <cstddef>
#include <string_view>
#include <unordered_map>

namespace cimom {

/// Paths that were delivered, and by which of several answers.
class DeliveredPaths {
 public:
  /// `nameSpace` is that of paths without one, and must outlive this.
  explicit DeliveredPaths(std::string_view nameSpace);

  /// Whether an answer before this one gave the path, the answers being numbered in their order.
  [[nodiscard]] bool isFromBefore(const ObjectPath& path, std::size_t answer) const;
  /// Keeps a copy.
  void add(const ObjectPath& path, std::size_t answer);

 private:
  struct Hash {
    std::size_t operator()(const ObjectPath* path) const { return pathHash(*path); }
  };
  struct Equal {
    std::string_view nameSpace;
    bool operator()(const ObjectPath* left, const ObjectPath* right) const;
  };

  Arena arena_;
  std::unordered_map<const ObjectPath*, std::size_t, Hash, Equal> paths_;
};

/// The objects at the far ends.
class AssociatorDelivery final : public Delivery {
 public:
  struct Narrowing {
    const ClassInfo* resultClass = nullptr;  ///< null: any
    const char* resultRole = nullptr;        ///< null: any
  };

  /// The `nameSpace` is the request's. `answers` is how many there will be: objects are remembered for those
  /// that follow.
  AssociatorDelivery(Kind kind, ResultSink& receiver, const char** properties, const Narrowing& narrowing,
                     std::string_view nameSpace, std::size_t answers)
      : Delivery(kind, receiver, properties), narrowing_(narrowing), known_(nameSpace), answers_(answers) {}

  /// The objects that follow come through another association class. `roles`, which must outlive the answer,
  /// may be null where no result role is asked for.
  void startAnswer(const Roles* roles);

 private:
  [[nodiscard]] Verdict judge(const ObjectPath& path, const Instance* instance) override;

  Narrowing narrowing_;
  const Roles* roles_ = nullptr;
  DeliveredPaths known_;
  std::size_t answers_;
  std::size_t answer_ = 0;  ///< of the current one; the first is 1
};

/// The associations themselves. What belongs to a class that another provider answers for is left out: that
/// provider is asked for it.
class ReferenceDelivery final : public EnumerationDelivery {
 public:
  /// With a role, an association whose reference of that name holds another object than the source, or for a
  /// class as the source one of another class, is left out. Where the answer lacks the reference because it
  /// is no key and was not asked for, the provider is trusted: it knows the role.
  ReferenceDelivery(Kind kind, ResultSink& receiver, const char** properties, const ObjectPath& source,
                    const char* role)
      : EnumerationDelivery(kind, receiver, properties, &Route::association), source_(source), role_(role) {}

 private:
  [[nodiscard]] Verdict judge(const ObjectPath& path, const Instance* instance) override;
  [[nodiscard]] bool holdsSource(const NamedValue& reference) const;

  const ObjectPath& source_;
  const char* role_;  // null: any
};

}  // namespace cimom
