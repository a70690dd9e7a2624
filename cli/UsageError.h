// A command line that makes no sense.
#pragma once

#include <stdexcept>

namespace cli {

/// The text says why.
class UsageError : public std::runtime_error {
 public:
  using std::runtime_error::runtime_error;
};

}  // namespace cli
