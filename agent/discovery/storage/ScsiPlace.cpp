#include <agent/discovery/BusAddress.h>
#include <agent/discovery/Values.h>
#include <agent/discovery/storage/ScsiPlace.h>

#include <algorithm>
#include <array>
#include <charconv>
#include <utility>
#include <vector>

namespace agent::discovery {

namespace {

/// The number behind `prefix`, where `name` is nothing else: 3 of "host3".
std::optional<std::uint32_t> numberBehind(std::string_view name, std::string_view prefix) {
  const bool fits = name.starts_with(prefix) && name.size() > prefix.size() &&
                    name.find_first_not_of("0123456789", prefix.size()) == std::string_view::npos;
  return fits ? parseNumber(name.substr(prefix.size())) : std::nullopt;
}

/// A folder of a transport, whose attribute names what hangs below it for ever.
struct Transport {
  std::string_view prefix;     ///< of the folder's name
  std::string_view className;  ///< of the folder within that holds the attribute
  std::string_view attribute;
  std::string_view word;  ///< that the place says it with
};

std::optional<std::string> placeByTransport(SourceContext& context, const std::string& device) {
  static constexpr std::array<Transport, 2> transports{{
      {"end_device-", "sas_device", "sas_address", "sas:"},
      {"rport-", "fc_remote_ports", "port_name", "fc:"},
  }};
  for (std::string folder(parentFolder(device)); !folder.empty(); folder = parentFolder(folder)) {
    const std::string name(lastName(folder));
    const auto* const found =
        std::find_if(transports.begin(), transports.end(),
                     [&](const Transport& transport) { return name.starts_with(transport.prefix); });
    if (found != transports.end()) {
      const std::string path = within(within(within(folder, found->className), name), found->attribute);
      const std::optional<std::string> value = context.textIfAny(path);
      return value ? std::optional(std::string(found->word) + *value) : std::nullopt;
    }
  }
  return std::nullopt;
}

/// "ata2" for the second port of the function; the kernel's own number counts the ports of all functions.
std::optional<std::string> ataPort(SourceContext& context, const HostPlace& host) {
  const std::string name(lastName(host.above));
  if (!numberBehind(name, "ata")) {
    return std::nullopt;
  }
  const std::optional<std::string> port =
      context.textIfAny(within(within(within(host.above, "ata_port"), name), "port_no"));
  return port ? std::optional("ata" + *port) : std::nullopt;
}

/// "host0" for the first host of the function; the kernel's own number counts all hosts.
std::string hostRank(SourceContext& context, const HostPlace& host) {
  const std::optional<std::uint32_t> own = numberBehind(host.name, "host");
  std::size_t rank = 0;
  for (const std::string& name : context.listIfAny(host.above)) {
    const std::optional<std::uint32_t> number = numberBehind(name, "host");
    rank += number && own && *number < *own ? 1 : 0;
  }
  return "host" + std::to_string(rank);
}

}  // namespace

std::optional<ScsiAddress> parseScsiAddress(std::string_view text) {
  std::array<std::uint64_t, 4> parts{};
  const char* at = text.data();
  const char* const end = at + text.size();
  for (std::size_t i = 0; i < parts.size(); ++i) {
    if (i > 0 && (at == end || *at++ != ':')) {
      return std::nullopt;
    }
    const auto [stop, error] = std::from_chars(at, end, parts.at(i));
    if (error != std::errc() || (i < 3 && parts.at(i) > UINT32_MAX)) {
      return std::nullopt;
    }
    at = stop;
  }
  if (at != end) {
    return std::nullopt;
  }
  return ScsiAddress{static_cast<std::uint32_t>(parts[0]), static_cast<std::uint32_t>(parts[1]),
                     static_cast<std::uint32_t>(parts[2]), parts[3]};
}

std::optional<HostPlace> hostIn(const std::string& path) {
  std::optional<HostPlace> found;
  for (std::string folder = path; !folder.empty(); folder = parentFolder(folder)) {
    if (numberBehind(lastName(folder), "host")) {
      found = HostPlace{std::string(parentFolder(folder)), std::string(lastName(folder))};
    }
  }
  return found;
}

std::string targetPlace(SourceContext& context, const std::string& folder, const ScsiAddress& address) {
  const std::string channelAndTarget = std::to_string(address.channel) + ":" + std::to_string(address.target);
  const std::optional<HostPlace> host = hostIn(folder);
  if (!host) {
    return "scsi:" + std::to_string(address.host) + ":" + channelAndTarget;
  }
  const std::string function = functionAddress(context, host->above);
  if (const auto place = placeByTransport(context, folder)) {
    return function + "/" + *place;
  }
  const std::optional<std::string> port = ataPort(context, *host);
  return function + "/" + (port ? *port : hostRank(context, *host)) + "/" + channelAndTarget;
}

}  // namespace agent::discovery
