// From the options of `swinv serve` to the settings of the server.
#pragma once

#include <cimom/http/Settings.h>
#include <cli/ServeLog.h>
#include <cli/ServeOptions.h>
#include <cli/ServiceManager.h>

#include <vector>

namespace cli {

/// Where nothing is named, the server listens on loopback alone; where sockets are inherited, at these alone.
/// An inherited socket is plain or TLS by its name ("http", "https"); one of another name is TLS as soon as
/// there is a certificate. Throws `CommandError` for an address beyond this machine without TLS and a login.
/// `log` must outlive the server.
cimom::http::Settings serverSettings(const ServeOptions& options,
                                     const std::vector<InheritedSocket>& inherited, const ServeLog& log);

}  // namespace cli
