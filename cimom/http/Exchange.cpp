// The worker's side, and what both share.
#include <cimom/http/Exchange.h>
#include <cimom/http/Workers.h>
#include <sys/socket.h>

#include <algorithm>
#include <stdexcept>

namespace cimom::http {
namespace {

// Waking the sending thread costs as much as sending this many bytes.
constexpr std::size_t worthWaking = 64UL * 1024;
// Small writes are joined to pieces of this size.
constexpr std::size_t pieceSize = 64UL * 1024;

}  // namespace

void Exchange::begin(int status, std::vector<Field> fields) {
  const std::lock_guard lock(mutex_);
  if (begun_) {
    throw std::logic_error("an answer was begun twice");
  }
  begun_ = true;
  status_ = status;
  fields_ = std::move(fields);
}

bool Exchange::write(std::string_view bytes) {
  std::unique_lock lock(mutex_);
  if (!begun_) {
    throw std::logic_error("an answer was written before it was begun");
  }
  const bool whole = request.isHttp10;
  if (ended_ || (whole && refuseTooLarge(bytes.size()))) {
    return false;
  }
  while (!bytes.empty() && !cut_) {
    const std::size_t space =
        whole ? bytes.size() : parts_.bounds.queue - std::min(parts_.bounds.queue, queued_);
    append(bytes.substr(0, space));
    bytes.remove_prefix(std::min(space, bytes.size()));
    if (whole) {
      continue;
    }
    if (queued_ >= std::min(worthWaking, parts_.bounds.queue)) {
      wake();
    } else if (!flushing_) {
      flushing_ = true;
      parts_.flusher.add(weak_from_this());
    }
    if (!bytes.empty()) {
      waitForSpace(lock);
    }
  }
  return !cut_;
}

bool Exchange::countWhole(std::size_t more) {
  const std::size_t bound = parts_.bounds.wholeAnswer;
  if (more > bound - std::min(bound, queued_)) {
    return false;
  }
  counted_ += more;
  return (parts_.wholeBytes += more) <= parts_.bounds.wholeAnswers;
}

bool Exchange::refuseTooLarge(std::size_t more) {
  if (countWhole(more)) {
    return false;
  }
  clear();
  status_ = MHD_HTTP_INTERNAL_SERVER_ERROR;
  fields_ = {{"Content-Type", "text/plain; charset=utf-8"}};
  append("The answer is too large for HTTP/1.0: ask with HTTP/1.1.\n");
  ended_ = true;
  parts_.log(LogLevel::warning,
             request.peer +
                 ": an answer to HTTP/1.0 was refused: it, or all of them, would be too large to be held");
  return true;
}

bool Exchange::waitForSpace(std::unique_lock<std::mutex>& lock) {
  const std::size_t low = parts_.bounds.queue / 2;
  const auto hasSpace = [&] { return cut_ || queued_ <= low; };
  if (!hasSpace()) {
    // Whoever watches the time cuts a client that takes nothing.
    parts_.workers.park();
    space_.wait(lock, hasSpace);
    parts_.workers.unpark();
  }
  return !cut_;
}

void Exchange::append(std::string_view bytes) {
  if (bytes.empty()) {
    return;
  }
  queued_ += bytes.size();
  if (pieces_.empty() || pieces_.back().size() + bytes.size() > pieceSize) {
    std::string& piece = pieces_.emplace_back();
    // The first may be the only one; what follows it grows to its full size.
    piece.reserve(pieces_.size() == 1 && !out_ ? bytes.size() : std::max(pieceSize, bytes.size()));
    piece.append(bytes);
  } else {
    pieces_.back().append(bytes);
  }
}

void Exchange::clear() {
  pieces_.clear();
  taken_ = 0;
  queued_ = 0;
  parts_.wholeBytes -= counted_;
  counted_ = 0;
}

void Exchange::fail(std::vector<Field> trailers) {
  const std::lock_guard lock(mutex_);
  if (!out_) {
    clear();
    fields_.clear();
    begun_ = false;
    ended_ = false;
    return;
  }
  if (!ended_) {
    ended_ = true;
    failed_ = true;
    trailers_ = std::move(trailers);
    wake();
  }
}

bool Exchange::started() const {
  const std::lock_guard lock(mutex_);
  return out_;
}

void Exchange::finish() {
  {
    const std::lock_guard lock(mutex_);
    if (begun_ || out_) {
      ended_ = true;
      wake();
      return;
    }
  }
  refuse(MHD_HTTP_INTERNAL_SERVER_ERROR, "The request was not answered.\n");
}

void Exchange::refuse(int status, std::string_view text, std::vector<Field> fields) {
  const std::lock_guard lock(mutex_);
  if (out_) {
    failed_ = failed_ || !ended_;
  } else {
    clear();
    begun_ = true;
    status_ = status;
    fields_ = std::move(fields);
    fields_.push_back({"Content-Type", "text/plain; charset=utf-8"});
    append(text);
  }
  ended_ = true;
  wake();
}

void Exchange::flush() {
  const std::lock_guard lock(mutex_);
  flushing_ = false;
  if (queued_ > 0 && !request.isHttp10) {
    wake();
  }
}

void Exchange::wake() {
  out_ = true;
  if (suspended_) {
    suspended_ = false;
    lastTaken_ = Clock::now();
    MHD_resume_connection(connection_);
  }
}

void Exchange::cut() {
  const std::lock_guard lock(mutex_);
  cutLocked();
}

bool Exchange::isCut() const {
  const std::lock_guard lock(mutex_);
  return cut_;
}

void Exchange::cutLocked() {
  if (cut_) {
    return;
  }
  cut_ = true;
  space_.notify_all();
  if (connection_ != nullptr) {
    // The sending thread waits for the client to take more: a closed socket wakes it.
    const auto* info = MHD_get_connection_info(connection_, MHD_CONNECTION_INFO_CONNECTION_FD);
    if (info != nullptr) {
      ::shutdown(info->connect_fd, SHUT_RDWR);
    }
    wake();
  }
}

bool Exchange::cutIfStalled(Clock::time_point now) {
  const std::lock_guard lock(mutex_);
  const bool sending = out_ && !suspended_ && !cut_ && connection_ != nullptr;
  if (!sending || now - lastTaken_ <= parts_.bounds.stall) {
    return false;
  }
  cutLocked();
  return true;
}

void Flusher::add(std::weak_ptr<Exchange> exchange) {
  const std::lock_guard lock(mutex_);
  waiting_.push_back(std::move(exchange));
  if (waiting_.size() == 1) {
    timer_.at(Clock::now() + delay_, [this] { run(); });
  }
}

void Flusher::run() {
  std::vector<std::weak_ptr<Exchange>> due;
  {
    const std::lock_guard lock(mutex_);
    due.swap(waiting_);
  }
  for (const auto& waiting : due) {
    if (const auto exchange = waiting.lock()) {
      exchange->flush();
    }
  }
}

}  // namespace cimom::http
