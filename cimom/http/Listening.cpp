#include <cimom/http/Listening.h>
#include <fcntl.h>
#include <netinet/in.h>
#include <poll.h>
#include <sys/eventfd.h>
#include <sys/socket.h>

#include <cerrno>
#include <cstring>
#include <stdexcept>
#include <system_error>

namespace cimom::http {
namespace {

[[noreturn]] void refuse(const std::string& what) {
  throw std::runtime_error(what + ": " + std::strerror(errno));
}

SocketAddress addressOf(int descriptor) {
  sockaddr_storage storage{};
  socklen_t size = sizeof storage;
  if (::getsockname(descriptor, reinterpret_cast<sockaddr*>(&storage), &size) != 0) {
    refuse("a listening socket has no address");
  }
  return {reinterpret_cast<const sockaddr*>(&storage), size};
}

bool isListening(int descriptor) {
  int listening = 0;
  socklen_t size = sizeof listening;
  return ::getsockopt(descriptor, SOL_SOCKET, SO_ACCEPTCONN, &listening, &size) == 0 && listening != 0;
}

Descriptor duplicate(int inherited) {
  const std::string name = "inherited socket " + std::to_string(inherited);
  Descriptor descriptor(::fcntl(inherited, F_DUPFD_CLOEXEC, 0));
  if (!descriptor) {
    refuse(name + " cannot be used");
  }
  if (!isListening(descriptor.get()) || !addressOf(descriptor.get()).isTcp()) {
    throw std::runtime_error(name + " cannot be used: it is no listening TCP socket");
  }
  return descriptor;
}

Descriptor listenAt(const SocketAddress& address) {
  Descriptor descriptor(::socket(address.family(), SOCK_STREAM | SOCK_CLOEXEC, IPPROTO_TCP));
  const int on = 1;
  const std::string text = "cannot listen at " + address.text();
  if (!descriptor || ::setsockopt(descriptor.get(), SOL_SOCKET, SO_REUSEADDR, &on, sizeof on) != 0) {
    refuse(text);
  }
  // All IPv4 addresses are listened at by a listener of their own, or not at all.
  if (address.family() == AF_INET6 &&
      ::setsockopt(descriptor.get(), IPPROTO_IPV6, IPV6_V6ONLY, &on, sizeof on) != 0) {
    refuse(text);
  }
  if (::bind(descriptor.get(), address.data(), address.size()) != 0 ||
      ::listen(descriptor.get(), SOMAXCONN) != 0) {
    refuse(text);
  }
  return descriptor;
}

}  // namespace

ListeningSocket openListener(const Listener& listener) {
  ListeningSocket socket;
  socket.tls = listener.tls;
  socket.descriptor = listener.inherited >= 0 ? duplicate(listener.inherited)
                                              : listenAt(parseListenAddress(listener.address));
  const int flags = ::fcntl(socket.descriptor.get(), F_GETFL);
  if (flags < 0 || ::fcntl(socket.descriptor.get(), F_SETFL, flags | O_NONBLOCK) != 0) {
    refuse("a listening socket cannot be used");
  }
  socket.address = addressOf(socket.descriptor.get());
  return socket;
}

Acceptor::Acceptor(std::vector<ListeningSocket> sockets, Sink sink, Report report)
    : sockets_(std::move(sockets)),
      sink_(std::move(sink)),
      report_(std::move(report)),
      end_(::eventfd(0, EFD_CLOEXEC | EFD_NONBLOCK)) {
  if (!end_) {
    refuse("no event for the end of listening");
  }
  thread_ = std::thread([this] { run(); });
}

Acceptor::~Acceptor() {
  ::eventfd_write(end_.get(), 1);
  thread_.join();
}

void Acceptor::run() {
  constexpr int breath = 100;
  std::vector<pollfd> waiting{{end_.get(), POLLIN, 0}};
  for (const ListeningSocket& socket : sockets_) {
    waiting.push_back({socket.descriptor.get(), POLLIN, 0});
  }
  for (;;) {
    ::poll(waiting.data(), waiting.size(), -1);
    if (waiting.front().revents != 0) {
      return;
    }
    bool fine = true;
    for (std::size_t at = 0; at < sockets_.size(); ++at) {
      fine = (waiting[at + 1].revents == 0 || accept(sockets_[at])) && fine;
    }
    if (!fine) {
      // What is missing, such as descriptors, will still be missing at once; connections wait in the kernel.
      ::poll(waiting.data(), 1, breath);
    }
  }
}

bool Acceptor::accept(const ListeningSocket& socket) {
  sockaddr_storage storage{};
  socklen_t size = sizeof storage;
  Descriptor connection(::accept4(socket.descriptor.get(), reinterpret_cast<sockaddr*>(&storage), &size,
                                  SOCK_CLOEXEC | SOCK_NONBLOCK));
  if (!connection) {
    const bool isLack = errno == EMFILE || errno == ENFILE || errno == ENOBUFS || errno == ENOMEM;
    if (isLack) {
      report_(std::string("a connection cannot be accepted: ") + std::strerror(errno));
    }
    return !isLack;
  }
  try {
    sink_(std::move(connection), SocketAddress(reinterpret_cast<const sockaddr*>(&storage), size),
          socket.tls);
  } catch (const std::exception& error) {
    report_(std::string("a connection was closed: ") + error.what());
  }
  return true;
}

}  // namespace cimom::http
