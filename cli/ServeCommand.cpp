#include <agent/framework/LookAnew.h>
#include <cimom/http/Server.h>
#include <cimom/protocol/Endpoint.h>
#include <cli/Commands.h>
#include <cli/HostedManager.h>
#include <cli/Messages.h>
#include <cli/ServeLog.h>
#include <cli/ServeSettings.h>
#include <cli/ServeSignals.h>
#include <cli/ServiceManager.h>
#include <cli/Source.h>

#include <cerrno>
#include <chrono>
#include <memory>
#include <stdexcept>
#include <string>
#include <system_error>
#include <utility>
#include <vector>

#include <dlfcn.h>

namespace cli {
namespace {

using ServerLevel = cimom::http::LogLevel;

/// How long answers under way may take once the server is to stop. A client that stalls is cut long before.
constexpr std::chrono::seconds patience{60};

/// The framework library is there once a provider is. Another one may stand in for it that has no such door.
void lookAtMachineAnew() {
  void* library = dlopen(agent::oruLibraryName, RTLD_LAZY | RTLD_NOLOAD);
  if (library == nullptr) {
    return;  // nobody has asked yet: the first request looks
  }
  const auto look = reinterpret_cast<decltype(&oruLookAnew)>(dlsym(library, agent::oruLookAnewName));
  if (look != nullptr) {
    look();
  }
  dlclose(library);
}

std::unique_ptr<cimom::http::Server> startServer(const cimom::http::Settings& settings,
                                                 cimom::http::Handler handler) {
  try {
    return std::make_unique<cimom::http::Server>(settings, std::move(handler));
  } catch (const std::runtime_error& error) {
    const std::string message = error.what();
    const bool isInUse = message.find(std::generic_category().message(EADDRINUSE)) != std::string::npos;
    throw CommandError(message +
                       (isInUse ? "\nAnother server listens there; --listen takes another port." : ""));
  }
}

std::string urls(const cimom::http::Server& server, const cimom::http::Settings& settings) {
  std::string lines;
  const std::vector<std::string> addresses = server.addresses();
  for (std::size_t at = 0; at < addresses.size(); ++at) {
    lines.append("Listening on ").append(settings.listeners[at].tls ? "https://" : "http://");
    lines.append(addresses[at]).append("\n");
  }
  return lines;
}

void logCounters(const cimom::ObjectManager& manager, const ServeLog& log) {
  if (const std::uint64_t unfinished = manager.unfinishedAnswers(); unfinished != 0) {
    log.write(ServerLevel::info, "answers that were OK without a provider's done marker, since the start: " +
                                     std::to_string(unfinished));
  }
}

void reload(cimom::http::Server& server, const ServeLog& log) {
  notifyReloading();
  const std::vector<std::string> problems = server.reload();
  if (problems.empty()) {
    log.write(ServerLevel::info,
              "SIGHUP: certificates and passwords were read again; looking at the machine anew");
  }
  lookAtMachineAnew();
  notifyServiceManager("READY=1");
}

void stop(cimom::http::Server& server, cimom::protocol::Endpoint& endpoint, const ServeLog& log) {
  notifyServiceManager("STOPPING=1");
  const std::size_t underWay = server.requestsUnderWay();
  log.write(ServerLevel::info, "stopping; requests to be finished: " + std::to_string(underWay));
  endpoint.shutDown();
  if (!server.stop(patience)) {
    log.write(ServerLevel::warning, "requests that were not finished after " +
                                        std::to_string(patience.count()) + " seconds were cut");
  }
}

}  // namespace

void runServe(const Options& options, Output& output) {
  ServeSignals signals;
  const std::vector<InheritedSocket> inherited = takeInheritedSockets();
  static_cast<void>(checkedSource());
  const ServeLog log(options.logLevel.value_or(LogLevel::Error));
  const cimom::http::Settings settings = serverSettings(options.serve, inherited, log);
  const std::unique_ptr<cimom::ObjectManager> manager = makeManager(options);
  cimom::protocol::EndpointSettings endpointSettings;
  endpointSettings.log = [&log](std::string_view line) { log.write(ServerLevel::warning, line); };
  cimom::protocol::Endpoint endpoint(*manager, endpointSettings);
  const std::unique_ptr<cimom::http::Server> server = startServer(
      settings, [&endpoint](const auto& request, auto& answer) { endpoint.handle(request, answer); });
  output.write(urls(*server, settings));
  output.flush();
  notifyServiceManager("READY=1");
  while (signals.next() == ServeSignal::Reload) {
    reload(*server, log);
    logCounters(*manager, log);
  }
  signals.stopAtOnceFromNow();
  stop(*server, endpoint, log);
  logCounters(*manager, log);
}

}  // namespace cli
