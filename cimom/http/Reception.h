// One request while it arrives, as MHD reports it: its head, its body, its end, and once more when its answer
// is to be sent. Runs in MHD's C frames, on the sending thread: waits for nothing.
#pragma once

#include <cimom/http/Connections.h>
#include <cimom/http/Desk.h>
#include <microhttpd.h>

#include <memory>
#include <optional>
#include <string>
#include <string_view>

namespace cimom::http {

class Reception {
 public:
  /// The request line has arrived. `connection` may be nullptr where the server is being ended.
  Reception(Desk& desk, Connection* connection, std::string_view target);
  /// The request is over.
  ~Reception();
  Reception(const Reception&) = delete;
  Reception& operator=(const Reception&) = delete;

  /// What MHD calls for each part of a request. `closes`: no other request follows on this connection.
  MHD_Result next(MHD_Connection* connection, const char* method, const char* version, const char* bytes,
                  std::size_t* size, bool closes);

 private:
  MHD_Result head(MHD_Connection* connection, const char* method, const char* version);
  MHD_Result body(std::string_view bytes);
  MHD_Result whole(MHD_Connection* connection, bool closes);
  void serve();
  MHD_Result send(MHD_Connection* connection, bool closes) const;
  void readFields(MHD_Connection* connection);
  void readCertificate(MHD_Connection* connection);
  void judge(MHD_Connection* connection);
  void refuse(int status, std::string_view text);

  Desk& desk_;
  Connection* const peer_;
  const std::shared_ptr<Exchange> exchange_;
  std::optional<BasicLogin> login_;
  std::optional<Refusal> refusal_;
  bool headSeen_ = false;
  bool held_ = false;
  std::size_t counted_ = 0;    ///< bytes of the body that the desk has counted
  std::size_t discarded_ = 0;  ///< bytes of a body that nobody will read
};

}  // namespace cimom::http
