// What the provider says of itself: one vocabulary of texts, sent to the logger's two channels.
//
// Every event is formatted by a helper into that helper's static buffer, and goes first to the log and then
// to the trace channel, formatted afresh for each. Where the logger can tell that a level is off for a
// channel, nothing is formatted for it. A call site says an event once; function, file and line come by
// themselves, the file relative to provider/ by the compiler's prefix map.
//
// `TraceScope` says entry and exit, with parameters at entry where there are any, `ParameterScope` with
// parameters at both; `traceMethod` that a function which
// does little was invoked; `traceMessage`, `traceVariable` and `traceException` say what they are named
// after, the last at the error level.
//
// Threads: each thread formats into buffers of its own.
#pragma once

#include <Oru/Moniker.h>
#include <ZelLog/ZelLogger.h>
#include <ZelLog/ZelMessageBuffer.h>

#include <atomic>
#include <cstdio>
#include <cstring>
#include <exception>
#include <locale>
#include <sstream>
#include <string>
#include <tuple>

namespace Oru::SoftwareInventoryProfileProvider {

/// Kind of a message. Any other value counts as ENTERING.
enum MessageType { ENTERING = 0, EXITING = 1, METHOD = 2, MESSAGE = 3 };

inline constexpr const char* traceCategory = "Corvane.SoftwareInventoryProvider";
inline constexpr int routineLevel = 4000;
inline constexpr int errorLevel = 3000;
inline constexpr std::size_t traceBufferSize = 512;
inline constexpr const char* traceSeparator =
    "==============================================================================";

/// The place that reports an event: `CallSite::here()` as a default argument is the caller's.
struct CallSite {
  const char* function;
  const char* file;
  unsigned int line;

  static constexpr CallSite here(const char* function = __builtin_FUNCTION(),
                                 const char* file = __builtin_FILE(), unsigned int line = __builtin_LINE()) {
    return {function, file, line};
  }
};

/// A logger category and the place that names it: made where a category is handed to a function of this
/// header.
struct LogPoint {
  // Not explicit, so that a call site names the category alone.
  LogPoint(const std::string& category,
           CallSite place = CallSite::here())  // NOLINT(google-explicit-constructor)
      : logger(category), site(place) {}

