// MHD, which speaks HTTP and TLS on the connections that it is given.
#pragma once

#include <cimom/http/Connections.h>
#include <cimom/http/Descriptor.h>
#include <cimom/http/Desk.h>
#include <cimom/http/Tls.h>
#include <microhttpd.h>

#include <atomic>
#include <cstdarg>
#include <cstddef>

namespace cimom::http {

/// Does not listen: connections are accepted elsewhere, so that one daemon follows another without losing
/// any.
class Daemon {
 public:
  /// Plain HTTP; TLS where `tls` is not nullptr, which must live as long. Throws std::runtime_error.
  Daemon(Desk& desk, Connections& connections, const TlsFiles* tls);

  /// Ends what is there. Every answer of its connections was cut before, or there are none.
  ~Daemon();
  Daemon(const Daemon&) = delete;
  Daemon& operator=(const Daemon&) = delete;

  /// Takes a connection over.
  void add(Descriptor connection, const SocketAddress& peer);

  /// The next answer on each connection is its last.
  void retire() { retired_ = true; }
  [[nodiscard]] bool isEmpty() const { return count_ == 0; }

 private:
  static MHD_Result handle(void* daemon, MHD_Connection* connection, const char* url, const char* method,
                           const char* version, const char* bytes, std::size_t* size, void** reception);
  static void* begin(void* daemon, const char* target, MHD_Connection* connection);
  static void completed(void* daemon, MHD_Connection* connection, void** reception,
                        MHD_RequestTerminationCode why);
  static void notify(void* daemon, MHD_Connection* connection, void** context,
                     MHD_ConnectionNotificationCode what);
  static void say(void* daemon, const char* format, va_list arguments);

  void left(int descriptor);

  Desk& desk_;
  Connections& connections_;
  std::atomic<bool> retired_ = false;
  std::atomic<std::size_t> count_ = 0;
  MHD_Daemon* daemon_ = nullptr;
};

}  // namespace cimom::http
