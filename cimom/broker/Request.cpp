#include <cimom/broker/Request.h>

#include <algorithm>

namespace cimom {

namespace {
thread_local Request* currentRequest = nullptr;
}

Request* Request::current() {
  return currentRequest;
}

void Request::recycle() {
  if (marks_.empty()) {
    made_.reset();
  }
}

void* Request::mark() {
  marks_.push_back(std::make_unique<Arena>());
  return marks_.back().get();
}

bool Request::release(const void* mark) {
  const auto position =
      std::find_if(marks_.begin(), marks_.end(), [mark](const auto& arena) { return arena.get() == mark; });
  if (position == marks_.end()) {
    return false;
  }
  marks_.erase(position, marks_.end());
  return true;
}

bool Request::owns(const Arena& arena) const {
  return &arena == &made_ || &arena == &held_ ||
         std::any_of(marks_.begin(), marks_.end(), [&](const auto& mark) { return mark.get() == &arena; });
}

RequestScope::RequestScope(Request* request) : previous_(currentRequest) {
  currentRequest = request;
}

RequestScope::~RequestScope() {
  currentRequest = previous_;
}

}  // namespace cimom
