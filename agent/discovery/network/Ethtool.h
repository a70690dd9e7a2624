// The ethtool requests that ask a driver about itself and its hardware, and what their answers say.
#pragma once

#include <memory>
#include <optional>
#include <string>
#include <string_view>

namespace agent::discovery {

/// Asks a network driver about itself. Called from the thread of the network source alone; a call may hang,
/// and then is left behind together with that thread.
class Ethtool {
 public:
  struct Answer {
    int error = 0;      ///< an errno value; 0: the driver answered
    std::string bytes;  ///< what came, where the driver answered
  };

  Ethtool() = default;
  Ethtool(const Ethtool&) = delete;
  Ethtool& operator=(const Ethtool&) = delete;
  virtual ~Ethtool() = default;

  /// The driver info (`ETHTOOL_GDRVINFO`) of the interface with that name: the kernel's `struct
  /// ethtool_drvinfo`, for `parseDriverInfo`.
  virtual Answer driverInfo(const std::string& interfaceName) = 0;

  /// The address that the hardware of the interface came with (`ETHTOOL_GPERMADDR`), byte by byte; no bytes
  /// where the driver knows none.
  virtual Answer permanentAddress(const std::string& interfaceName) = 0;
};

/// The running kernel's: `ioctl(SIOCETHTOOL)` on a socket of its own. Needs no root.
std::shared_ptr<Ethtool> makeKernelEthtool();

/// What a driver says of itself. Texts are clean; what says nothing ("", "N/A") is absent.
struct DriverInfo {
  std::optional<std::string> driverVersion;
  std::optional<std::string> firmwareVersion;
};

/// Reads the bytes of an answer; nothing where they are too few.
std::optional<DriverInfo> parseDriverInfo(std::string_view bytes);

}  // namespace agent::discovery
