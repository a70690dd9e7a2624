#include <agent/discovery/Values.h>
#include <agent/discovery/network/Ethtool.h>

#include <linux/ethtool.h>

#include <cstddef>

namespace agent::discovery {

namespace {

/// A text field of fixed width; the driver need not have ended it with a zero.
std::optional<std::string> field(std::string_view bytes, std::size_t offset, std::size_t width) {
  const std::string_view text = bytes.substr(offset, width);
  return meaningful(text.substr(0, text.find('\0')));
}

}  // namespace

std::optional<DriverInfo> parseDriverInfo(std::string_view bytes) {
  using Layout = ethtool_drvinfo;
  if (bytes.size() < sizeof(Layout)) {
    return std::nullopt;
  }
  return DriverInfo{field(bytes, offsetof(Layout, version), sizeof(Layout::version)),
                    field(bytes, offsetof(Layout, fw_version), sizeof(Layout::fw_version))};
}

}  // namespace agent::discovery
