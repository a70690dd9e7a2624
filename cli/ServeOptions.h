// What `swinv serve` and `swinv passwd` are told on the command line.
#pragma once

#include <chrono>
#include <cstdint>
#include <filesystem>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace CLI {  // NOLINT(readability-identifier-naming): the library's own
class App;
}

namespace cli {

/// Where to listen, as it was typed: [http://|https://]ADDRESS[:PORT].
struct ListenAddress {
  std::string address;                ///< IPv4 or IPv6 in digits; IPv6 without brackets
  std::optional<std::uint16_t> port;  ///< none: the one that DSP0200 gives the scheme
  std::optional<bool> tls;            ///< none: as soon as there is a certificate

  friend bool operator==(const ListenAddress&, const ListenAddress&) = default;
};

/// None where the text is no such address. "localhost" is 127.0.0.1, "*" every IPv4 address.
std::optional<ListenAddress> parseListenAddress(std::string_view text);

struct ServeOptions {
  std::vector<ListenAddress> listen;  ///< empty: loopback at the usual port
  std::optional<std::filesystem::path> certificate;
  std::optional<std::filesystem::path> key;
  std::optional<std::filesystem::path> clientCa;   ///< whose client certificates are a login
  std::optional<std::filesystem::path> passwords;  ///< whose users are a login
  std::optional<unsigned> maxConnections;
  std::optional<std::chrono::seconds> stallTime;  ///< a client that takes or sends nothing for as long is cut
};

struct PasswdOptions {
  std::string file;
  std::string user;
  bool remove = false;  ///< the user is taken out of the file
};

/// The arguments of both commands as they were typed.
struct RawServe {
  std::vector<std::string> listen;
  std::string certificate;
  std::string key;
  std::string clientCa;
  std::string passwords;
  std::string maxConnections;
  std::string stallTime;
  PasswdOptions passwd;
};

/// Declares the options in the program.
void addServeOptions(CLI::App& app, RawServe& raw);

/// Throw `UsageError`.
ServeOptions interpretServe(const CLI::App& app, const RawServe& raw);
void checkPasswd(const PasswdOptions& options);

}  // namespace cli
