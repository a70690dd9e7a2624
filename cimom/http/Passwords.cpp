#include <cimom/http/Passwords.h>
#include <crypt.h>

#include <algorithm>
#include <cerrno>
#include <cstring>
#include <memory>
#include <optional>

namespace cimom::http {
namespace {

// A file of users is small; what is larger is another file.
constexpr std::size_t largestFile = 4UL * 1024 * 1024;

std::optional<std::string> hashWith(std::string_view password, const std::string& setting) {
  const auto data = std::make_unique<crypt_data>();
  const std::string phrase(password);
  const char* hash = crypt_r(phrase.c_str(), setting.c_str(), data.get());
  if (hash == nullptr || hash[0] == '*') {
    return std::nullopt;
  }
  return std::string(hash);
}

bool isHash(std::string_view text) {
  const bool known = text.starts_with("$y$") || text.starts_with("$6$");
  const bool plain = std::all_of(text.begin(), text.end(),
                                 [](char letter) { return letter > ' ' && letter <= '~' && letter != ':'; });
  // A setting without its hash would fit no password; the hashes themselves have 43 and 86 letters.
  constexpr std::size_t shortestHash = 43;
  return known && plain && text.size() - text.rfind('$') > shortestHash &&
         crypt_checksalt(std::string(text).c_str()) == CRYPT_SALT_OK;
}

bool sameBytes(std::string_view left, std::string_view right) {
  unsigned difference = left.size() == right.size() ? 0 : 1;
  for (std::size_t at = 0; at < std::min(left.size(), right.size()); ++at) {
    difference |= static_cast<unsigned char>(left[at]) ^ static_cast<unsigned char>(right[at]);
  }
  return difference == 0;
}

}  // namespace

bool isUserName(std::string_view name) {
  constexpr std::size_t longest = 128;
  constexpr char firstPrintable = ' ';
  constexpr char deleted = 0x7F;
  return !name.empty() && name.size() <= longest && name.front() != '#' && name.front() != ' ' &&
         name.back() != ' ' && std::none_of(name.begin(), name.end(), [](char letter) {
           return letter == ':' || letter == deleted || (letter >= 0 && letter < firstPrintable);
         });
}

std::string hashPassword(std::string_view password) {
  if (password.empty() || password.size() >= CRYPT_MAX_PASSPHRASE_SIZE ||
      password.find('\0') != std::string_view::npos) {
    throw PasswordError("a password has 1 to " + std::to_string(CRYPT_MAX_PASSPHRASE_SIZE - 1) +
                        " bytes, none of them NUL");
  }
  std::string setting(CRYPT_GENSALT_OUTPUT_SIZE, '\0');
  if (crypt_gensalt_rn("$y$", 0, nullptr, 0, setting.data(), static_cast<int>(setting.size())) == nullptr) {
    throw PasswordError(std::string("this system's crypt(3) makes no yescrypt hashes: ") +
                        std::strerror(errno));
  }
  const auto hash = hashWith(password, setting);
  if (!hash) {
    throw PasswordError("this system's crypt(3) cannot hash the password");
  }
  return *hash;
}

namespace {

const std::string& nobodysHash() {
  static const std::string hash = hashPassword("nobody");
  return hash;
}

}  // namespace

Passwords Passwords::parse(std::string_view text, std::string_view origin) {
  const auto refuse = [&](std::size_t line, const std::string& why) {
    throw PasswordError(std::string(origin) + ":" + std::to_string(line) + ": " + why);
  };
  if (text.size() > largestFile) {
    refuse(1, "the file is too large for a password file");
  }
  Passwords passwords;
  for (std::size_t line = 1; !text.empty(); ++line) {
    const std::size_t end = std::min(text.find('\n'), text.size());
    const std::string_view content = text.substr(0, end);
    text.remove_prefix(std::min(end + 1, text.size()));
    if (content.empty() || content.front() == '#') {
      continue;
    }
    const std::size_t colon = content.find(':');
    if (colon == std::string_view::npos || !isUserName(content.substr(0, colon))) {
      refuse(line, "a line has the form name:hash, and this one has no valid name");
    }
    const std::string_view hash = content.substr(colon + 1);
    if (!isHash(hash)) {
      refuse(line, "the password's hash is neither yescrypt ($y$) nor SHA-512 ($6$); set the password anew");
    }
    if (!passwords.hashes_.emplace(content.substr(0, colon), hash).second) {
      refuse(line, "this user was on an earlier line; remove one of the two");
    }
  }
  // Hashing for an unknown user costs what it costs for a known one.
  passwords.nobody_ = passwords.hashes_.empty() ? nobodysHash() : passwords.hashes_.begin()->second;
  return passwords;
}

bool Passwords::verify(std::string_view user, std::string_view password) const {
  const auto found = hashes_.find(user);
  const std::string& expected = found == hashes_.end() ? nobody_ : found->second;
  const auto hash = hashWith(password, expected);
  return hash && sameBytes(*hash, expected) && found != hashes_.end();
}

}  // namespace cimom::http
