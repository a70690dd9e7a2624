#include <cimom/http/Descriptor.h>
#include <cimom/http/Files.h>
#include <fcntl.h>

#include <array>
#include <cerrno>
#include <cstring>
#include <stdexcept>

namespace cimom::http {
namespace {

[[noreturn]] void refuse(const std::string& path, const std::string& why) {
  throw std::runtime_error(path + ": " + why);
}

[[noreturn]] void refuseErrno(const std::string& path, const char* what) {
  refuse(path, std::string(what) + ": " + std::strerror(errno));
}

std::string readAll(const Descriptor& file, const std::string& path) {
  constexpr std::size_t largest = 4UL * 1024 * 1024;
  constexpr std::size_t atOnce = 16UL * 1024;
  std::string text;
  std::array<char, atOnce> buffer{};
  for (;;) {
    const ssize_t count = ::read(file.get(), buffer.data(), buffer.size());
    if (count == 0) {
      return text;
    }
    if (count < 0 && errno != EINTR) {
      refuseErrno(path, "cannot be read");
    }
    text.append(buffer.data(), count < 0 ? 0 : static_cast<std::size_t>(count));
    if (text.size() > largest) {
      refuse(path, "is larger than such a file can be");
    }
  }
}

}  // namespace

std::optional<File> readPublicFile(const std::string& path) {
  // Opening a pipe would wait for its other end.
  const Descriptor descriptor(::open(path.c_str(), O_RDONLY | O_CLOEXEC | O_NONBLOCK));
  if (!descriptor) {
    if (errno == ENOENT) {
      return std::nullopt;
    }
    refuseErrno(path, "cannot be opened");
  }
  File file;
  if (::fstat(descriptor.get(), &file.status) != 0) {
    refuseErrno(path, "cannot be looked at");
  }
  if (!S_ISREG(file.status.st_mode)) {
    refuse(path, "is no file");
  }
  file.text = readAll(descriptor, path);
  return file;
}

std::optional<File> readSecretFile(const std::string& path) {
  auto file = readPublicFile(path);
  if (file && (file->status.st_mode & (S_IRWXO | S_IWGRP)) != 0) {
    refuse(path, "others than its owner and group may use it, or its group may write it; chmod 0640 it");
  }
  return file;
}

}  // namespace cimom::http
