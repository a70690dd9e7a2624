// Where the objects of an answer go, written in XML.
#pragma once

#include <cimom/Outcome.h>

#include <functional>
#include <string>

namespace cimom::protocol {

class ObjectSink {
 public:
  virtual ~ObjectSink() = default;

  /// To be appended to: the next object. Each call is followed by one of `objectDone`.
  virtual std::string& object() = 0;

  /// False: nobody wants more.
  virtual bool objectDone() = 0;
};

/// Delivers the objects of an answer, one by one, and says how that ended. Throws what the sink throws, and
/// `CimError` or `xml::ConversionError` before the first object.
using Source = std::function<Outcome(ObjectSink&)>;

}  // namespace cimom::protocol
