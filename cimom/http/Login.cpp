#include <cimom/http/Login.h>
#include <gnutls/crypto.h>

#include <algorithm>
#include <stdexcept>

namespace cimom::http {
namespace {

// More than live logins and attackers of an ordinary day; what is beyond replaces the oldest.
constexpr std::size_t mostRemembered = 1024;
constexpr std::size_t mostOrigins = 4096;

template <typename Table, typename Time>
void eraseOldest(Table& table, Time time) {
  const auto oldest = std::min_element(table.begin(), table.end(), [&](const auto& left, const auto& right) {
    return time(left.second) < time(right.second);
  });
  if (oldest != table.end()) {
    table.erase(oldest);
  }
}

}  // namespace

Login::Login(const Settings& settings) : path_(settings.passwordFile), bounds_(settings.bounds) {
  if (gnutls_rnd(GNUTLS_RND_KEY, key_.data(), key_.size()) != GNUTLS_E_SUCCESS) {
    throw std::runtime_error("the system gives no random numbers");
  }
  reload();
}

void Login::reload() {
  if (path_.empty()) {
    return;
  }
  auto read = std::make_shared<const Passwords>(Passwords::read(path_));
  const std::lock_guard lock(mutex_);
  passwords_ = std::move(read);
  remembered_.clear();
}

std::shared_ptr<const Passwords> Login::passwords() const {
  const std::lock_guard lock(mutex_);
  return passwords_;
}

Login::Digest Login::digest(const BasicLogin& login) const {
  // Neither part can hold the NUL between them.
  const std::string text = login.user + '\0' + login.password;
  Digest digest(gnutls_hmac_get_len(GNUTLS_MAC_SHA256), '\0');
  if (gnutls_hmac_fast(GNUTLS_MAC_SHA256, key_.data(), key_.size(), text.data(), text.size(),
                       digest.data()) != GNUTLS_E_SUCCESS) {
    return {};
  }
  return digest;
}

bool Login::remembers(const BasicLogin& login) {
  const Digest wanted = digest(login);
  const std::lock_guard lock(mutex_);
  const auto found = remembered_.find(wanted);
  return !wanted.empty() && found != remembered_.end() && Clock::now() < found->second;
}

bool Login::check(const BasicLogin& login) {
  const auto known = passwords();
  if (!known || !known->verify(login.user, login.password)) {
    return false;
  }
  const Digest passed = digest(login);
  const std::lock_guard lock(mutex_);
  // A password that was changed meanwhile is not remembered.
  if (!passed.empty() && known == passwords_) {
    if (remembered_.size() >= mostRemembered) {
      eraseOldest(remembered_, [](Clock::time_point until) { return until; });
    }
    remembered_[passed] = Clock::now() + bounds_.rememberedLogin;
  }
  return true;
}

Clock::duration Login::delayAfter(unsigned failures) const {
  std::chrono::milliseconds delay = bounds_.loginDelay;
  for (unsigned doubled = 1; doubled < failures && delay < bounds_.longestLoginDelay; ++doubled) {
    delay *= 2;
  }
  return std::min(delay, bounds_.longestLoginDelay);
}

std::optional<Clock::duration> Login::turn(const std::string& origin) {
  const auto now = Clock::now();
  const std::lock_guard lock(mutex_);
  const auto found = failures_.find(origin);
  if (found == failures_.end()) {
    return Clock::duration::zero();
  }
  Failures& failures = found->second;
  if (now - failures.last > bounds_.rememberedFailure) {
    failures_.erase(found);
    return Clock::duration::zero();
  }
  const auto start = std::max(now, failures.next);
  if (start - now > bounds_.longestLoginDelay) {
    return std::nullopt;
  }
  failures.next = start + delayAfter(failures.count);
  return start - now;
}

void Login::failed(const std::string& origin) {
  const auto now = Clock::now();
  const std::lock_guard lock(mutex_);
  if (!failures_.contains(origin)) {
    makeRoom(now);
  }
  Failures& failures = failures_[origin];
  ++failures.count;
  failures.last = now;
  failures.next = std::max(failures.next, now + delayAfter(failures.count));
}

void Login::makeRoom(Clock::time_point now) {
  if (failures_.size() < mostOrigins) {
    return;
  }
  std::erase_if(failures_,
                [&](const auto& entry) { return now - entry.second.last > bounds_.rememberedFailure; });
  if (failures_.size() >= mostOrigins) {
    eraseOldest(failures_, [](const Failures& failures) { return failures.last; });
  }
}

}  // namespace cimom::http
