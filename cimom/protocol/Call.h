// One operation that is under way.
#pragma once

#include <cimom/ObjectManager.h>
#include <cimom/broker/Arena.h>
#include <cimom/mof/ClassRepository.h>
#include <cimom/protocol/Arguments.h>
#include <cimom/protocol/CimError.h>
#include <cimom/protocol/ContextTable.h>
#include <cimom/protocol/Endpoint.h>
#include <cimom/protocol/Reply.h>
#include <cimom/xml/Request.h>
#include <cimom/xml/Writer.h>

#include <functional>
#include <string>
#include <string_view>

namespace cimom::protocol {

struct Call {
  ObjectManager& manager;
  const EndpointSettings& settings;
  ContextTable& contexts;
  const xml::MethodCall& method;
  const Arguments& arguments;
  Reply& reply;
  const xml::Location location;  ///< for paths in the answer
  const std::string user;

  /// The class of this name. Throws `CimError` with `code` where the schema lacks it.
  const SchemaClass& schemaClass(std::string_view name, CMPIrc code) const;
  /// Makes the path that an argument names, in the namespace of the request, whenever it is needed. Throws
  /// `CimError` where it is in another one; what it returns throws `xml::ConversionError`.
  [[nodiscard]] std::function<const ObjectPath&(Arena&)> pathMaker(const xml::ObjectName& name) const;
  /// The namespace of the request, for enumerations of whoever sent it.
  [[nodiscard]] Owner owner() const { return {user, method.nameSpace}; }
  /// Throws `CimError` for an outcome that is none of success.
  static void require(const Outcome& outcome);
};

/// Objects of instances: `ask` hands them to the sink that it is given. `manager` must outlive the source;
/// everything else is copied.
[[nodiscard]] Source instanceSource(ObjectManager& manager, xml::InstanceOptions options,
                                    std::function<Outcome(const InstanceSink&)> ask);
[[nodiscard]] Source pathSource(xml::PathForm form, xml::Location location,
                                std::function<Outcome(const PathSink&)> ask);

/// Delivers everything as the answer.
void answerWith(Call& call, const Source& source);

/// Opens an enumeration with the parameters that all open operations share, and answers with its first part.
void openWith(Call& call, Pulled pulled, Source source);

}  // namespace cimom::protocol
