// Reading and replacing the password file.
#include <cimom/http/Descriptor.h>
#include <cimom/http/Files.h>
#include <cimom/http/Passwords.h>
#include <fcntl.h>
#include <sys/file.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <cstdio>
#include <cstring>
#include <optional>

namespace cimom::http {
namespace {

[[noreturn]] void refuse(const std::string& path, const std::string& why) {
  throw PasswordError("password file " + path + ": " + why);
}

[[noreturn]] void refuseErrno(const std::string& path, const char* what) {
  refuse(path, std::string(what) + ": " + std::strerror(errno));
}

/// Nothing: there is no such file.
std::optional<File> readFile(const std::string& path) {
  try {
    return readSecretFile(path);
  } catch (const std::runtime_error& error) {
    throw PasswordError(std::string("password file ") + error.what());
  }
}

std::string folderOf(const std::string& path) {
  const std::size_t slash = path.rfind('/');
  if (slash == std::string::npos) {
    return ".";
  }
  return slash == 0 ? "/" : path.substr(0, slash);
}

void writeAll(int descriptor, std::string_view text, const std::string& path) {
  while (!text.empty()) {
    const ssize_t count = ::write(descriptor, text.data(), text.size());
    if (count < 0 && errno != EINTR) {
      refuseErrno(path, "cannot be written");
    }
    text.remove_prefix(count < 0 ? 0 : static_cast<std::size_t>(count));
  }
}

void fill(const Descriptor& file, const std::optional<File>& old, std::string_view text,
          const std::string& path) {
  writeAll(file.get(), text, path);
  // The service may run as another user than the administrator who changes the file for it.
  if (old && ::fchown(file.get(), old->status.st_uid, old->status.st_gid) != 0) {
    refuseErrno(path, "a new file cannot get the old one's owner");
  }
  const mode_t mode = old ? old->status.st_mode & (S_IRUSR | S_IWUSR | S_IRGRP) : S_IRUSR | S_IWUSR;
  if (::fchmod(file.get(), mode) != 0 || ::fsync(file.get()) != 0) {
    refuseErrno(path, "cannot be written");
  }
}

void replace(const std::string& path, const Descriptor& folder, const std::optional<File>& old,
             std::string_view text) {
  std::string temporary = path + ".XXXXXX";
  const Descriptor file(::mkostemp(temporary.data(), O_CLOEXEC));
  if (!file) {
    refuseErrno(path, "no new file can be made beside it");
  }
  try {
    fill(file, old, text, path);
    if (::rename(temporary.c_str(), path.c_str()) != 0) {
      refuseErrno(path, "cannot be replaced");
    }
  } catch (...) {
    ::unlink(temporary.c_str());
    throw;
  }
  ::fsync(folder.get());
}

/// Puts `line` in the place of the user's, or at the end; an empty line removes the user's.
bool change(const std::string& path, std::string_view user, const std::string& line) {
  // Two who change the file at once change it one after the other.
  const std::string folderPath = folderOf(path);
  const Descriptor folder(::open(folderPath.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC));
  if (!folder || ::flock(folder.get(), LOCK_EX) != 0) {
    refuseErrno(path, "its folder cannot be used");
  }
  const std::optional<File> old = readFile(path);
  const std::string_view text = old ? std::string_view(old->text) : std::string_view();
  const bool known = Passwords::parse(text, path).hashes().contains(user);
  if (!known && line.empty()) {
    return false;
  }
  const std::string start = std::string(user) + ":";
  std::string changed;
  for (std::string_view left = text; !left.empty();) {
    const std::size_t end = std::min(left.find('\n'), left.size());
    const std::string_view content = left.substr(0, end);
    left.remove_prefix(std::min(end + 1, left.size()));
    if (!content.starts_with(start)) {
      changed.append(content).push_back('\n');
    } else if (!line.empty()) {
      changed.append(line).push_back('\n');
    }
  }
  if (!known) {
    changed.append(line).push_back('\n');
  }
  replace(path, folder, old, changed);
  return known;
}

}  // namespace

Passwords Passwords::read(const std::string& path) {
  const auto file = readFile(path);
  if (!file) {
    refuse(path, "does not exist; make it with the first user");
  }
  return parse(file->text, path);
}

bool setPassword(const std::string& path, std::string_view user, std::string_view password) {
  if (!isUserName(user)) {
    throw PasswordError(
        "a user's name has 1 to 128 bytes, no ':', no control characters, no space at its ends and no '#' at "
        "its "
        "beginning");
  }
  return !change(path, user, std::string(user) + ":" + hashPassword(password));
}

bool removePassword(const std::string& path, std::string_view user) {
  return change(path, user, std::string());
}

}  // namespace cimom::http
