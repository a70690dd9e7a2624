// Certificates: the server's own, and those of clients.
#pragma once

#include <cimom/http/Settings.h>
#include <gnutls/gnutls.h>

#include <string>

namespace cimom::http {

/// The PEM texts that a server with TLS needs.
struct TlsFiles {
  std::string certificate;
  std::string key;
  std::string authorities;  ///< of client certificates; empty: none is asked for
};

/// Protocols and ciphers: TLS 1.2 and up.
[[nodiscard]] const char* tlsPriorities();

/// Reads and checks the files that the settings name. Throws std::runtime_error where one cannot be used.
[[nodiscard]] TlsFiles readTlsFiles(const Settings& settings);

/// The subject (RFC 4514) of the client's certificate, if one of the session's authorities signed it for
/// clients and it is valid now. Empty: there is none; `why` says what was wrong with the one that there was.
[[nodiscard]] std::string clientSubject(gnutls_session_t session, std::string& why);

}  // namespace cimom::http
