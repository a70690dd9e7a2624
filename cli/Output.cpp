#include <cli/Output.h>

#include <cerrno>

#include <unistd.h>

namespace cli {
namespace {
constexpr std::size_t pieceSize = std::size_t{64} * 1024;
}

void Output::write(std::string_view text) {
  if (error_ != 0) {
    return;
  }
  pending_ += text;
  if (pending_.size() >= pieceSize) {
    flush();
  }
}

void Output::flush() {
  std::string_view rest = pending_;
  while (error_ == 0 && !rest.empty()) {
    const ssize_t written = ::write(descriptor_, rest.data(), rest.size());
    if (written >= 0) {
      rest.remove_prefix(static_cast<std::size_t>(written));
    } else if (errno != EINTR) {
      error_ = errno;
    }
  }
  pending_.clear();
}

}  // namespace cli
