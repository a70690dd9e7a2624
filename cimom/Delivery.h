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

/// What a request is answered with.
enum class Kind { Instances, Names };

/// The names in a null-ended list; nothing for a null list, which means all properties.
[[nodiscard]] std::optional<std::vector<std::string_view>> propertyNames(const char** properties);

/// Hands objects on, one by one and at once, with the properties that were asked for. It outlives the calls
/// of several providers that answer one request. An exception of the receiver ends the delivery and waits
/// until the provider, whose frames it must not cross, has returned. Paths where instances were asked for,
/// and the other way round, are left out and counted.
class Delivery : public ResultSink {
 public:
  Delivery(const Delivery&) = delete;
  Delivery& operator=(const Delivery&) = delete;

  bool instance(Instance& instance) final;
  bool path(ObjectPath& path) final;

  /// False once the receiver wants no more.
  [[nodiscard]] bool isOpen() const { return open_; }
  [[nodiscard]] std::size_t delivered() const { return delivered_; }
  /// Objects that the provider asked last gave though nobody asked for them, and the class of the first.
  [[nodiscard]] std::size_t strangers() const { return strangers_; }
  [[nodiscard]] const std::string& strangersClass() const { return strangersClass_; }
  /// Throws what the receiver threw, if it did.
  void rethrow() const;

 protected:
  Delivery(Kind kind, ResultSink& receiver, const char** properties)
      : kind_(kind), receiver_(receiver), properties_(propertyNames(properties)) {}

  enum class Verdict { Wanted, LeftOut, Stranger };

  /// To be called before each provider's answer.
  void forgetStrangers() { strangers_ = 0; }

 private:
  /// `instance` is null where a path was returned; otherwise `path` is the instance's.
  [[nodiscard]] virtual Verdict judge(const ObjectPath& path, const Instance* instance) = 0;
  [[nodiscard]] bool isWanted(Kind given, const ObjectPath& path, const Instance* instance);
  template <class Action>
  bool handOn(const Action& action);

  Kind kind_;
  ResultSink& receiver_;
  std::optional<std::vector<std::string_view>> properties_;
  Arena scratch_;  ///< one instance at a time, where properties are left out
  bool open_ = true;
  std::size_t delivered_ = 0;
  std::size_t strangers_ = 0;
  std::string strangersClass_;
  std::exception_ptr thrown_;
};

/// Instances of a class: the answer to an enumeration.
class EnumerationDelivery : public Delivery {
 public:
  EnumerationDelivery(Kind kind, ResultSink& receiver, const char** properties,
                      bool Route::*operation = &Route::instance)
      : Delivery(kind, receiver, properties), operation_(operation) {}

  /// The objects that follow come from the provider of `route`, asked for the instances of `requested`. What
  /// belongs to a class that another provider answers the operation for is left out: that provider is asked
  /// for it. What belongs to no class below the requested one is a stranger.
  void startRoute(const Routes& routes, const Route& route, const ClassInfo& requested,
                  std::string_view nameSpace);

 protected:
  [[nodiscard]] Verdict judge(const ObjectPath& path, const Instance* instance) override;

 private:
  bool Route::*operation_;
  const Routes* routes_ = nullptr;
  const Route* route_ = nullptr;
  const ClassInfo* requested_ = nullptr;
  std::string_view nameSpace_;
};

/// For whoever wants to know only how a request ended.
class Nobody final : public ResultSink {
 public:
  bool instance(Instance& /*instance*/) override { return true; }
  bool path(ObjectPath& /*path*/) override { return true; }
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
