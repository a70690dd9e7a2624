#include <agent/discovery/events/Uevent.h>

#include <algorithm>
#include <array>
#include <cstddef>

namespace agent::discovery {
namespace {

constexpr std::size_t longestMessage = 8192;

template <std::size_t count>
bool isOneOf(std::string_view text, const std::array<std::string_view, count>& texts) {
  return std::find(texts.begin(), texts.end(), text) != texts.end();
}

/// What stands before the next NUL, which is taken off as well. Nothing where there is no NUL.
std::optional<std::string_view> takeField(std::string_view& bytes) {
  const std::size_t end = bytes.find('\0');
  if (end == std::string_view::npos) {
    return std::nullopt;
  }
  const std::string_view field = bytes.substr(0, end);
  bytes.remove_prefix(end + 1);
  return field;
}

}  // namespace

std::optional<Uevent> parseUevent(std::string_view bytes) {
  bytes = bytes.substr(0, longestMessage);
  const std::optional<std::string_view> header = takeField(bytes);
  if (!header) {
    return std::nullopt;
  }
  const std::size_t at = header->find('@');
  if (at == std::string_view::npos || at == 0 || header->substr(at + 1, 1) != "/") {
    return std::nullopt;
  }
  Uevent event{header->substr(0, at), header->substr(at + 1), {}};
  constexpr std::string_view key = "SUBSYSTEM=";
  while (const std::optional<std::string_view> field = takeField(bytes)) {
    if (field->substr(0, key.size()) == key) {
      event.subsystem = field->substr(key.size());
    }
  }
  return event;
}

bool concernsInventory(const Uevent& event) {
  static constexpr std::array<std::string_view, 2> drivers{"bind", "unbind"};
  static constexpr std::array<std::string_view, 4> changes{"add", "remove", "change", "move"};
  static constexpr std::array<std::string_view, 13> subsystems{
      "drm",  "fc_host", "infiniband", "ipmi", "mei",       "module", "net",
      "nvme", "pci",     "platform",   "scsi", "scsi_host", "tpm"};
  if (isOneOf(event.action, drivers)) {
    return true;
  }
  constexpr std::string_view withoutDevice = "/devices/virtual/net/";
  return isOneOf(event.action, changes) && isOneOf(event.subsystem, subsystems) &&
         event.devicePath.substr(0, withoutDevice.size()) != withoutDevice;
}

}  // namespace agent::discovery
