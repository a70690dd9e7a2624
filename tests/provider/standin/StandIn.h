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
#include <optional>
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
  std::optional<int> sensorType = std::nullopt;  ///< where it is not the type
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
  std::vector<std::pair<std::string, Path*>> references;  ///< reference keys; a null one was set to null
};

/// A path as a text, "Class.Key=value,Reference={...}" without its namespace; "(null)" for null.
std::string describe(const Path* path);

struct Instance {
  CMPIInstance cmpi{};
  Path* path = nullptr;
  /// In the order in which they were set; arrays as "[1,2]", datetimes as "datetime:" and the text,
  /// references as their paths are described.
  std::vector<std::pair<std::string, std::string>> properties;
};

/// How the broker answers the enumeration of a class that another provider serves.
struct Served {
  CMPIrc status = CMPI_RC_OK;
  bool enumerationIsNull = false;
  std::vector<Instance*> instances;
  bool narrows = true;                        ///< leaves out what differs from the keys of the path
  std::size_t failingElement = 0;             ///< getNext of the element with this number (from 1) fails
  std::vector<CMPIBoolean> hasNextAnswers{};  ///< given first, in this order; then 1 or 0, as it is
};

/// An enumeration of instances that was asked of the broker.
struct Upcall {
  const CMPIBroker* broker = nullptr;
  const CMPIContext* context = nullptr;
  const Path* path = nullptr;
  const char** properties = nullptr;
};

/// How the call that was picked fails: with its own bad result (false, null, empty, a cursor on no node, a
/// status other than OK), or, cursor calls alone, by throwing Oru::InstrumentationException, another
/// exception, or what is no exception at all.
enum class Fault { Result, Throw, ThrowOther, ThrowNumber };

struct World {
  World();
  ~World();

  // What there is.
  std::vector<Node> nodes;
  bool missingTypeThrows = true;         ///< selectNode of a type without nodes throws, or stands on no node
  bool emptyFilterThrows = true;         ///< setFilter that nothing passes throws, or stands on no node
  std::map<std::string, Served> served;  ///< by class; the broker does not know any other
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
  std::vector<Upcall> upcalls;
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
  /// An instance of another provider: its keys are its properties, too.
  Instance* newInstance(std::string className, std::vector<std::pair<std::string, std::string>> keys);
  CMPIResult* result();
  /// A broker of that name, whose enumerations `served` answers.
  CMPIBroker newBroker(const char* name = "recording stand-in");
  CMPIEnumeration* newEnumeration(const Served& answer, const Path& path);

  const Node* find(const std::string& text) const;

  /// Behind a CMPIEnumeration.
  struct Enumeration {
    CMPIEnumeration cmpi{};
    Served answer;
    std::size_t next = 0;
    std::size_t hasNextCalls = 0;
  };

 private:
  std::vector<std::unique_ptr<Path>> paths_;
  std::vector<std::unique_ptr<Instance>> instances_;
  std::vector<std::unique_ptr<Enumeration>> enumerations_;
  std::vector<std::unique_ptr<CMPIBrokerFT>> brokerTables_;
  CMPIResult result_{};
};

/// The world of this process (of this copy of the stand-in).
World& world();

}  // namespace standin
