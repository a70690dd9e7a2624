// What stands between a provider's answer and whoever asked.
#pragma once

#include <cimom/Routes.h>
#include <cimom/broker/Arena.h>
#include <cimom/broker/Objects.h>
#include <cimom/broker/Result.h>

#include <cstddef>
#include <exception>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace cimom {

enum class Enumerated { Instances, Names };

/// The names in a null-ended list; nothing for a null list, which means all properties.
[[nodiscard]] std::optional<std::vector<std::string_view>> propertyNames(const char** properties);

/// Hands objects on, one by one and at once, with the properties that were asked for. It outlives the calls
/// of several providers that answer one request. An exception of the receiver ends the delivery and waits
/// until the provider, whose frames it must not cross, has returned.
class Delivery final : public ResultSink {
 public:
  Delivery(Enumerated what, ResultSink& receiver, const char** properties)
      : what_(what), receiver_(receiver), properties_(propertyNames(properties)) {}

  /// The objects that follow come from the provider of `route`, asked for the instances of `requested`. What
  /// belongs to a class that another provider answers for is left out: that provider is asked for it. What
  /// belongs to no class below the requested one is left out and counted, and so are paths where instances
  /// were asked for and the other way round.
  void startRoute(const Routes& routes, const Route& route, const ClassInfo& requested,
                  std::string_view nameSpace);

  bool instance(Instance& instance) override;
  bool path(ObjectPath& path) override;

  /// False once the receiver wants no more.
  [[nodiscard]] bool isOpen() const { return open_; }
  [[nodiscard]] std::size_t delivered() const { return delivered_; }
  /// Objects left out since the last start because nobody asked for them, and the class of the first.
  [[nodiscard]] std::size_t strangers() const { return strangers_; }
  [[nodiscard]] const std::string& strangersClass() const { return strangersClass_; }
  /// Throws what the receiver threw, if it did.
  void rethrow() const;

 private:
  [[nodiscard]] bool isWanted(Enumerated what, const ClassInfo* info, std::string_view className);
  template <class Action>
  bool handOn(const Action& action);

  Enumerated what_;
  ResultSink& receiver_;
  std::optional<std::vector<std::string_view>> properties_;
  const Routes* routes_ = nullptr;
  const Route* route_ = nullptr;
  const ClassInfo* requested_ = nullptr;
  std::string_view nameSpace_;
  Arena scratch_;  ///< one instance at a time, where properties are left out
  bool open_ = true;
  std::size_t delivered_ = 0;
  std::size_t strangers_ = 0;
  std::string strangersClass_;
  std::exception_ptr thrown_;
};

/// Takes the answer to a request for one instance, and counts what else comes.
class SingleAnswer final : public ResultSink {
 public:
  explicit SingleAnswer(Arena& arena) : arena_(arena) {}

  bool instance(Instance& instance) override {
    if (count_++ == 0)
      first_ = instance.copyTo(arena_);
    return true;
  }
  bool path(ObjectPath& /*path*/) override {
    ++count_;
    return true;
  }

  [[nodiscard]] std::size_t count() const { return count_; }
  /// The first answer; nullptr where there was none, or where it was no instance.
  [[nodiscard]] Instance* first() const { return first_; }

 private:
  Arena& arena_;
  Instance* first_ = nullptr;
  std::size_t count_ = 0;
};

}  // namespace cimom
