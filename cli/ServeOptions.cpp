#include <cli/OptionValues.h>
#include <cli/ServeOptions.h>
#include <cli/UsageError.h>

#include <CLI/CLI.hpp>
#include <array>
#include <charconv>

#include <arpa/inet.h>

namespace cli {
namespace {

constexpr unsigned mostConnections = 100000;
constexpr unsigned longestStall = 86400;

std::optional<std::uint16_t> portIn(std::string_view text) {
  std::uint16_t number = 0;
  const auto result = std::from_chars(text.data(), text.data() + text.size(), number);
  const bool isWhole = result.ec == std::errc() && result.ptr == text.data() + text.size();
  return isWhole ? std::optional(number) : std::nullopt;
}

bool takePrefix(std::string_view& text, std::string_view prefix) {
  if (!text.starts_with(prefix)) {
    return false;
  }
  text.remove_prefix(prefix.size());
  return true;
}

bool isAddress(int family, const std::string& text) {
  std::array<unsigned char, sizeof(in6_addr)> bytes{};
  return inet_pton(family, text.c_str(), bytes.data()) == 1;
}

/// Takes "[IPv6]", or what stands before the colon, off the front of `text`.
std::optional<std::string> takeAddress(std::string_view& text) {
  if (takePrefix(text, "[")) {
    const std::size_t end = text.find(']');
    if (end == std::string_view::npos) {
      return std::nullopt;
    }
    std::string address(text.substr(0, end));
    text.remove_prefix(end + 1);
    return isAddress(AF_INET6, address) ? std::optional(address) : std::nullopt;
  }
  std::string address(text.substr(0, text.find(':')));
  text.remove_prefix(address.size());
  if (address == "localhost") {
    address = "127.0.0.1";
  } else if (address == "*") {
    address = "0.0.0.0";
  }
  return isAddress(AF_INET, address) ? std::optional(address) : std::nullopt;
}

}  // namespace

std::optional<ListenAddress> parseListenAddress(std::string_view text) {
  ListenAddress result;
  if (takePrefix(text, "http://")) {
    result.tls = false;
  } else if (takePrefix(text, "https://")) {
    result.tls = true;
  }
  const std::optional<std::string> address = takeAddress(text);
  if (!address) {
    return std::nullopt;
  }
  result.address = *address;
  if (takePrefix(text, ":")) {
    result.port = portIn(text);
    return result.port ? std::optional(result) : std::nullopt;
  }
  return text.empty() ? std::optional(result) : std::nullopt;
}

void addServeOptions(CLI::App& app, RawServe& raw) {
  app.add_option("--listen", raw.listen)
      ->allow_extra_args(false)
      ->multi_option_policy(CLI::MultiOptionPolicy::TakeAll);
  app.add_option("--tls-certificate", raw.certificate);
  app.add_option("--tls-key", raw.key);
  app.add_option("--client-ca", raw.clientCa);
  app.add_option("--passwords", raw.passwords);
  app.add_option("--max-connections", raw.maxConnections);
  app.add_option("--stall-time", raw.stallTime);
  app.add_flag("--delete", raw.passwd.remove);
}

ServeOptions interpretServe(const CLI::App& app, const RawServe& raw) {
  ServeOptions options;
  for (const std::string& text : raw.listen) {
    const std::optional<ListenAddress> address = parseListenAddress(text);
    if (!address) {
      throw UsageError(
          "--listen '" + text +
          "' is no address and port; write it as 127.0.0.1:5988, [::1]:5988 or https://0.0.0.0:5989");
    }
    options.listen.push_back(*address);
  }
  options.certificate = fileOption(app, "--tls-certificate", raw.certificate);
  options.key = fileOption(app, "--tls-key", raw.key);
  options.clientCa = fileOption(app, "--client-ca", raw.clientCa);
  options.passwords = fileOption(app, "--passwords", raw.passwords);
  options.maxConnections = boundOption(app, "--max-connections", raw.maxConnections, mostConnections);
  if (const auto seconds = boundOption(app, "--stall-time", raw.stallTime, longestStall)) {
    options.stallTime = std::chrono::seconds(*seconds);
  }
  if (options.certificate.has_value() != options.key.has_value()) {
    throw UsageError("TLS needs both --tls-certificate and --tls-key");
  }
  if (options.clientCa && !options.certificate) {
    throw UsageError("--client-ca needs TLS: give --tls-certificate and --tls-key too");
  }
  for (const ListenAddress& address : options.listen) {
    if (address.tls == true && !options.certificate) {
      throw UsageError("--listen https://... needs --tls-certificate and --tls-key");
    }
  }
  return options;
}

void checkPasswd(const PasswdOptions& options) {
  if (options.file.empty() || options.user.empty()) {
    throw UsageError("'swinv passwd' needs the password file and the name of a user");
  }
}

}  // namespace cli
