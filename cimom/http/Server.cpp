#include <cimom/http/Daemon.h>
#include <cimom/http/Listening.h>
#include <cimom/http/Server.h>

#include <algorithm>
#include <list>
#include <mutex>
#include <stdexcept>
#include <utility>

namespace cimom::http {
namespace {

constexpr std::chrono::milliseconds shortestSweep{10};
constexpr std::chrono::milliseconds longestSweep{1000};
/// How long the rest of a request may take to arrive once the server is to stop.
constexpr std::chrono::milliseconds arrivalAtTheEnd{1000};

bool hasTls(const Settings& settings) {
  return std::any_of(settings.listeners.begin(), settings.listeners.end(),
                     [](const Listener& listener) { return listener.tls; });
}

void checkListener(const ListeningSocket& socket, const Settings& settings) {
  if (socket.address.isLoopback()) {
    return;
  }
  const std::string start =
      "will not listen at " + socket.address.text() + ", which other machines reach, without ";
  if (!socket.tls) {
    throw std::runtime_error(start + "TLS: use TLS there, or a loopback address");
  }
  if (settings.passwordFile.empty() && settings.clientCaFile.empty()) {
    throw std::runtime_error(
        start +
        "a login: give a password file or authorities of client certificates, or a loopback "
        "address");
  }
}

void checkFiles(const Settings& settings) {
  if (settings.listeners.empty()) {
    throw std::runtime_error("there is no address to listen at");
  }
  if (hasTls(settings) && (settings.certificateFile.empty() || settings.keyFile.empty())) {
    throw std::runtime_error("TLS needs a certificate and its key: give both as PEM files");
  }
  if (!hasTls(settings) && !settings.clientCaFile.empty() && settings.passwordFile.empty()) {
    throw std::runtime_error("client certificates need TLS: use TLS, or a password file");
  }
}

}  // namespace

class Server::Core {
 public:
  Core(Settings given, Handler handler);
  ~Core();
  Core(const Core&) = delete;
  Core& operator=(const Core&) = delete;

  [[nodiscard]] const std::vector<SocketAddress>& addresses() const { return addresses_; }
  [[nodiscard]] std::size_t requestsUnderWay() const { return desk_.underWay(); }
  std::vector<std::string> reload();
  bool stop(std::chrono::milliseconds patience);

 private:
  /// MHD, and what it reads while it lives.
  struct Running {
    TlsFiles files;
    std::unique_ptr<Daemon> daemon;
  };

  [[nodiscard]] Running start(bool tls);
  void take(Descriptor connection, const SocketAddress& peer, bool tls);
  void reloadTls();
  void sweep();
  void logRefused(const SocketAddress& peer, const std::string& why);

