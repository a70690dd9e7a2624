// How a request ended.
#pragma once

#include <cimom/broker/Broker.h>

#include <cstddef>

namespace cimom {

/// A CIM status with its description, empty where there is nothing to add.
using Status = UpcallStatus;

/// What was delivered before stays delivered, whatever this says.
struct Outcome {
  Status status;
  /// The provider sent the done marker. False after an OK means: it stopped early, for a reason in its own
  /// log.
  bool done = false;
  std::size_t delivered = 0;  ///< objects handed to the sink
};

}  // namespace cimom
