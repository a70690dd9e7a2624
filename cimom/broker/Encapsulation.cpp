// The encapsulation table: making objects, asking what they are, messages and the log.
#include <cimom/broker/BrokerState.h>
#include <cimom/broker/Context.h>
#include <cimom/broker/Describe.h>
#include <cimom/broker/Messages.h>
#include <cimom/broker/Objects.h>

#include <cstdarg>
#include <ctime>
#include <string>
#include <type_traits>

namespace cimom {

namespace {

// Makes an object in the calling thread's request; a null from `make` is answered with `refusal`.
template <class Make>
std::invoke_result_t<Make, Broker::State&, Arena&> make(const CMPIBroker* broker, CMPIStatus* status,
                                                        CMPIrc refusal, const Make& maker) {
  const Call call = callOn(broker);
  if (call.code != CMPI_RC_OK) {
    return noObject(status, call.code);
  }
  auto* const object = maker(*call.broker, call.request->arena());
  setStatus(status, object == nullptr ? refusal : CMPI_RC_OK);
  return object;
}

CMPIInstance* newInstance(const CMPIBroker* broker, const CMPIObjectPath* handle, CMPIStatus* status) {
  const ObjectPath* const path = ObjectPath::from(handle);
  const CMPIrc refusal = path == nullptr ? CMPI_RC_ERR_INVALID_PARAMETER : CMPI_RC_ERR_INVALID_CLASS;
  return make(broker, status, refusal, [path](Broker::State& /*state*/, Arena& arena) {
    return path == nullptr ? nullptr : Instance::create(arena, *path);
  });
}

CMPIObjectPath* newObjectPath(const CMPIBroker* broker, const char* nameSpace, const char* className,
                              CMPIStatus* status) {
  return make(broker, status, CMPI_RC_ERR_INVALID_PARAMETER, [=](Broker::State& state, Arena& arena) {
    const std::string_view where = nameSpace == nullptr ? std::string_view() : nameSpace;
    return className == nullptr ? nullptr : ObjectPath::create(arena, state.classes, where, className);
  });
}

CMPIArgs* newArgs(const CMPIBroker* broker, CMPIStatus* status) {
  return make(broker, status, CMPI_RC_ERR_FAILED,
              [](Broker::State& /*state*/, Arena& arena) { return Args::create(arena); });
}

CMPIString* newString(const CMPIBroker* broker, const char* chars, CMPIStatus* status) {
  return make(broker, status, CMPI_RC_ERR_INVALID_PARAMETER, [chars](Broker::State& /*state*/, Arena& arena) {
    return chars == nullptr ? nullptr : String::create(arena, chars);
  });
}

CMPIArray* newArray(const CMPIBroker* broker, CMPICount size, CMPIType type, CMPIStatus* status) {
  const CMPIrc refusal =
      size > Array::maximumSize ? CMPI_RC_ERR_INVALID_PARAMETER : CMPI_RC_ERR_INVALID_DATA_TYPE;
  return make(broker, status, refusal,
              [=](Broker::State& /*state*/, Arena& arena) { return Array::create(arena, size, type); });
}

CMPIDateTime* newDateTime(const CMPIBroker* broker, CMPIStatus* status) {
  return make(broker, status, CMPI_RC_ERR_FAILED, [](Broker::State& /*state*/, Arena& arena) {
    timespec now{};
    clock_gettime(CLOCK_REALTIME, &now);
    const auto microseconds =
        static_cast<std::uint64_t>(now.tv_sec) * 1000000U + static_cast<std::uint64_t>(now.tv_nsec) / 1000U;
    return DateTime::create(arena, microseconds, false);
  });
}

CMPIDateTime* newDateTimeFromBinary(const CMPIBroker* broker, CMPIUint64 microseconds, CMPIBoolean isInterval,
                                    CMPIStatus* status) {
  return make(broker, status, CMPI_RC_ERR_INVALID_PARAMETER, [=](Broker::State& /*state*/, Arena& arena) {
    return DateTime::create(arena, microseconds, isInterval != 0);
  });
}

CMPIDateTime* newDateTimeFromChars(const CMPIBroker* broker, const char* chars, CMPIStatus* status) {
  return make(broker, status, CMPI_RC_ERR_INVALID_PARAMETER, [chars](Broker::State& /*state*/, Arena& arena) {
    return chars == nullptr ? nullptr : DateTime::create(arena, std::string_view(chars));
  });
}

CMPISelectExp* newSelectExp(const CMPIBroker* broker, const char* /*query*/, const char* /*language*/,
                            CMPIArray** projection, CMPIStatus* status) {
  if (projection != nullptr) {
    *projection = nullptr;
  }
  return noObject(
      status, BrokerCalls::state(broker) == nullptr ? CMPI_RC_ERR_INVALID_HANDLE : CMPI_RC_ERR_NOT_SUPPORTED);
}

CMPIBoolean classPathIsA(const CMPIBroker* broker, const CMPIObjectPath* handle, const char* className,
                         CMPIStatus* status) {
  const Broker::State* const state = BrokerCalls::state(broker);
  const ObjectPath* const path = ObjectPath::from(handle);
  if (state == nullptr) {
    setStatus(status, CMPI_RC_ERR_INVALID_HANDLE);
    return 0;
  }
  if (path == nullptr || className == nullptr) {
    setStatus(status, CMPI_RC_ERR_INVALID_PARAMETER);
    return 0;
  }
  setStatus(status, CMPI_RC_OK);
  return state->classes.isA(path->className(), className) ? 1 : 0;
}

CMPIString* textOf(const CMPIBroker* broker, const void* object, CMPIStatus* status,
                   std::string (*text)(const void*)) {
  const bool isOurs = !typeNameOf(object).empty();
  return make(broker, status, CMPI_RC_ERR_INVALID_HANDLE, [=](Broker::State& /*state*/, Arena& arena) {
    return isOurs ? String::create(arena, text(object)) : nullptr;
  });
}

std::string typeText(const void* object) {
  return std::string(typeNameOf(object));
}

std::string contentText(const void* object) {
  const std::string content = describe(object);
  const bool canBeEmpty = typeNameOf(object) == "CMPIString";
  return content.empty() && !canBeEmpty ? typeText(object) : content;
}

CMPIString* toString(const CMPIBroker* broker, const void* object, CMPIStatus* status) {
  return textOf(broker, object, status, contentText);
}

CMPIString* getType(const CMPIBroker* broker, const void* object, CMPIStatus* status) {
  return textOf(broker, object, status, typeText);
}

CMPIBoolean isOfType(const CMPIBroker* broker, const void* object, const char* type, CMPIStatus* status) {
  const bool handlesAreValid = BrokerCalls::state(broker) != nullptr && !typeNameOf(object).empty();
  if (!handlesAreValid || type == nullptr) {
    setStatus(status, handlesAreValid ? CMPI_RC_ERR_INVALID_PARAMETER : CMPI_RC_ERR_INVALID_HANDLE);
    return 0;
  }
  setStatus(status, CMPI_RC_OK);
  return typeNameOf(object) == type ? 1 : 0;
}

CMPIStatus log(const CMPIBroker* broker, bool isTrace, int level, const char* component, const char* text,
               const CMPIString* string) {
  const Broker::State* const state = BrokerCalls::state(broker);
  if (state == nullptr) {
    return makeStatus(CMPI_RC_ERR_INVALID_HANDLE);
  }
  const String* const given = String::from(string);
  if (text == nullptr && given == nullptr) {
    return makeStatus(CMPI_RC_ERR_INVALID_PARAMETER);
  }
  if (state->settings.log) {
    state->settings.log({isTrace, level, component == nullptr ? std::string_view() : component,
                         text == nullptr ? given->view() : text});
  }
  return makeStatus(CMPI_RC_OK);
}

CMPIStatus logMessage(const CMPIBroker* broker, int severity, const char* id, const char* text,
                      const CMPIString* string) {
  return log(broker, false, severity, id, text, string);
}

CMPIStatus trace(const CMPIBroker* broker, int level, const char* component, const char* text,
                 const CMPIString* string) {
  return log(broker, true, level, component, text, string);
}

CMPIError* newCMPIError(const CMPIBroker* broker, const char* /*owner*/, const char* /*messageId*/,
                        const char* /*message*/, const CMPIErrorSeverity /*severity*/,
                        const CMPIErrorProbableCause /*cause*/, const CMPIrc /*code*/, CMPIStatus* status) {
  return noObject(
      status, BrokerCalls::state(broker) == nullptr ? CMPI_RC_ERR_INVALID_HANDLE : CMPI_RC_ERR_NOT_SUPPORTED);
}

// There are no message files: messages come out with the texts that the provider itself gives.
// Headers differ in how the new handle comes back.
template <class File>
CMPIStatus openMessageFile(const CMPIBroker* broker, const char* /*file*/, File /*handle*/) {
  return makeStatus(BrokerCalls::state(broker) == nullptr ? CMPI_RC_ERR_INVALID_HANDLE
                                                          : CMPI_RC_ERR_NOT_SUPPORTED);
}

CMPIStatus closeMessageFile(const CMPIBroker* broker, CMPIMsgFileHandle /*handle*/) {
  return makeStatus(BrokerCalls::state(broker) == nullptr ? CMPI_RC_ERR_INVALID_HANDLE
                                                          : CMPI_RC_ERR_NOT_SUPPORTED);
}

CMPIString* getMessage(const CMPIBroker* broker, const char* /*id*/, const char* text, CMPIStatus* status,
                       CMPICount count, ...) {
  va_list inserts;
  va_start(inserts, count);
  const std::string message = formatMessage(text, count, inserts);
  va_end(inserts);
  return make(broker, status, CMPI_RC_ERR_INVALID_PARAMETER, [&](Broker::State& /*state*/, Arena& arena) {
    return text == nullptr ? nullptr : String::create(arena, message);
  });
}

CMPIString* getMessage2(const CMPIBroker* broker, const char* /*id*/, CMPIMsgFileHandle /*file*/,
                        const char* text, CMPIStatus* status, CMPICount count, ...) {
  va_list inserts;
  va_start(inserts, count);
  const std::string message = formatMessage(text, count, inserts);
  va_end(inserts);
  return make(broker, status, CMPI_RC_ERR_INVALID_PARAMETER, [&](Broker::State& /*state*/, Arena& arena) {
    return text == nullptr ? nullptr : String::create(arena, message);
  });
}

}  // namespace

CMPIBrokerEncFT encapsulationTable = {
    tableVersion,
    newInstance,
    newObjectPath,
    newArgs,
    newString,
    newArray,
    newDateTime,
    newDateTimeFromBinary,
    newDateTimeFromChars,
    newSelectExp,
    classPathIsA,
    toString,
    isOfType,
    getType,
    getMessage,
    logMessage,
    trace,
    newCMPIError,
    openMessageFile,
    closeMessageFile,
    getMessage2,
};

}  // namespace cimom
