// The CMPI broker: the four function tables that a provider is given, over a schema, a target for upcalls and
// a log.
//
// Threads: requests may run in several threads at once, each within its own `RequestScope`. The broker
// outlives every provider that holds it and every object made through it, clones included.
#pragma once

#include <cimom/broker/ClassModel.h>
#include <cimom/broker/ClassTable.h>
#include <cimom/broker/Context.h>
#include <cimom/broker/Objects.h>
#include <cimom/broker/Result.h>
#include <cmpi/cmpidt.h>
#include <cmpi/cmpift.h>

#include <functional>
#include <memory>
#include <string>
#include <string_view>

namespace cimom {

struct UpcallStatus {
  CMPIrc code = CMPI_RC_OK;
  std::string description;  ///< empty where there is nothing to add
};

/// Null members: not given.
struct AssociationFilter {
  const char* associationClass = nullptr;  ///< for references: the result class
  const char* resultClass = nullptr;
  const char* role = nullptr;
  const char* resultRole = nullptr;
};

/// What a provider asks of other providers through the broker. The path comes with all its keys, as the
/// provider made it; `properties` is null, or names ended by a null. What the sink is given it copies. Called
/// from any thread that runs a provider. What a target does not override answers CMPI_RC_ERR_NOT_SUPPORTED.
class UpcallTarget {
 public:
  virtual ~UpcallTarget() = default;

  virtual UpcallStatus enumerateInstances(const Context& context, const ObjectPath& path,
                                          const char** properties, ResultSink& sink);
  virtual UpcallStatus enumerateInstanceNames(const Context& context, const ObjectPath& path,
                                              ResultSink& sink);
  virtual UpcallStatus getInstance(const Context& context, const ObjectPath& path, const char** properties,
                                   ResultSink& sink);
  virtual UpcallStatus associators(const Context& context, const ObjectPath& path,
                                   const AssociationFilter& filter, const char** properties,
                                   ResultSink& sink);
  virtual UpcallStatus associatorNames(const Context& context, const ObjectPath& path,
                                       const AssociationFilter& filter, ResultSink& sink);
  virtual UpcallStatus references(const Context& context, const ObjectPath& path,
                                  const AssociationFilter& filter, const char** properties, ResultSink& sink);
  virtual UpcallStatus referenceNames(const Context& context, const ObjectPath& path,
                                      const AssociationFilter& filter, ResultSink& sink);
  /// The sink takes the path of what was made.
  virtual UpcallStatus createInstance(const Context& context, const ObjectPath& path,
                                      const Instance& instance, ResultSink& sink);
  virtual UpcallStatus modifyInstance(const Context& context, const ObjectPath& path,
                                      const Instance& instance, const char** properties);
  virtual UpcallStatus deleteInstance(const Context& context, const ObjectPath& path);
  virtual UpcallStatus execQuery(const Context& context, const ObjectPath& path, std::string_view query,
                                 std::string_view language, ResultSink& sink);
  /// The sink takes the method's return value.
  virtual UpcallStatus invokeMethod(const Context& context, const ObjectPath& path, std::string_view method,
                                    const Args& in, Args* out, ResultSink& sink);
  virtual UpcallStatus setProperty(const Context& context, const ObjectPath& path, std::string_view name,
                                   const CMPIData& value);
  virtual UpcallStatus getProperty(const Context& context, const ObjectPath& path, std::string_view name,
                                   ResultSink& sink);
};

/// `logMessage` and `trace` of the encapsulation table.
struct LogEntry {
  bool isTrace = false;
  int level = 0;  ///< CMPISeverity of a message, CMPILevel of a trace
  std::string_view component;
  std::string_view text;
};

struct BrokerSettings {
  std::string name = "cimom";
  UpcallTarget* upcalls = nullptr;           ///< null: every upcall answers CMPI_RC_ERR_NOT_SUPPORTED
  std::function<void(const LogEntry&)> log;  ///< empty: none; may be called from several threads at once
};

class Broker {
 public:
  /// Reads `model`, which may go afterwards. Throws as `ClassTable` does.
  Broker(const ClassModel& model, BrokerSettings settings);
  ~Broker();
  Broker(const Broker&) = delete;
  Broker& operator=(const Broker&) = delete;

  /// What a provider's factory is given. A copy with fewer tables, or with tables of one's own, works as
  /// well: the functions need `hdl` alone.
  [[nodiscard]] const CMPIBroker* handle() const;
  [[nodiscard]] const ClassTable& classes() const;

  struct State;

 private:
  std::unique_ptr<State> state_;
};

}  // namespace cimom
