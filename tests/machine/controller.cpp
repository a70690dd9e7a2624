// A management controller for the emulated machine, which behaves as a file tells.
//
//   machine_controller SOCKET FILE
//
// It listens on the unix socket SOCKET. Before each answer it reads the first word of FILE: "late" (the
// answer comes a second later), "silent" (there is none), "odd" (a revision that is no number); anything
// else, or no file: all is well.

#include "ControllerProtocol.h"

#include <sys/socket.h>
#include <sys/un.h>
#include <unistd.h>

#include <array>
#include <chrono>
#include <cstdio>
#include <cstring>
#include <fstream>
#include <iostream>
#include <string>
#include <thread>

namespace {

std::string behaviour(const std::string& file) {
  std::string word;
  std::ifstream(file) >> word;
  return word;
}

void reply(int peer, const machine::Message& request, const std::string& behaviour) {
  if (behaviour == "silent") {
    return;
  }
  if (behaviour == "late") {
    std::this_thread::sleep_for(std::chrono::seconds(1));
  }
  const auto bytes =
      machine::framed(behaviour == "odd" ? machine::oddAnswerTo(request) : machine::answerTo(request));
  if (::send(peer, bytes.data(), bytes.size(), MSG_NOSIGNAL) != static_cast<ssize_t>(bytes.size())) {
    std::perror("send");
  }
}

/// Serves one connection to its end.
void serve(int peer, const std::string& file) {
  machine::MessageReader reader;
  std::array<std::uint8_t, 256> buffer{};
  for (;;) {
    const ssize_t size = ::read(peer, buffer.data(), buffer.size());
    if (size <= 0) {
      return;
    }
    for (ssize_t i = 0; i < size; ++i) {
      if (const auto request = reader.take(buffer.at(static_cast<std::size_t>(i)))) {
        const std::string now = behaviour(file);
        std::cout << "function " << (request->at(1) >> 2) << " command " << int{request->at(2)} << ' ' << now
                  << std::endl;
        reply(peer, *request, now);
      }
    }
  }
}

int listenOn(const std::string& path) {
  sockaddr_un address{};
  address.sun_family = AF_UNIX;
  if (path.size() >= sizeof address.sun_path) {
    std::cerr << "the path is too long for a socket: " << path << '\n';
    return -1;
  }
  std::memcpy(static_cast<char*>(address.sun_path), path.c_str(), path.size() + 1);
  const int listener = ::socket(AF_UNIX, SOCK_STREAM | SOCK_CLOEXEC, 0);
  // NOLINTNEXTLINE(cppcoreguidelines-pro-type-reinterpret-cast): how sockets take addresses
  if (listener < 0 || ::bind(listener, reinterpret_cast<const sockaddr*>(&address), sizeof address) != 0 ||
      ::listen(listener, 1) != 0) {
    std::perror(path.c_str());
    return -1;
  }
  return listener;
}

}  // namespace

int main(int count, char** arguments) {
  if (count != 3) {
    std::cerr << "usage: machine_controller SOCKET FILE\n";
    return 2;
  }
  const std::string socket = arguments[1];
  const std::string file = arguments[2];
  const int listener = listenOn(socket);
  if (listener < 0) {
    return 1;
  }
  for (;;) {
    const int peer = ::accept4(listener, nullptr, nullptr, SOCK_CLOEXEC);
    if (peer < 0) {
      std::perror("accept");
      return 1;
    }
    serve(peer, file);
    ::close(peer);
  }
}
