// A small CMPI implementation for tests: broker factory, object paths, instances, strings, arrays, datetimes.
//
// Each FakeCmpi has tables of its own, which a test may alter (a member set to null is a member that the
// object manager lacks). It counts its calls by the name of the table member, makes chosen calls fail, and
// owns every object that it makes, to its own end. One thread at a time.
#pragma once

#include <cmpi/cmpidt.h>
#include <cmpi/cmpift.h>

#include <deque>
#include <functional>
#include <map>
#include <optional>
#include <string>
#include <vector>

namespace tests {

class FakeCmpi {
 public:
  /// How a call fails: by a status other than OK, by a null answer with status OK, or with both.
  enum class Fault { Status, Null, Both };

  FakeCmpi();
  FakeCmpi(const FakeCmpi&) = delete;
  FakeCmpi& operator=(const FakeCmpi&) = delete;

  [[nodiscard]] const CMPIBroker* broker() const { return &broker_; }

  // Objects made without a call of the broker. A null text makes a string whose characters are null.
  CMPIString* string(const char* text);
  CMPIObjectPath* path(const char* nameSpace, const char* className);
  CMPIInstance* instance(const char* nameSpace, const char* className);
  CMPIData stringData(const char* text);
  void setKey(CMPIObjectPath* path, const char* name, const CMPIData& data);
  void setProperty(CMPIInstance* instance, const char* name, const CMPIData& data);

  // What was set, found by its exact name.
  static std::optional<CMPIData> key(const CMPIObjectPath* path, const std::string& name);
  static std::optional<CMPIData> property(const CMPIInstance* instance, const std::string& name);
  static std::vector<CMPIData> elements(const CMPIArray* array);
  static std::string text(const CMPIData& data);          ///< of a string value
  static std::string text(const CMPIDateTime* dateTime);  ///< as the datetime was made from
  static const std::string& nameSpaceOf(const CMPIObjectPath* path);
  static const std::string& classOf(const CMPIObjectPath* path);

  /// Another provider behind the broker: fills in the instances of an enumeration, or gives its status.
  using InstanceSource = std::function<CMPIrc(const CMPIObjectPath*, std::vector<CMPIInstance*>&)>;

  // What a test may alter.
  CMPIBrokerFT upcalls;
  CMPIBrokerEncFT factory;
  CMPIStringFT stringTable;
  CMPIObjectPathFT pathTable;
  CMPIInstanceFT instanceTable;
  CMPIArrayFT arrayTable;
  CMPIDateTimeFT dateTimeTable;
  CMPIEnumerationFT enumerationTable;
  InstanceSource source;  ///< answers the broker's enumerateInstances; without it no class is known
  std::map<std::string, std::string> parentOf;  ///< the class schema: class to its parent
  bool caseMatters = false;                     ///< compare key and property names exactly
  bool findsNothingQuietly = false;             ///< a missing name gives status OK and the state "not found"
  std::map<std::string, Fault> faults;          ///< by table member; each of its calls fails so
  std::vector<std::string> calls;               ///< table members, in the order of their calls

 protected:
  struct Entry {
    std::string name;
    CMPIData data;
  };
  struct StringObject {
    CMPIString handle;
    FakeCmpi* owner;
    std::optional<std::string> text;
  };
  struct PathObject {
    CMPIObjectPath handle;
    FakeCmpi* owner;
    std::string nameSpace;
    std::string className;
    std::vector<Entry> keys;
  };
  struct InstanceObject {
    CMPIInstance handle;
    FakeCmpi* owner;
    const CMPIObjectPath* path;
    std::vector<Entry> properties;
  };
  struct ArrayObject {
    CMPIArray handle;
    FakeCmpi* owner;
    CMPIType type;
    std::vector<CMPIData> elements;
  };
  struct DateTimeObject {
    CMPIDateTime handle;
    FakeCmpi* owner;
    std::string text;
  };
  struct EnumerationObject {
    CMPIEnumeration handle;
    FakeCmpi* owner;
    std::vector<CMPIInstance*> instances;
    std::size_t next;
  };

  template <typename Object, typename Handle>
  static Object* of(const Handle* handle) {
    return static_cast<Object*>(handle->hdl);
  }
  template <typename Answer>
  Answer answer(const char* member, CMPIStatus* status, Answer good);
  CMPIStatus answer(const char* member);
  CMPIData find(const char* member, const std::vector<Entry>& entries, const char* name, CMPIStatus* status);
  CMPIData at(const char* member, const std::vector<Entry>& entries, CMPICount index, CMPIString** name,
              CMPIStatus* status);
  CMPIData store(const CMPIValue* value, CMPIType type);
  static void put(std::vector<Entry>& entries, const char* name, const CMPIData& data);
  CMPIInstance* newInstance(const CMPIObjectPath* path);
  void fillFactory();
  void fillUpcalls();
  void fillPathTable();
  void fillObjectTables();

  CMPIBroker broker_;
  std::deque<StringObject> strings_;
  std::deque<PathObject> paths_;
  std::deque<InstanceObject> instances_;
  std::deque<ArrayObject> arrays_;
  std::deque<DateTimeObject> dateTimes_;
  std::deque<EnumerationObject> enumerations_;
};

}  // namespace tests