  const std::string& logger;
  CallSite site;
};

// ---- The texts. Each helper returns its own buffer, of the calling thread, and cuts longer texts at 511
// characters.

namespace trace_detail {

using Buffer = char[traceBufferSize];

inline const char* orNull(const char* text) {
  return text != nullptr ? text : "(null)";
}

template <typename... Values>
char* format(Buffer& buffer, const char* pattern, Values... values) {
  std::memset(buffer, 0, sizeof(buffer));
#pragma GCC diagnostic push
#pragma GCC diagnostic ignored "-Wformat-nonliteral"
#pragma GCC diagnostic ignored "-Wformat-security"
  static_cast<void>(std::snprintf(buffer, sizeof(buffer), pattern, values...));
#pragma GCC diagnostic pop
  return buffer;
}

}  // namespace trace_detail

/// The text of an event. `text` is a function name, or for MESSAGE the message.
inline char* trace(const char* text, const char* file, unsigned int line, MessageType type) {
  static thread_local trace_detail::Buffer buffer;
  const char* name = trace_detail::orNull(text);
  const char* source = trace_detail::orNull(file);
  switch (type) {
    case EXITING:
      return trace_detail::format(buffer, "EXITING: %s() in %s [Line: %d]", name, source, line);
    case METHOD:
      return trace_detail::format(buffer, "METHOD: %s() was invoked in %s [Line: %d]", name, source, line);
    case MESSAGE:
      return trace_detail::format(buffer, "MESSAGE [File: %s, Line: %d]: %s", source, line, name);
    default:
      return trace_detail::format(buffer, "ENTERING: %s() in %s [Line: %d]", name, source, line);
  }
}

/// The text of an event with the function's parameters.
inline char* tracepara(const char* text, const char* file, unsigned int line, const char* parameters,
                       MessageType type) {
  static thread_local trace_detail::Buffer buffer;
  const char* name = trace_detail::orNull(text);
  const char* source = trace_detail::orNull(file);
  const char* list = trace_detail::orNull(parameters);
  switch (type) {
    case EXITING:
      return trace_detail::format(buffer, "EXITING: %s() in %s [Line: %d],Parameters List: %s", name, source,
                                  line, list);
    case METHOD:
      return trace_detail::format(buffer, "METHOD: %s() was invoked in %s [Line: %d],Parameters List: %s",
                                  name, source, line, list);
    case MESSAGE:
      return trace_detail::format(buffer, "MESSAGE [File: %s, Line: %d]: %s,Parameters List: %s", source,
                                  line, name, list);
    default:
      return trace_detail::format(buffer, "ENTERING: %s() in %s [Line: %d],Parameters List: %s", name, source,
                                  line, list);
  }
}

/// The text of a variable. `name` is the variable as written in the source; null values print as "(null)".
inline char* trace(const char* name, const char* file, unsigned int line, const char* value) {
  static thread_local trace_detail::Buffer buffer;
  return trace_detail::format(buffer, "VARIABLE: '%s' has Value '%s' at line %d in %s",
                              trace_detail::orNull(name), trace_detail::orNull(value), line,
                              trace_detail::orNull(file));
}

inline char* trace(const char* name, const char* file, unsigned int line, const std::string& value) {
  return trace(name, file, line, value.c_str());
}

/// The text of an integer variable.
inline char* traceInteger(const char* name, const char* file, unsigned int line, int value) {
  static thread_local trace_detail::Buffer buffer;
  return trace_detail::format(buffer, "VARIABLE: '%s' has Value '%d' at line %d in %s",
                              trace_detail::orNull(name), value, line, trace_detail::orNull(file));
}

/// A moniker as its name=value pairs, joined by commas. The moniker's own key selection stays where it is.
inline std::string monikerText(Moniker moniker) {
  std::string text;
  for (unsigned int i = 0; i < moniker.getKeyCount(); ++i) {
    std::string name;
    std::string value;
    if (!moniker.selectKey(i) || !moniker.getName(name) || !moniker.getValue(value)) {
      continue;
    }
    if (!text.empty()) {
      text += ',';
    }
    text.append(name).append("=").append(value);
  }
  return text;
}

// ---- The events.

namespace trace_detail {

// A logger library may lack the test; then every level counts as on.
inline bool isOn(ZelLog::ZelChannel channel, int level) {
  return &ZelLog::ZelLogger::isLevelOn == nullptr || ZelLog::ZelLogger::isLevelOn(channel, level);
}

/// What the logger said of the routine level when the last request began. Scopes are entered some forty times
/// for each published instance: they look here, and ask the logger only where a channel takes what they have
/// to say.
enum class RoutineEvents : unsigned char { Unknown, Off, On };
inline std::atomic<RoutineEvents> routineEvents{RoutineEvents::Unknown};

inline bool mayBeOn(int level) {
  return level < routineLevel || routineEvents.load(std::memory_order_relaxed) != RoutineEvents::Off;
}

/// Sends the text that `text` makes to each channel that takes the level.
template <typename Text>
void emit(const LogPoint& point, int level, Text text) {
  if (!mayBeOn(level)) {
    return;
  }
  if (isOn(ZelLog::ZelChannel::Log, level)) {
    ZelLog::ZelMessageBuffer buffer;
    ZelLog::ZelLogger::logLevelMessage(point.site.function, point.site.file, point.site.line, point.logger,
                                       level, nullptr, 0, 0, str(buffer << text()));
  }
  if (isOn(ZelLog::ZelChannel::Trace, level)) {
    ZelLog::ZelMessageBuffer buffer;
    ZelLog::ZelLogger::traceLevelMessage(point.site.function, point.site.file, point.site.line, point.logger,
                                         level, nullptr, 0, 0, str(buffer << text()));
  }
}

[[gnu::noinline]] inline void emitEvent(const LogPoint& point, int level, MessageType type) {
  emit(point, level, [&] { return trace(point.site.function, point.site.file, point.site.line, type); });
}

[[gnu::noinline]] inline void emitEvent(const LogPoint& point, int level, MessageType type,
                                        const std::string& parameters) {
  emit(point, level, [&] {
    return tracepara(point.site.function, point.site.file, point.site.line, parameters.c_str(), type);
  });
}

template <typename Value>
void appendParameter(std::ostream& list, const Value& value) {
  list << value;
}
inline void appendParameter(std::ostream& list, const Moniker& value) {
  list << monikerText(value);
}

template <typename... Values>
std::string parameterList(const Values&... values) {
  std::ostringstream list;
  list.imbue(std::locale::classic());
  (appendParameter(list, values), ...);
  return list.str();
}

}  // namespace trace_detail

/// Learns from the logger whether routine events are of any use. Every function of the provider interface
/// begins with it: a change of the level shows from the next request on.
inline void beginRequest() {
  using trace_detail::RoutineEvents;
  const bool on = trace_detail::isOn(ZelLog::ZelChannel::Log, routineLevel) ||
                  trace_detail::isOn(ZelLog::ZelChannel::Trace, routineLevel);
  trace_detail::routineEvents.store(on ? RoutineEvents::On : RoutineEvents::Off, std::memory_order_relaxed);
}

/// One METHOD event, of a function that has no entry and exit worth telling apart.
inline void traceMethod(const LogPoint& point) {
  trace_detail::emitEvent(point, routineLevel, METHOD);
}

/// One MESSAGE event with a free text.
inline void traceMessage(const LogPoint& point, const char* text) {
  trace_detail::emit(point, routineLevel,
                     [&] { return trace(text, point.site.file, point.site.line, MESSAGE); });
}

/// One MESSAGE event at the error level, with the exception's text.
inline void traceException(const LogPoint& point, const std::exception& exception) {
  trace_detail::emit(point, errorLevel,
                     [&] { return trace(exception.what(), point.site.file, point.site.line, MESSAGE); });
}

/// One variable with its value.
inline void traceVariable(const LogPoint& point, const char* name, const std::string& value) {
  trace_detail::emit(point, routineLevel,
                     [&] { return trace(name, point.site.file, point.site.line, value); });
}
inline void traceVariable(const LogPoint& point, const char* name, const char* value) {
  trace_detail::emit(point, routineLevel,
                     [&] { return trace(name, point.site.file, point.site.line, value); });
}
inline void traceVariable(const LogPoint& point, const char* name, int value) {
  trace_detail::emit(point, routineLevel,
                     [&] { return traceInteger(name, point.site.file, point.site.line, value); });
}

/// Entry and exit of a function: ENTERING, with the parameters where there are any, when it is made; EXITING
/// when the function returns. A function that is left by an exception has no exit event: the trace shows how
/// deep it came from. Both events name the line of the scope. An entry that went nowhere has no exit either,
/// so that a scope asks once: nearly all there is to a getter without a value is its scope.
class TraceScope {
 public:
  template <typename... Parameters>
  explicit TraceScope(const LogPoint& point, const Parameters&... parameters) : point_(point) {
    if (trace_detail::mayBeOn(routineLevel)) [[unlikely]] {
      exceptionsAtEntry_ = std::uncaught_exceptions();
      enter(point.logger, point.site.function, point.site.file, point.site.line, parameters...);
    }
  }

