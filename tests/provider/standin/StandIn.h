// A stand-in for the framework and the object manager: a small scripted world that records every call, in
// order.
//
// It is linked into tests beside the provider's objects, and built as a liboru.so for the loaded provider
// library. Paths are "/" and the text, so that a path taken for its text, or the reverse, shows.
#pragma once

#include <cmpi/cmpift.h>

#include <cstddef>
#include <functional>
#include <map>
#include <memory>
#include <string>
#include <utility>
#include <vector>

namespace standin {

struct Node {
  int type = 0;
  std::string text;      ///< its path's text
  std::string parent;    ///< its parent's path text; empty: none
  std::string computer;  ///< its computer's path text
  std::string description;
  std::map<int, std::string> texts;
  std::map<int, unsigned int> numbers;
};

struct LogLine {
  bool trace = false;  ///< to the trace channel
  std::string function;
  std::string file;
  unsigned int line = 0;
  std::string category;
  int level = 0;
  std::string text;
  bool reservedArgumentsEmpty = false;
};

struct Path {
  CMPIObjectPath cmpi{};
  std::string className;
  std::string nameSpace;
  std::vector<std::pair<std::string, std::string>> keys;
};

struct Instance {
  CMPIInstance cmpi{};
  Path* path = nullptr;
  /// In the order in which they were set; arrays as "[1,2]", datetimes as "datetime:" and the text.
  std::vector<std::pair<std::string, std::string>> properties;
};

/// How the call that was picked fails: with its own bad result (false, null, empty, a cursor on no node, a
/// status other than OK), or by throwing Oru::InstrumentationException (cursor calls alone).
enum class Fault { Result, Throw };

struct World {
  World();
  ~World();

  // What there is.
  std::vector<Node> nodes;
  bool missingTypeThrows = true;  ///< selectNode of a type without nodes throws, or stands on no node
  std::map<std::string, unsigned short> classIds;
  std::map<std::string, std::vector<std::string>> ancestors;  ///< of classes the framework has no id for
  CMPIrc classNameStatus = CMPI_RC_OK;
  bool writeSucceeds = true;
  bool logOn = true;    ///< routine level of the log channel
  bool traceOn = true;  ///< routine level of the trace channel

  // What happened.
  std::vector<std::string> calls;  ///< of framework cursor, helpers and broker; not of the logger
  std::vector<LogLine> log;
  std::vector<Path*> returnedPaths;
  std::vector<Instance*> returnedInstances;  ///< null where null was returned
  int done = 0;
  std::vector<const CMPIBroker*> brokersUsed;
  std::vector<unsigned int> written;  ///< by the last setProperty

  // Faults: the call with this number (from 1) fails. 0: none does.
  std::size_t failAt = 0;
  Fault fault = Fault::Result;
  bool faultReached = false;  ///< the call with that number was made
  bool faultApplied = false;  ///< and could fail in that way
  std::string faultCall;

  /// Records a call of the framework or the broker. True when it must fail with its bad result; throws when
  /// it must throw. Calls that do not throw by contract are recorded with `mayThrow` false.
  bool record(std::string call, bool mayThrow, bool hasBadResult = true);

  /// Forgets what happened; keeps what there is.
  void forget();

  // Objects for requests; they live as long as the world.
  Path* newPath(std::string className, std::string nameSpace = "root/cimv2");
  Instance* newInstance(Path* path);
  CMPIResult* result();

  const Node* find(const std::string& text) const;

 private:
  std::vector<std::unique_ptr<Path>> paths_;
  std::vector<std::unique_ptr<Instance>> instances_;
  CMPIResult result_{};
};

/// The world of this process (of this copy of the stand-in).
World& world();

}  // namespace standin
