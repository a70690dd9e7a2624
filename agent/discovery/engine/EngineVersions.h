// The versions that a management engine tells.
#pragma once

#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

namespace agent::discovery {

struct EngineVersion {
  std::string text;  ///< "11.8.50.3425"
  std::uint32_t major = 0;
  std::uint32_t minor = 0;

  friend bool operator==(const EngineVersion&, const EngineVersion&) = default;
};

/// Reads the lines of `fw_ver`, "PLATFORM:MAJOR.MINOR.MILESTONE.BUILD" each, one for a part of the firmware:
/// the versions without repetitions, in their order. Versions of zeros alone and lines of another form are
/// left out.
std::vector<EngineVersion> parseEngineVersions(std::string_view text);

}  // namespace agent::discovery