  Desk desk_;
  Connections connections_;
  std::vector<SocketAddress> addresses_;
  std::mutex daemons_;
  Running plain_;
  Running tls_;
  std::list<Running> retired_;
  std::mutex ending_;
  bool ended_ = false;
  Clock::time_point lastRefused_;  ///< the acceptor's
  std::unique_ptr<Acceptor> acceptor_;
};

Server::Core::Core(Settings given, Handler handler)
    : desk_(std::move(given), std::move(handler)), connections_(desk_.settings().bounds) {
  const Settings& settings = desk_.settings();
  checkFiles(settings);
  std::vector<ListeningSocket> sockets;
  for (const Listener& listener : settings.listeners) {
    sockets.push_back(openListener(listener));
    checkListener(sockets.back(), settings);
    addresses_.push_back(sockets.back().address);
  }
  plain_ = start(false);
  if (hasTls(settings)) {
    tls_ = start(true);
  }
  acceptor_ = std::make_unique<Acceptor>(
      std::move(sockets),
      [this](Descriptor connection, const SocketAddress& peer, bool tls) {
        take(std::move(connection), peer, tls);
      },
      [this](const std::string& line) { desk_.log(LogLevel::error, line); });
  sweep();
}

Server::Core::~Core() {
  stop(std::chrono::milliseconds::zero());
}

Server::Core::Running Server::Core::start(bool tls) {
  Running running;
  if (tls) {
    running.files = readTlsFiles(desk_.settings());
  }
  running.daemon = std::make_unique<Daemon>(desk_, connections_, tls ? &running.files : nullptr);
  return running;
}

void Server::Core::take(Descriptor connection, const SocketAddress& peer, bool tls) {
  std::string why;
  if (connections_.enter(connection.get(), peer, why) == nullptr) {
    logRefused(peer, why);
    return;
  }
  const std::lock_guard lock(daemons_);
  (tls ? tls_ : plain_).daemon->add(std::move(connection), peer);
}

void Server::Core::logRefused(const SocketAddress& peer, const std::string& why) {
  // Whoever knocks without end would fill the log as well.
  const auto now = Clock::now();
  if (now - lastRefused_ >= std::chrono::seconds(1)) {
    lastRefused_ = now;
    desk_.log(LogLevel::warning, peer.text() + ": connection refused: " + why);
  }
}

void Server::Core::sweep() {
  const auto now = Clock::now();
  desk_.cutStalled(now);
  for (const std::string& peer : connections_.cutLate(now)) {
    desk_.log(LogLevel::detail, peer + ": cut, because no whole request came in time");
  }
  std::list<Running> over;
  {
    const std::lock_guard lock(daemons_);
    for (auto next = retired_.begin(); next != retired_.end();) {
      const auto running = next++;
      if (running->daemon->isEmpty()) {
        over.splice(over.end(), retired_, running);
      }
    }
  }
  over.clear();
  constexpr int sweepsInTime = 8;
  const Bounds& bounds = desk_.settings().bounds;
  const auto time = std::min({bounds.idle, bounds.request, bounds.stall}) / sweepsInTime;
  desk_.timer().at(now + std::clamp(time, shortestSweep, longestSweep), [this] { sweep(); });
}

void Server::Core::reloadTls() {
  Running fresh = start(true);
  const std::lock_guard lock(daemons_);
  std::swap(fresh, tls_);
  fresh.daemon->retire();
  retired_.push_back(std::move(fresh));
}

std::vector<std::string> Server::Core::reload() {
  const std::lock_guard lock(ending_);
  std::vector<std::string> broken;
  if (ended_) {
    return broken;
  }
  const auto attempt = [&](const auto& part) {
    try {
      part();
    } catch (const std::exception& error) {
      broken.emplace_back(error.what());
      desk_.log(LogLevel::error, "the old stays in use: " + broken.back());
    }
  };
  attempt([this] { desk_.login().reload(); });
  if (hasTls(desk_.settings())) {
    attempt([this] { reloadTls(); });
  }
  return broken;
}

bool Server::Core::stop(std::chrono::milliseconds patience) {
  const std::lock_guard lock(ending_);
  if (ended_) {
    return desk_.waitForHandlers(patience);
  }
  ended_ = true;
  acceptor_.reset();
  desk_.closeSoon();
  connections_.awaitNoneAfter(Clock::now() + arrivalAtTheEnd);
  const bool finished = desk_.waitForNone(patience);
  if (!finished) {
    desk_.log(LogLevel::warning,
              std::to_string(desk_.underWay()) + " requests were not finished in time and were cut");
  }
  desk_.cutAll();
  desk_.timer().stop();
  plain_.daemon.reset();
  tls_.daemon.reset();
  retired_.clear();
  return desk_.waitForHandlers(std::chrono::milliseconds::zero()) && finished;
}

Server::Server(Settings settings, Handler handler)
    : core_(std::make_unique<Core>(std::move(settings), std::move(handler))) {}

Server::~Server() = default;

std::vector<std::string> Server::addresses() const {
  std::vector<std::string> texts;
  for (const SocketAddress& address : core_->addresses()) {
    texts.push_back(address.text());
  }
  return texts;
}

std::uint16_t Server::port(std::size_t listener) const {
  return core_->addresses().at(listener).port();
}

std::vector<std::string> Server::reload() {
  return core_->reload();
}

bool Server::stop(std::chrono::milliseconds patience) {
  return core_->stop(patience);
}

std::size_t Server::requestsUnderWay() const {
  return core_->requestsUnderWay();
}

}  // namespace cimom::http
