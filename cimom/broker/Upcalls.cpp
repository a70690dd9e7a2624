// The broker table's requests: from a provider through the upcall target to other providers.
#include <cimom/broker/BrokerState.h>
#include <cimom/broker/Context.h>
#include <cimom/broker/Enumeration.h>
#include <cimom/broker/Values.h>

#include <exception>

namespace cimom {

namespace {

// One upcall's arguments, checked. The answer goes where it lasts as long as the caller's own request.
class Upcall {
 public:
  Upcall(const CMPIBroker* handle, const CMPIContext* context, const CMPIObjectPath* path)
      : call_(callOn(handle)), context_(Context::from(context)), path_(ObjectPath::from(path)) {
    if (call_.code == CMPI_RC_OK && (context_ == nullptr || path_ == nullptr)) {
      call_.code = CMPI_RC_ERR_INVALID_PARAMETER;
    }
    if (call_.code == CMPI_RC_OK && call_.broker->settings.upcalls == nullptr) {
      call_.code = CMPI_RC_ERR_NOT_SUPPORTED;
    }
  }

  void requireThat(bool argumentIsValid) {
    if (call_.code == CMPI_RC_OK && !argumentIsValid) {
      call_.code = CMPI_RC_ERR_INVALID_PARAMETER;
    }
  }

  [[nodiscard]] Arena& arena() const { return call_.request->held(); }

  // Runs `request(target, context, path)`. Exceptions end here: a provider need not be C++.
  template <class RequestFunction>
  CMPIStatus run(const RequestFunction& request) const {
    if (call_.code != CMPI_RC_OK) {
      return makeStatus(call_.code);
    }
    try {
      const UpcallStatus status = request(*call_.broker->settings.upcalls, *context_, *path_);
      return makeStatus(status.code, status.description);
    } catch (const std::exception& error) {
      return makeStatus(CMPI_RC_ERR_FAILED, error.what());
    }
  }

  // The answer as an enumeration; null where the request failed.
  template <class RequestFunction>
  CMPIEnumeration* enumerate(CMPIType type, CMPIStatus* status, const RequestFunction& request) const {
    Enumeration* answer = nullptr;
    const CMPIStatus ended = run([&](UpcallTarget& target, const Context& context, const ObjectPath& path) {
      Collector collector(arena());
      UpcallStatus outcome = request(target, context, path, collector);
      if (outcome.code == CMPI_RC_OK) {
        answer = Enumeration::create(arena(), type, collector.collected());
      }
      return outcome;
    });
    if (status != nullptr) {
      *status = ended;
    }
    return answer;
  }

  // The first object of the answer; `missing` where there is none.
  template <class RequestFunction>
  CMPIData first(CMPIrc missing, CMPIStatus* status, const RequestFunction& request) const {
    CMPIData answer = nullData(CMPI_null);
    const CMPIStatus ended = run([&](UpcallTarget& target, const Context& context, const ObjectPath& path) {
      Collector collector(arena());
      UpcallStatus outcome = request(target, context, path, collector);
      if (outcome.code == CMPI_RC_OK && collector.collected().empty()) {
        outcome.code = missing;
      } else if (outcome.code == CMPI_RC_OK) {
        answer = collector.collected().front();
      }
      return outcome;
    });
    if (status != nullptr) {
      *status = ended;
    }
    return answer;
  }

