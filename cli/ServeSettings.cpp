#include <cli/Messages.h>
#include <cli/ServeSettings.h>

#include <chrono>
#include <string>

namespace cli {
namespace {

// What DSP0200 has registered for wbem-http and wbem-https.
constexpr std::uint16_t plainPort = 5988;
constexpr std::uint16_t tlsPort = 5989;

cimom::http::Listener listenerAt(const ListenAddress& listen, bool hasCertificate) {
  cimom::http::Listener listener;
  listener.tls = listen.tls.value_or(hasCertificate);
  const bool isIpv6 = listen.address.find(':') != std::string::npos;
  listener.address = (isIpv6 ? "[" + listen.address + "]" : listen.address) + ":" +
                     std::to_string(listen.port.value_or(listener.tls ? tlsPort : plainPort));
  return listener;
}

cimom::http::Listener listenerOn(const InheritedSocket& socket, bool hasCertificate) {
  cimom::http::Listener listener;
  listener.inherited = socket.descriptor;
  listener.tls = socket.name == "https" || (socket.name != "http" && hasCertificate);
  if (listener.tls && !hasCertificate) {
    throw CommandError("the inherited socket '" + socket.name +
                       "' is one for TLS; give --tls-certificate and --tls-key");
  }
  return listener;
}

bool isLoopback(const std::string& address) {
  return address.starts_with("127.") || address == "::1";
}

/// The server would refuse this too; it does not know what the options are called.
void checkSafety(const ServeOptions& options) {
  const bool hasCertificate = options.certificate.has_value();
  for (const ListenAddress& listen : options.listen) {
    if (isLoopback(listen.address)) {
      continue;
    }
    const std::string refusal =
        "will not listen at " + listen.address + ", which other machines may reach, without ";
    if (!listen.tls.value_or(hasCertificate)) {
      throw CommandError(refusal + "TLS" +
                         (hasCertificate
                              ? "\nLeave out http:// there."
                              : "\nGive --tls-certificate and --tls-key, and a login: --passwords or "
                                "--client-ca; or listen at 127.0.0.1."));
    }
    if (!options.passwords && !options.clientCa) {
      throw CommandError(refusal +
                         "a login\nGive --passwords with a file that 'swinv passwd' made, or --client-ca; or "
                         "listen at 127.0.0.1.");
    }
  }
}

std::string nameOf(const std::optional<std::filesystem::path>& file) {
  return file ? file->string() : std::string();
}

}  // namespace

cimom::http::Settings serverSettings(const ServeOptions& options,
                                     const std::vector<InheritedSocket>& inherited, const ServeLog& log) {
  const bool hasCertificate = options.certificate.has_value();
  checkSafety(options);
  cimom::http::Settings settings;
  for (const InheritedSocket& socket : inherited) {
    settings.listeners.push_back(listenerOn(socket, hasCertificate));
  }
  for (const ListenAddress& listen : options.listen) {
    settings.listeners.push_back(listenerAt(listen, hasCertificate));
  }
  if (settings.listeners.empty()) {
    settings.listeners.push_back(listenerAt({"127.0.0.1", {}, {}}, hasCertificate));
  }
  settings.certificateFile = nameOf(options.certificate);
  settings.keyFile = nameOf(options.key);
  settings.clientCaFile = nameOf(options.clientCa);
  settings.passwordFile = nameOf(options.passwords);
  if (options.maxConnections) {
    settings.bounds.connections = *options.maxConnections;
  }
  if (options.stallTime) {
    settings.bounds.stall = *options.stallTime;
    settings.bounds.idle = *options.stallTime;
  }
  settings.log = [&log](cimom::http::LogLevel level, std::string_view line) { log.write(level, line); };
  return settings;
}

}  // namespace cli