  ~TraceScope() {
    if (exceptionsAtEntry_ != notTraced) [[unlikely]] {
      leave(point_.logger, point_.site.function, point_.site.file, point_.site.line, exceptionsAtEntry_);
    }
  }

  TraceScope(const TraceScope&) = delete;
  TraceScope& operator=(const TraceScope&) = delete;

 private:
  static constexpr int notTraced = -1;

  // These take the point in pieces: a scope of which nobody sees more than its parts is never put together in
  // memory, so that one without a trace costs its look at the gate and no more.

  template <typename... Parameters>
  [[gnu::noinline, gnu::cold]] static void enter(const std::string& logger, const char* function,
                                                 const char* file, unsigned int line,
                                                 const Parameters&... parameters) {
    const LogPoint point(logger, {function, file, line});
    if constexpr (sizeof...(parameters) == 0) {
      trace_detail::emitEvent(point, routineLevel, ENTERING);
    } else {
      trace_detail::emitEvent(point, routineLevel, ENTERING, trace_detail::parameterList(parameters...));
    }
  }

  [[gnu::noinline, gnu::cold]] static void leave(const std::string& logger, const char* function,
                                                 const char* file, unsigned int line, int exceptionsAtEntry) {
    if (std::uncaught_exceptions() <= exceptionsAtEntry) {
      trace_detail::emitEvent({logger, {function, file, line}}, routineLevel, EXITING);
    }
  }