 private:
  Call call_;
  const Context* context_;
  const ObjectPath* path_;
};

CMPIEnumeration* enumerateInstanceNames(const CMPIBroker* broker, const CMPIContext* context,
                                        const CMPIObjectPath* path, CMPIStatus* status) {
  return Upcall(broker, context, path)
      .enumerate(CMPI_ref, status, [](auto& target, auto& caller, auto& source, auto& sink) {
        return target.enumerateInstanceNames(caller, source, sink);
      });
}

CMPIEnumeration* enumerateInstances(const CMPIBroker* broker, const CMPIContext* context,
                                    const CMPIObjectPath* path, const char** properties, CMPIStatus* status) {
  return Upcall(broker, context, path)
      .enumerate(CMPI_instance, status, [=](auto& target, auto& caller, auto& source, auto& sink) {
        return target.enumerateInstances(caller, source, properties, sink);
      });
}

CMPIInstance* getInstance(const CMPIBroker* broker, const CMPIContext* context, const CMPIObjectPath* path,
                          const char** properties, CMPIStatus* status) {
  const CMPIData answer =
      Upcall(broker, context, path)
          .first(CMPI_RC_ERR_NOT_FOUND, status, [=](auto& target, auto& caller, auto& source, auto& sink) {
            return target.getInstance(caller, source, properties, sink);
          });
  return answer.type == CMPI_instance ? answer.value.inst : nullptr;
}

CMPIEnumeration* associators(const CMPIBroker* broker, const CMPIContext* context, const CMPIObjectPath* path,
                             const char* associationClass, const char* resultClass, const char* role,
                             const char* resultRole, const char** properties, CMPIStatus* status) {
  const AssociationFilter filter{associationClass, resultClass, role, resultRole};
  return Upcall(broker, context, path)
      .enumerate(CMPI_instance, status, [=](auto& target, auto& caller, auto& source, auto& sink) {
        return target.associators(caller, source, filter, properties, sink);
      });
}

CMPIEnumeration* associatorNames(const CMPIBroker* broker, const CMPIContext* context,
                                 const CMPIObjectPath* path, const char* associationClass,
                                 const char* resultClass, const char* role, const char* resultRole,
                                 CMPIStatus* status) {
  const AssociationFilter filter{associationClass, resultClass, role, resultRole};
  return Upcall(broker, context, path)
      .enumerate(CMPI_ref, status, [=](auto& target, auto& caller, auto& source, auto& sink) {
        return target.associatorNames(caller, source, filter, sink);
      });
}

CMPIEnumeration* references(const CMPIBroker* broker, const CMPIContext* context, const CMPIObjectPath* path,
                            const char* resultClass, const char* role, const char** properties,
                            CMPIStatus* status) {
  const AssociationFilter filter{resultClass, nullptr, role, nullptr};
  return Upcall(broker, context, path)
      .enumerate(CMPI_instance, status, [=](auto& target, auto& caller, auto& source, auto& sink) {
        return target.references(caller, source, filter, properties, sink);
      });
}

CMPIEnumeration* referenceNames(const CMPIBroker* broker, const CMPIContext* context,
                                const CMPIObjectPath* path, const char* resultClass, const char* role,
                                CMPIStatus* status) {
  const AssociationFilter filter{resultClass, nullptr, role, nullptr};
  return Upcall(broker, context, path)
      .enumerate(CMPI_ref, status, [=](auto& target, auto& caller, auto& source, auto& sink) {
        return target.referenceNames(caller, source, filter, sink);
      });
}

CMPIObjectPath* createInstance(const CMPIBroker* broker, const CMPIContext* context,
                               const CMPIObjectPath* path, const CMPIInstance* handle, CMPIStatus* status) {
  const Instance* const object = Instance::from(handle);
  Upcall upcall(broker, context, path);
  upcall.requireThat(object != nullptr);
  const CMPIData answer =
      upcall.first(CMPI_RC_ERR_FAILED, status, [=](auto& target, auto& caller, auto& source, auto& sink) {
        return target.createInstance(caller, source, *object, sink);
      });
  return answer.type == CMPI_ref ? answer.value.ref : nullptr;
}

CMPIStatus modifyInstance(const CMPIBroker* broker, const CMPIContext* context, const CMPIObjectPath* path,
                          const CMPIInstance* handle, const char** properties) {
  const Instance* const object = Instance::from(handle);
  Upcall upcall(broker, context, path);
  upcall.requireThat(object != nullptr);
  return upcall.run([=](auto& target, auto& caller, auto& source) {
    return target.modifyInstance(caller, source, *object, properties);
  });
}

CMPIStatus deleteInstance(const CMPIBroker* broker, const CMPIContext* context, const CMPIObjectPath* path) {
  return Upcall(broker, context, path).run([](auto& target, auto& caller, auto& source) {
    return target.deleteInstance(caller, source);
  });
}

CMPIEnumeration* execQuery(const CMPIBroker* broker, const CMPIContext* context, const CMPIObjectPath* path,
                           const char* query, const char* language, CMPIStatus* status) {
  Upcall upcall(broker, context, path);
  upcall.requireThat(query != nullptr && language != nullptr);
  return upcall.enumerate(CMPI_instance, status, [=](auto& target, auto& caller, auto& source, auto& sink) {
    return target.execQuery(caller, source, query, language, sink);
  });
}

CMPIData invokeMethod(const CMPIBroker* broker, const CMPIContext* context, const CMPIObjectPath* path,
                      const char* method, const CMPIArgs* in, CMPIArgs* out, CMPIStatus* status) {
  const Args* const given = Args::from(in);
  Upcall upcall(broker, context, path);
  upcall.requireThat(method != nullptr && given != nullptr);
  return upcall.first(CMPI_RC_ERR_FAILED, status, [=](auto& target, auto& caller, auto& source, auto& sink) {
    return target.invokeMethod(caller, source, method, *given, Args::from(out), sink);
  });
}

CMPIStatus setProperty(const CMPIBroker* broker, const CMPIContext* context, const CMPIObjectPath* path,
                       const char* name, const CMPIValue* value, CMPIType type) {
  Upcall upcall(broker, context, path);
  upcall.requireThat(name != nullptr);
  return upcall.run([&](auto& target, auto& caller, auto& source) {
    CMPIData data{};
    const CMPIrc code = makeData(upcall.arena(), value, type, data);
    return code == CMPI_RC_OK ? target.setProperty(caller, source, name, data) : UpcallStatus{code, {}};
  });
}

CMPIData getProperty(const CMPIBroker* broker, const CMPIContext* context, const CMPIObjectPath* path,
                     const char* name, CMPIStatus* status) {
  Upcall upcall(broker, context, path);
  upcall.requireThat(name != nullptr);
  return upcall.first(CMPI_RC_ERR_NOT_FOUND, status,
                      [=](auto& target, auto& caller, auto& source, auto& sink) {
                        return target.getProperty(caller, source, name, sink);
                      });
}

// There are no subscribers.
CMPIStatus deliverIndication(const CMPIBroker* broker, const CMPIContext* /*context*/,
                             const char* /*nameSpace*/, const CMPIInstance* /*indication*/) {
  return makeStatus(BrokerCalls::state(broker) == nullptr ? CMPI_RC_ERR_INVALID_HANDLE
                                                          : CMPI_RC_ERR_NOT_SUPPORTED);
}

}  // namespace

void fillUpcalls(CMPIBrokerFT& table) {
  table.deliverIndication = deliverIndication;
  table.enumerateInstanceNames = enumerateInstanceNames;
  table.getInstance = getInstance;
  table.createInstance = createInstance;
  table.modifyInstance = modifyInstance;
  table.deleteInstance = deleteInstance;
  table.execQuery = execQuery;
  table.enumerateInstances = enumerateInstances;
  table.associators = associators;
  table.associatorNames = associatorNames;
  table.references = references;
  table.referenceNames = referenceNames;
  table.invokeMethod = invokeMethod;
  table.setProperty = setProperty;
  table.getProperty = getProperty;
}

}  // namespace cimom
