// Elements of DSP0203 as plain data. Each function throws `RequestError` where the element is not as the
// document type has it.
#pragma once

#include <cimom/xml/Document.h>
#include <cimom/xml/Request.h>

#include <cstddef>
#include <initializer_list>
#include <string>
#include <string_view>
#include <vector>

namespace cimom::xml {

/// Goes over the children of an element that holds elements alone, in their order.
class Children {
 public:
  explicit Children(const Node& parent);

  /// The next child if it has one of these names, else null.
  const Node* take(std::initializer_list<std::string_view> names);
  const Node* take(std::string_view name) { return take({name}); }
  /// The next child, which must have one of these names.
  const Node& expect(std::initializer_list<std::string_view> names);
  const Node& expect(std::string_view name) { return expect({name}); }
  /// There must be no more.
  void end() const;

 private:
  const Node& parent_;
  std::size_t next_ = 0;
};

/// The attribute's text; a missing one is an error.
[[nodiscard]] const std::string& required(const Node& node, std::string_view attributeName);

/// The text of an element that holds text alone.
[[nodiscard]] const std::string& textOnly(const Node& node);

/// LOCALNAMESPACEPATH: the names with slashes between them.
[[nodiscard]] std::string readNameSpace(const Node& node);
/// CLASSNAME, INSTANCENAME and the paths with them.
[[nodiscard]] ObjectName readObjectName(const Node& node);
/// VALUE.REFERENCE.
[[nodiscard]] ObjectName readReference(const Node& node);
[[nodiscard]] InstanceElement readInstanceElement(const Node& node);
/// IPARAMVALUE.
[[nodiscard]] Parameter readParameter(const Node& node);

}  // namespace cimom::xml
