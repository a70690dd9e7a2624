#include <cimom/http/Daemon.h>
#include <cimom/http/Reception.h>

#include <algorithm>
#include <array>
#include <cstdio>
#include <stdexcept>
#include <thread>
#include <vector>

namespace cimom::http {
namespace {

// Room for the request's head, and for a chunk of the answer.
constexpr std::size_t connectionMemory = 128UL * 1024;

unsigned pollingThreads() {
  constexpr unsigned most = 4;
  return std::clamp(std::thread::hardware_concurrency() / 2, 1U, most);
}

unsigned timeoutSeconds(const Bounds& bounds) {
  const auto longest = std::max(bounds.idle, bounds.stall);
  return static_cast<unsigned>(std::chrono::ceil<std::chrono::seconds>(longest).count());
}

int descriptorOf(MHD_Connection* connection) {
  const auto* info = MHD_get_connection_info(connection, MHD_CONNECTION_INFO_CONNECTION_FD);
  return info == nullptr ? -1 : info->connect_fd;
}

}  // namespace

Daemon::Daemon(Desk& desk, Connections& connections, const TlsFiles* tls)
    : desk_(desk), connections_(connections) {
  unsigned flags = MHD_USE_INTERNAL_POLLING_THREAD | MHD_USE_EPOLL | MHD_ALLOW_SUSPEND_RESUME | MHD_USE_ITC |
                   MHD_USE_NO_LISTEN_SOCKET | MHD_USE_ERROR_LOG;
  const Bounds& bounds = desk.settings().bounds;
  const unsigned threads = pollingThreads();
  // Connections are counted before they come here; each of MHD's threads takes its share of this limit.
  const auto limit = static_cast<intptr_t>(threads * (bounds.connections + 1));
  std::vector<MHD_OptionItem> options{
      {MHD_OPTION_CONNECTION_MEMORY_LIMIT, static_cast<intptr_t>(connectionMemory), nullptr},
      {MHD_OPTION_CONNECTION_LIMIT, limit, nullptr},
      {MHD_OPTION_CONNECTION_TIMEOUT, static_cast<intptr_t>(timeoutSeconds(bounds)), nullptr},
      {MHD_OPTION_STRICT_FOR_CLIENT, 1, nullptr}};
  const auto setPointer = [&options](MHD_OPTION option, const char* text) {
    options.push_back({option, 0, const_cast<char*>(text)});
  };
  if (threads > 1) {
    options.push_back({MHD_OPTION_THREAD_POOL_SIZE, static_cast<intptr_t>(threads), nullptr});
  }
  if (tls != nullptr) {
    flags |= MHD_USE_TLS;
    setPointer(MHD_OPTION_HTTPS_PRIORITIES, tlsPriorities());
    setPointer(MHD_OPTION_HTTPS_MEM_CERT, tls->certificate.c_str());
    setPointer(MHD_OPTION_HTTPS_MEM_KEY, tls->key.c_str());
    if (!tls->authorities.empty()) {
      setPointer(MHD_OPTION_HTTPS_MEM_TRUST, tls->authorities.c_str());
    }
  }
  options.push_back({MHD_OPTION_END, 0, nullptr});
  daemon_ =
      MHD_start_daemon(flags, 0, nullptr, nullptr, &Daemon::handle, this, MHD_OPTION_EXTERNAL_LOGGER,
                       &Daemon::say, this, MHD_OPTION_URI_LOG_CALLBACK, &Daemon::begin, this,
                       MHD_OPTION_NOTIFY_COMPLETED, &Daemon::completed, this, MHD_OPTION_NOTIFY_CONNECTION,
                       &Daemon::notify, this, MHD_OPTION_ARRAY, options.data(), MHD_OPTION_END);
  if (daemon_ == nullptr) {
    throw std::runtime_error(tls == nullptr
                                 ? "the HTTP server cannot be started"
                                 : "the HTTPS server cannot be started with this certificate and key");
  }
}

Daemon::~Daemon() {
  MHD_stop_daemon(daemon_);
}

void Daemon::add(Descriptor connection, const SocketAddress& peer) {
  const int descriptor = connection.get();
  ++count_;
  // MHD closes it where it cannot take it.
  if (MHD_add_connection(daemon_, connection.release(), peer.data(), peer.size()) != MHD_YES) {
    left(descriptor);
  }
}

void Daemon::left(int descriptor) {
  connections_.leave(descriptor);
  --count_;
}

void* Daemon::begin(void* daemon, const char* target, MHD_Connection* connection) {
  auto& self = *static_cast<Daemon*>(daemon);
  try {
    const auto* info = MHD_get_connection_info(connection, MHD_CONNECTION_INFO_SOCKET_CONTEXT);
    auto* peer = info == nullptr ? nullptr : static_cast<Connection*>(info->socket_context);
    return new Reception(self.desk_, peer, target);
  } catch (const std::exception&) {
    return nullptr;
  }
}

MHD_Result Daemon::handle(void* daemon, MHD_Connection* connection, const char* /*url*/, const char* method,
                          const char* version, const char* bytes, std::size_t* size, void** reception) {
  auto& self = *static_cast<Daemon*>(daemon);
  if (*reception == nullptr) {
    return MHD_NO;
  }
  try {
    const bool closes = self.retired_ || self.desk_.closes();
    return static_cast<Reception*>(*reception)->next(connection, method, version, bytes, size, closes);
  } catch (const std::exception& error) {
    self.desk_.log(LogLevel::error, std::string("a connection was closed: ") + error.what());
    return MHD_NO;
  }
}

void Daemon::completed(void* /*daemon*/, MHD_Connection* /*connection*/, void** reception,
                       MHD_RequestTerminationCode /*why*/) {
  delete static_cast<Reception*>(*reception);
  *reception = nullptr;
}

void Daemon::notify(void* daemon, MHD_Connection* connection, void** context,
                    MHD_ConnectionNotificationCode what) {
  auto& self = *static_cast<Daemon*>(daemon);
  const int descriptor = descriptorOf(connection);
  if (what == MHD_CONNECTION_NOTIFY_STARTED) {
    *context = self.connections_.find(descriptor);
  } else {
    *context = nullptr;
    self.left(descriptor);
  }
}

void Daemon::say(void* daemon, const char* format, va_list arguments) {
  constexpr std::size_t longestLine = 512;
  std::array<char, longestLine> line{};
  if (std::vsnprintf(line.data(), line.size(), format, arguments) < 0) {
    return;
  }
  std::string_view text(line.data());
  while (!text.empty() && text.back() == '\n') {
    text.remove_suffix(1);
  }
  const auto& self = *static_cast<Daemon*>(daemon);
  self.desk_.log(LogLevel::detail, "microhttpd: " + std::string(text));
}

}  // namespace cimom::http
