// What is the same in all instances of a class: which properties are shown, and the text around their values.
#pragma once

#include <cimom/broker/ClassTable.h>
#include <cimom/mof/ClassRepository.h>
#include <cimom/xml/InstanceWriter.h>
#include <cimom/xml/PathWriter.h>

#include <cstddef>
#include <cstdint>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

namespace cimom::xml {

struct PropertyPlan {
  std::uint16_t index = 0;  ///< among the properties of the class
  CMPIType type = CMPI_null;
  std::string open;                       ///< up to the value; with the tag VALUE where it is a single one
  std::string_view close = {};            ///< from the value on
  std::unique_ptr<PathWriter> reference;  ///< of a reference
  std::size_t nullBegin = 0;              ///< its null in `InstancePlan::nulls`
  std::size_t nullEnd = 0;
};

struct InstancePlan {
  std::string open;  ///< INSTANCE with the qualifiers of its class
  std::vector<PropertyPlan> properties;
  std::string nulls;  ///< the nulls of all properties, one after the other: runs of them are copied at once
};

[[nodiscard]] InstancePlan makePlan(const ClassInfo& info, const ClassRepository& classes,
                                    const InstanceOptions& options);

}  // namespace cimom::xml
