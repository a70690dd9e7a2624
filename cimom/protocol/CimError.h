// CIM's own errors, as operations answer them.
#pragma once

#include <cmpi/cmpidt.h>

#include <stdexcept>
#include <string>
#include <string_view>

namespace cimom::protocol {

// The statuses that DSP0200 has and CMPI, which knows no open enumerations, does not.
inline constexpr auto invalidEnumerationContext = static_cast<CMPIrc>(21);
inline constexpr auto invalidOperationTimeout = static_cast<CMPIrc>(22);
inline constexpr auto pullHasBeenAbandoned = static_cast<CMPIrc>(23);
inline constexpr auto filteredEnumerationNotSupported = static_cast<CMPIrc>(25);
inline constexpr auto continuationOnErrorNotSupported = static_cast<CMPIrc>(26);
inline constexpr auto serverLimitsExceeded = static_cast<CMPIrc>(27);
inline constexpr auto serverIsShuttingDown = static_cast<CMPIrc>(28);

/// Ends an operation with a status.
class CimError : public std::runtime_error {
 public:
  CimError(CMPIrc code, const std::string& description) : std::runtime_error(description), code_(code) {}
  [[nodiscard]] CMPIrc code() const { return code_; }

 private:
  CMPIrc code_;
};

/// A status as clients may see it: CMPI's own codes, which are none of CIM's, are CIM_ERR_FAILED.
[[nodiscard]] CMPIrc cimStatus(CMPIrc code);

/// What was said about an error, else what its code says. Never empty.
[[nodiscard]] std::string describe(CMPIrc code, std::string_view description);

}  // namespace cimom::protocol
