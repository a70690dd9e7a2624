// The small CMPI of the tests with the manners of object managers that are in use: some check what others let
// pass, count what is not set, and lack what the standard has.
//
// Each manner is a switch; without any it is a FakeCmpi. One thread at a time.
#pragma once

#include "tests/support/FakeCmpi.h"

#include <functional>
#include <map>
#include <optional>
#include <string>
#include <utility>
#include <vector>

namespace tests {

class HostileCmpi : public FakeCmpi {
 public:
  HostileCmpi();
  ~HostileCmpi();

  /// The keys of classes: a path counts those of its class before others, set or not. Reading one that is not
  /// set is an error.
  std::map<std::string, std::vector<std::string>> countedKeys;

  /// The type that a class declares for a property, or nothing. With it, a value of another type answers
  /// CMPI_RC_ERR_INVALID_DATA_TYPE, a property that is not declared answers OK, and neither is set; a
  /// property that is declared and not set reads as a null of its type.
  using TypeOf =
      std::function<std::optional<CMPIType>(const std::string& className, const std::string& property)>;
  TypeOf typeOf;
  std::vector<std::string> refused;  ///< CLASS.PROPERTY of each value of another type
  std::vector<std::string> unknown;  ///< of each property that is not declared

  bool instancesTakeKeys = false;  ///< a new instance has the keys of its path as properties

  /// The broker's factory ends behind the members of CMPI 1.0; whoever reads beyond ends the program. Members
  /// are as they stand now.
  void endFactoryEarly();

  /// Ends every object that was made, as the end of a request does.
  void dropObjects();

  using Values = std::vector<std::pair<std::string, CMPIData>>;
  /// What was set, in the order of setting.
  static Values keysOf(const CMPIObjectPath* path);
  static Values propertiesOf(const CMPIInstance* instance);
  static const CMPIObjectPath* pathOf(const CMPIInstance* instance);
  static CMPIType elementTypeOf(const CMPIArray* array);

 private:
  /// A key of a path by its index, or nothing where the index is that of one that is not set.
  static const Entry* keyAt(const PathObject& path, CMPICount index);
  static std::vector<std::string> countedNames(const PathObject& path);
  void fillHostileTables();

  void* pages_ = nullptr;
};

}  // namespace tests
