// The sending thread's side of an exchange. Its functions run in MHD's C frames: nothing is thrown, nothing
// waits.
#include <cimom/http/Exchange.h>
#include <strings.h>

#include <algorithm>
#include <new>

namespace cimom::http {
namespace {

// Above this a whole answer is sent piece by piece as well, so that a client that takes nothing is seen.
constexpr std::size_t sentAtOnce = 64UL * 1024;
// MHD asks for as much at a time as its buffer holds; this is for responses of known size.
constexpr std::size_t blockSize = 64UL * 1024;

bool isNamed(const Field& field, std::string_view name) {
  return field.name.size() == name.size() && strncasecmp(field.name.data(), name.data(), name.size()) == 0;
}

/// What the server itself says.
bool isServersOwn(const Field& field) {
  return isNamed(field, "Content-Length") || isNamed(field, "Transfer-Encoding") || isNamed(field, "Date") ||
         isNamed(field, "Connection") || isNamed(field, "Keep-Alive");
}

ssize_t readContent(void* exchange, std::uint64_t /*position*/, char* buffer, std::size_t size) {
  return (*static_cast<std::shared_ptr<Exchange>*>(exchange))->take(buffer, size);
}

void releaseContent(void* exchange) {
  delete static_cast<std::shared_ptr<Exchange>*>(exchange);
}

}  // namespace

bool Exchange::hold(MHD_Connection* connection) {
  const std::lock_guard lock(mutex_);
  if (cut_) {
    return false;
  }
  connection_ = connection;
  suspended_ = true;
  MHD_suspend_connection(connection);
  return true;
}

MHD_Result Exchange::respond(bool closes) {
  MHD_Response* response = nullptr;
  MHD_Connection* connection = nullptr;
  unsigned status = 0;
  {
    const std::lock_guard lock(mutex_);
    if (cut_) {
      return MHD_NO;
    }
    response = ended_ && !failed_ ? wholeResponse() : streamedResponse();
    if (response == nullptr) {
      return MHD_NO;
    }
    response_ = response;
    connection = connection_;
    status = static_cast<unsigned>(status_);
    lastTaken_ = Clock::now();
    addFields(response, closes);
  }
  const MHD_Result queued = MHD_queue_response(connection, status, response);
  MHD_destroy_response(response);
  return queued;
}

MHD_Response* Exchange::wholeResponse() {
  if (queued_ > sentAtOnce) {
    return readResponse(queued_);
  }
  if (pieces_.size() > 1) {
    // Small writes are joined already: there are few pieces, and little of them.
    for (std::size_t at = 1; at < pieces_.size(); ++at) {
      pieces_.front().append(pieces_[at]);
    }
    pieces_.resize(1);
  }
  // The piece stays where it is until the request is over.
  const bool empty = pieces_.empty();
  return MHD_create_response_from_buffer(queued_, empty ? nullptr : pieces_.front().data(),
                                         MHD_RESPMEM_PERSISTENT);
}

MHD_Response* Exchange::streamedResponse() {
  streams_ = true;
  return readResponse(MHD_SIZE_UNKNOWN);
}

MHD_Response* Exchange::readResponse(std::uint64_t size) {
  auto* self = new (std::nothrow) std::shared_ptr<Exchange>(shared_from_this());
  if (self == nullptr) {
    return nullptr;
  }
  MHD_Response* response =
      MHD_create_response_from_callback(size, blockSize, readContent, self, releaseContent);
  if (response == nullptr) {
    delete self;
  }
  return response;
}

void Exchange::addFields(MHD_Response* response, bool closes) {
  const bool trailersGo = streams_ && request.takesTrailers;
  for (const Field& field : fields_) {
    if (isServersOwn(field) || (!trailersGo && isNamed(field, "Trailer"))) {
      continue;
    }
    // MHD refuses an empty value. The blank is none either: it belongs to no value (RFC 9112).
    const char* value = field.value.empty() ? " " : field.value.c_str();
    if (MHD_add_response_header(response, field.name.c_str(), value) != MHD_YES) {
      parts_.log(LogLevel::error, "a header of an answer was left out: HTTP cannot carry its value");
    }
  }
  if (closes) {
    MHD_add_response_header(response, "Connection", "close");
  }
}

ssize_t Exchange::take(char* buffer, std::size_t size) {
  const std::lock_guard lock(mutex_);
  if (cut_) {
    return MHD_CONTENT_READER_END_WITH_ERROR;
  }
  if (queued_ == 0) {
    if (ended_) {
      return endOfStream();
    }
    suspended_ = true;
    MHD_suspend_connection(connection_);
    return 0;
  }
  std::size_t moved = 0;
  while (moved < size && queued_ > 0) {
    const std::string& piece = pieces_.front();
    const std::size_t count = std::min(size - moved, piece.size() - taken_);
    piece.copy(buffer + moved, count, taken_);
    moved += count;
    taken_ += count;
    queued_ -= count;
    if (taken_ == piece.size()) {
      pieces_.pop_front();
      taken_ = 0;
    }
  }
  lastTaken_ = Clock::now();
  if (queued_ <= parts_.bounds.queue / 2) {
    space_.notify_one();
  }
  return static_cast<ssize_t>(moved);
}

ssize_t Exchange::endOfStream() {
  if (!failed_) {
    return MHD_CONTENT_READER_END_OF_STREAM;
  }
  if (!streams_ || !request.takesTrailers) {
    return MHD_CONTENT_READER_END_WITH_ERROR;
  }
  for (const Field& trailer : trailers_) {
    if (MHD_add_response_footer(response_, trailer.name.c_str(), trailer.value.c_str()) != MHD_YES) {
      parts_.log(LogLevel::error, "a trailer of an answer was left out: HTTP cannot carry its value");
    }
  }
  return MHD_CONTENT_READER_END_OF_STREAM;
}

void Exchange::gone() {
  const std::lock_guard lock(mutex_);
  connection_ = nullptr;
  response_ = nullptr;
  suspended_ = false;
  cut_ = true;
  space_.notify_all();
}

}  // namespace cimom::http
