// Logins by password: checked, remembered, and slowed where they fail.
#pragma once

#include <cimom/http/BasicLogin.h>
#include <cimom/http/Passwords.h>
#include <cimom/http/Settings.h>
#include <cimom/http/Timer.h>

#include <array>
#include <cstddef>
#include <memory>
#include <mutex>
#include <optional>
#include <string>
#include <string_view>
#include <unordered_map>

namespace cimom::http {

/// Any thread.
class Login {
 public:
  /// Throws PasswordError where the settings name a file that cannot be used.
  explicit Login(const Settings& settings);

  /// Reads the file again; what was remembered is forgotten. Throws PasswordError, and keeps the old.
  void reload();

  /// Whether this login succeeded some minutes ago. Cheap.
  [[nodiscard]] bool remembers(const BasicLogin& login);

  /// Whether the password is the user's; remembers it if so. Takes as long as a hash takes.
  [[nodiscard]] bool check(const BasicLogin& login);

  /// How long a login from this origin has to wait for earlier ones that failed: its turn is taken with the
  /// call. Nothing: longer than any login waits.
  [[nodiscard]] std::optional<Clock::duration> turn(const std::string& origin);

  /// A login from this origin failed.
  void failed(const std::string& origin);

 private:
  using Digest = std::string;
  struct Failures {
    unsigned count = 0;
    Clock::time_point next;  ///< when the next login may be tried
    Clock::time_point last;
  };

  [[nodiscard]] Digest digest(const BasicLogin& login) const;
  [[nodiscard]] std::shared_ptr<const Passwords> passwords() const;
  [[nodiscard]] Clock::duration delayAfter(unsigned failures) const;
  void makeRoom(Clock::time_point now);

  static constexpr std::size_t keySize = 32;
  const std::string path_;
  const Bounds bounds_;
  std::array<unsigned char, keySize> key_{};
  mutable std::mutex mutex_;
  std::shared_ptr<const Passwords> passwords_;
  std::unordered_map<Digest, Clock::time_point> remembered_;  ///< until when
  std::unordered_map<std::string, Failures> failures_;
};

}  // namespace cimom::http
