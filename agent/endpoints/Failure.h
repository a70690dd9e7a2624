// How a request ends without success.
#pragma once

#include <cmpi/cmpidt.h>

#include <stdexcept>
#include <string>

namespace agent::endpoints {

/// Why a request ends without success: the status of the answer, and its message.
class Failure : public std::runtime_error {
 public:
  Failure(CMPIrc code, const std::string& message) : std::runtime_error(message), code_(code) {}
  [[nodiscard]] CMPIrc code() const { return code_; }

 private:
  CMPIrc code_;
};

}  // namespace agent::endpoints