  LogPoint point_;
  int exceptionsAtEntry_ = notTraced;
};

/// One ENTERING or EXITING event with parameters, at a level of the function's own.
template <typename... Parameters>
void traceEntering(const LogPoint& point, int level, const Parameters&... parameters) {
  if (trace_detail::mayBeOn(level)) {
    trace_detail::emitEvent(point, level, ENTERING, trace_detail::parameterList(parameters...));
  }
}
template <typename... Parameters>
void traceExiting(const LogPoint& point, int level, const Parameters&... parameters) {
  if (trace_detail::mayBeOn(level)) {
    trace_detail::emitEvent(point, level, EXITING, trace_detail::parameterList(parameters...));
  }
}

/// Entry and exit of a function whose parameters are of interest at both: otherwise as `TraceScope`. The
/// parameters must outlive the scope.
template <typename... Parameters>
class ParameterScope {
 public:
  explicit ParameterScope(const LogPoint& point, const Parameters&... parameters)
      : point_(point), parameters_(parameters...) {
    traceEntering(point_, routineLevel, parameters...);
  }

  ~ParameterScope() {
    if (std::uncaught_exceptions() <= exceptionsAtEntry_) {
      std::apply([this](const auto&... each) { traceExiting(point_, routineLevel, each...); }, parameters_);
    }
  }

  ParameterScope(const ParameterScope&) = delete;
  ParameterScope& operator=(const ParameterScope&) = delete;

 private:
  LogPoint point_;
  std::tuple<const Parameters&...> parameters_;
  int exceptionsAtEntry_ = std::uncaught_exceptions();
};

/// The banner at the start of every function of the provider interface that does real work: the separator
/// line, as this helper's own event, then ENTERING for the function.
inline void markProviderEntry(const std::string& logger, const char* function = __builtin_FUNCTION(),
                              const char* file = __builtin_FILE(), unsigned int line = __builtin_LINE()) {
  if (trace_detail::mayBeOn(routineLevel)) {
    trace_detail::emit(logger, routineLevel, [] { return traceSeparator; });
    trace_detail::emitEvent(LogPoint(logger, {function, file, line}), routineLevel, ENTERING);
  }
}

/// Its mirror at the end: EXITING, then the separator line.
inline void markProviderExit(const std::string& logger, const char* function = __builtin_FUNCTION(),
                             const char* file = __builtin_FILE(), unsigned int line = __builtin_LINE()) {
  if (trace_detail::mayBeOn(routineLevel)) {
    trace_detail::emitEvent(LogPoint(logger, {function, file, line}), routineLevel, EXITING);
    trace_detail::emit(logger, routineLevel, [] { return traceSeparator; });
  }
}

}  // namespace Oru::SoftwareInventoryProfileProvider
