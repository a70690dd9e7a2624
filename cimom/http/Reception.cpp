#include <cimom/http/Reception.h>
#include <cimom/http/Tls.h>
#include <strings.h>

#include <algorithm>
#include <charconv>
#include <cstdint>
#include <new>

namespace cimom::http {
namespace {

// A client that is refused gets to see it if its body is read to the end; up to this many times what is
// allowed.
constexpr std::size_t patienceWithBodies = 8;

bool sameName(std::string_view left, std::string_view right) {
  return left.size() == right.size() && strncasecmp(left.data(), right.data(), left.size()) == 0;
}

/// Whether a list of tokens, some with parameters, has this one: "trailers" in "deflate;q=0.5, trailers".
bool hasToken(std::string_view list, std::string_view token) {
  while (!list.empty()) {
    const std::size_t comma = std::min(list.find(','), list.size());
    std::string_view entry = list.substr(0, comma);
    list.remove_prefix(std::min(comma + 1, list.size()));
    entry = entry.substr(0, entry.find(';'));
    const std::size_t first = entry.find_first_not_of(" \t");
    const std::size_t last = entry.find_last_not_of(" \t");
    if (first != std::string_view::npos && sameName(entry.substr(first, last - first + 1), token)) {
      return true;
    }
  }
  return false;
}

MHD_Result addField(void* request, MHD_ValueKind /*kind*/, const char* name, const char* value) {
  try {
    static_cast<Request*>(request)->fields.push_back({name, value == nullptr ? "" : value});
    return MHD_YES;
  } catch (const std::bad_alloc&) {
    return MHD_NO;
  }
}

std::size_t declaredLength(const Request& request) {
  const std::string* text = request.field("Content-Length");
  std::size_t length = 0;
  if (text != nullptr) {
    const auto [stop, error] = std::from_chars(text->data(), text->data() + text->size(), length);
    return error == std::errc::result_out_of_range ? SIZE_MAX : length;
  }
  return length;
}

}  // namespace

const std::string* Request::field(std::string_view name) const {
  const auto found = std::find_if(fields.begin(), fields.end(),
                                  [&](const Field& field) { return sameName(field.name, name); });
  return found == fields.end() ? nullptr : &found->value;
}

Reception::Reception(Desk& desk, Connection* connection, std::string_view target)
    : desk_(desk), peer_(connection), exchange_(desk.arrive()) {
  if (peer_ != nullptr) {
    peer_->due = Clock::now() + desk.settings().bounds.request;
  }
  if (exchange_) {
    exchange_->request.target = target;
  }
}

Reception::~Reception() {
  if (exchange_) {
    exchange_->gone();
    desk_.leave(*exchange_);
  }
  desk_.returnBytes(counted_);
  if (peer_ != nullptr) {
    const Bounds& bounds = desk_.settings().bounds;
    peer_->due = Clock::now() + bounds.idle + bounds.request;
  }
}

MHD_Result Reception::next(MHD_Connection* connection, const char* method, const char* version,
                           const char* bytes, std::size_t* size, bool closes) {
  if (!exchange_ || peer_ == nullptr) {
    return MHD_NO;
  }
  if (!headSeen_) {
    headSeen_ = true;
    return head(connection, method, version);
  }
  if (*size != 0) {
    const std::string_view part(bytes, *size);
    *size = 0;
    return body(part);
  }
  return held_ ? exchange_->respond(closes) : whole(connection, closes);
}

void Reception::refuse(int status, std::string_view text) {
  refusal_ = Refusal{status, text, {}};
  desk_.log(LogLevel::warning, peer_->peer + ": refused with " + std::to_string(status) + ": " +
                                   std::string(text.substr(0, text.find('\n'))));
}

MHD_Result Reception::head(MHD_Connection* connection, const char* method, const char* version) {
  Request& request = exchange_->request;
  request.method = method;
  request.isHttp10 = std::string_view(version) == MHD_HTTP_VERSION_1_0;
  request.peer = peer_->peer;
  readFields(connection);
  readCertificate(connection);
  judge(connection);
  if (!refusal_) {
    return MHD_YES;
  }
  // A client that waits for "100 Continue" sends no body; one that is far too large is not worth the wait.
  const std::string* expect = request.field("Expect");
  const Bounds& bounds = desk_.settings().bounds;
  const bool waits = expect != nullptr && hasToken(*expect, "100-continue");
  const bool isHopeless =
      declaredLength(request) / patienceWithBodies > bounds.body || refusal_->status == 431;
  return waits || isHopeless ? send(connection, true) : MHD_YES;
}

void Reception::readFields(MHD_Connection* connection) {
  Request& request = exchange_->request;
  MHD_get_connection_values(connection, MHD_HEADER_KIND, addField, &request);
  const std::string* te = request.field("TE");
  request.takesTrailers = !request.isHttp10 && te != nullptr && hasToken(*te, "trailers");
  if (const std::string* authorization = request.field("Authorization")) {
    login_ = parseBasicLogin(*authorization);
  }
  // Passwords go no further than they must.
  std::erase_if(request.fields, [](const Field& field) { return sameName(field.name, "Authorization"); });
}

void Reception::readCertificate(MHD_Connection* connection) {
  if (!peer_->certificateSeen) {
    peer_->certificateSeen = true;
    const auto* info = MHD_get_connection_info(connection, MHD_CONNECTION_INFO_GNUTLS_SESSION);
    if (!desk_.settings().clientCaFile.empty() && info != nullptr && info->tls_session != nullptr) {
      std::string why;
      peer_->subject = clientSubject(static_cast<gnutls_session_t>(info->tls_session), why);
      if (!why.empty()) {
        desk_.log(LogLevel::warning, peer_->peer + ": client certificate refused: " + why);
      }
    }
  }
  exchange_->request.user = peer_->subject;
}

void Reception::judge(MHD_Connection* connection) {
  const Request& request = exchange_->request;
  const Bounds& bounds = desk_.settings().bounds;
  const auto* info = MHD_get_connection_info(connection, MHD_CONNECTION_INFO_REQUEST_HEADER_SIZE);
  if (info != nullptr && info->header_size > bounds.header) {
    refuse(431, "The request's headers are too large.\n");
    return;
  }
  // A NUL ended what MHD took for the target.
  if (request.target.empty()) {
    refuse(400, "The request has no target.\n");
    return;
  }
  // Whoever stands between client and server may count the body differently: no guess which one is meant.
  if (request.field("Content-Length") != nullptr && request.field("Transfer-Encoding") != nullptr) {
    refuse(400, "The request has both Content-Length and Transfer-Encoding.\n");
    return;
  }
  if (declaredLength(request) > bounds.body) {
    refuse(413, "The request's body is too large.\n");
    return;
  }
  if (request.user.empty() && (!login_ || desk_.settings().passwordFile.empty())) {
    refusal_ = desk_.refusalWithoutLogin(request);
  }
}

MHD_Result Reception::body(std::string_view bytes) {
  const Bounds& bounds = desk_.settings().bounds;
  std::string& collected = exchange_->request.body;
  if (!refusal_) {
    if (bytes.size() > bounds.body - std::min(bounds.body, collected.size())) {
      refuse(413, "The request's body is too large.\n");
    } else if (!desk_.takeBytes(bytes.size())) {
      refuse(503, "The server holds too many requests.\n");
    } else {
      counted_ += bytes.size();
      collected.append(bytes);
      return MHD_YES;
    }
    std::string().swap(collected);
  }
  discarded_ += bytes.size();
  return discarded_ / patienceWithBodies > bounds.body ? MHD_NO : MHD_YES;
}

MHD_Result Reception::whole(MHD_Connection* connection, bool closes) {
  peer_->due = Clock::time_point::max();
  if (refusal_) {
    return send(connection, closes);
  }
  if (!exchange_->hold(connection)) {
    return MHD_NO;
  }
  held_ = true;
  try {
    serve();
  } catch (const std::exception&) {
    // Out of memory. MHD may not close a connection that is suspended.
    exchange_->cut();
  }
  return MHD_YES;
}

void Reception::serve() {
  const bool hasUser = !exchange_->request.user.empty();
  if (hasUser || !login_ || !desk_.refusalWithoutLogin(exchange_->request)) {
    desk_.serve(exchange_);
  } else {
    desk_.serve(exchange_, *login_, peer_->origin);
  }
}

MHD_Result Reception::send(MHD_Connection* connection, bool closes) const {
  std::string text(refusal_->text);
  MHD_Response* response = MHD_create_response_from_buffer(text.size(), text.data(), MHD_RESPMEM_MUST_COPY);
  if (response == nullptr) {
    return MHD_NO;
  }
  for (const Field& field : refusal_->fields) {
    MHD_add_response_header(response, field.name.c_str(), field.value.c_str());
  }
  MHD_add_response_header(response, "Content-Type", "text/plain; charset=utf-8");
  if (closes || refusal_->status == 400) {
    MHD_add_response_header(response, "Connection", "close");
  }
  const MHD_Result queued = MHD_queue_response(connection, static_cast<unsigned>(refusal_->status), response);
  MHD_destroy_response(response);
  return queued;
}

}  // namespace cimom::http
