// The password file: one line for each user, `name:hash`, the hash as crypt(3) makes it.
//
// Names are 1 to 128 bytes of UTF-8 without ':', control characters or spaces at the ends, and do not begin
// with
// '#'. Lines that begin with '#' and empty lines say nothing. Hashes are yescrypt ($y$) or SHA-512 ($6$).
#pragma once

#include <map>
#include <stdexcept>
#include <string>
#include <string_view>

namespace cimom::http {

/// What is wrong with a password file, where, and what to do.
class PasswordError : public std::runtime_error {
 public:
  using std::runtime_error::runtime_error;
};

/// The users of a password file. Constant once made: any number of threads may verify at once.
class Passwords {
 public:
  /// Parses the text of a file; `origin` names it in errors. Throws PasswordError.
  [[nodiscard]] static Passwords parse(std::string_view text, std::string_view origin);

  /// Reads a file. Throws PasswordError, also where others than its owner and group may read it or others
  /// than its owner may write it.
  [[nodiscard]] static Passwords read(const std::string& path);

  /// Whether this is the user's password. Takes as long as the hash is made to take (some 10 ms), for users
  /// who do not exist as well.
  [[nodiscard]] bool verify(std::string_view user, std::string_view password) const;

  /// The names and their hashes.
  [[nodiscard]] const std::map<std::string, std::string, std::less<>>& hashes() const { return hashes_; }

 private:
  std::map<std::string, std::string, std::less<>> hashes_;
  std::string nobody_;  ///< what passwords of unknown users are hashed against
};

/// Whether a user may be called so.
[[nodiscard]] bool isUserName(std::string_view name);

/// A new salted yescrypt hash. Throws PasswordError for a password that is empty, too long or has a NUL.
[[nodiscard]] std::string hashPassword(std::string_view password);

/// Adds a user or changes the password of one; makes the file (mode 0600) where there is none. An existing
/// file keeps its comments, owner and mode, and is replaced in one step: a reader sees the old or the new.
/// Throws PasswordError. True: the user is new.
bool setPassword(const std::string& path, std::string_view user, std::string_view password);

/// Removes a user. False: there is none of this name. Throws PasswordError.
bool removePassword(const std::string& path, std::string_view user);

}  // namespace cimom::http
