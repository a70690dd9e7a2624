#include <cimom/http/Desk.h>

#include <algorithm>
#include <exception>
#include <utility>

namespace cimom::http {
namespace {

// Hashing is made to cost time and memory: more at once would let strangers slow everybody down.
constexpr std::size_t loginsAtOnce = 2;

/// Bounds below which nothing would move.
Settings workable(Settings settings) {
  constexpr std::size_t smallestQueue = 4096;
  settings.bounds.queue = std::max(settings.bounds.queue, smallestQueue);
  settings.bounds.workers = std::max<std::size_t>(settings.bounds.workers, 1);
  return settings;
}

}  // namespace

Desk::Desk(Settings settings, Handler handler)
    : settings_(workable(std::move(settings))),
      handler_(std::move(handler)),
      login_(settings_),
      flusher_(timer_, settings_.bounds.flush),
      workers_(settings_.bounds.keptWorkers, settings_.bounds.workers),
      logins_(0, loginsAtOnce),
      parts_{settings_.bounds, workers_, flusher_, wholeBytes_,
             [this](LogLevel level, std::string_view line) { log(level, std::string(line)); }} {}

Desk::~Desk() {
  timer_.stop();
  logins_.stop();
  workers_.stop();
}

void Desk::log(LogLevel level, const std::string& line) const {
  if (settings_.log) {
    settings_.log(level, line);
  }
}

std::shared_ptr<Exchange> Desk::arrive() {
  auto exchange = std::make_shared<Exchange>(parts_);
  const std::lock_guard lock(mutex_);
  if (shut_) {
    return nullptr;
  }
  exchanges_.emplace(exchange.get(), exchange);
  return exchange;
}

void Desk::leave(Exchange& exchange) {
  const std::lock_guard lock(mutex_);
  exchanges_.erase(&exchange);
  if (exchanges_.empty()) {
    none_.notify_all();
  }
}

std::size_t Desk::underWay() const {
  const std::lock_guard lock(mutex_);
  return exchanges_.size();
}

bool Desk::takeBytes(std::size_t count) {
  if (bytes_.fetch_add(count) + count <= settings_.bounds.bodies) {
    return true;
  }
  bytes_ -= count;
  return false;
}

bool Desk::isOpen(const Request& request) const {
  const std::string_view target = std::string_view(request.target).substr(0, request.target.find('?'));
  const auto& open = settings_.openTargets;
  return (request.method == "GET" || request.method == "HEAD") &&
         std::find(open.begin(), open.end(), target) != open.end();
}

Refusal Desk::unauthorized() const {
  return {401, "A login is needed.\n", {{"WWW-Authenticate", "Basic realm=\"" + settings_.realm + "\""}}};
}

std::optional<Refusal> Desk::refusalWithoutLogin(const Request& request) const {
  const bool byPassword = !settings_.passwordFile.empty();
  const bool byCertificate = !settings_.clientCaFile.empty();
  if ((!byPassword && !byCertificate) || isOpen(request)) {
    return std::nullopt;
  }
  if (byPassword) {
    return unauthorized();
  }
  return Refusal{403, "A client certificate that this server trusts is needed.\n", {}};
}

void Desk::submit(Workers& workers, const std::shared_ptr<Exchange>& exchange, Workers::Task task) {
  try {
    workers.submit(std::move(task));
  } catch (const std::exception& error) {
    log(LogLevel::error, std::string("no thread for a request: ") + error.what());
    exchange->refuse(503, "The server has no thread for the request.\n");
  }
}

void Desk::serve(const std::shared_ptr<Exchange>& exchange) {
  submit(workers_, exchange, [this, exchange] { handle(*exchange); });
}

void Desk::serve(const std::shared_ptr<Exchange>& exchange, BasicLogin login, std::string origin) {
  if (login_.remembers(login)) {
    exchange->request.user = std::move(login.user);
    serve(exchange);
    return;
  }
  submit(logins_, exchange, [this, exchange, login = std::move(login), origin = std::move(origin)] {
    checkInTurn(exchange, login, origin);
  });
}

void Desk::checkInTurn(const std::shared_ptr<Exchange>& exchange, const BasicLogin& login,
                       const std::string& origin) {
  const auto wait = login_.turn(origin);
  if (!wait) {
    log(LogLevel::warning, exchange->request.peer + ": too many logins wait after failed ones; refused");
    const auto seconds = std::chrono::ceil<std::chrono::seconds>(settings_.bounds.longestLoginDelay).count();
    exchange->refuse(429, "Too many failed logins.\n", {{"Retry-After", std::to_string(seconds)}});
    return;
  }
  if (*wait == Clock::duration::zero()) {
    check(exchange, login, origin);
    return;
  }
  timer_.at(Clock::now() + *wait, [this, exchange, login, origin] {
    submit(logins_, exchange, [this, exchange, login, origin] { check(exchange, login, origin); });
  });
}

void Desk::check(const std::shared_ptr<Exchange>& exchange, const BasicLogin& login,
                 const std::string& origin) {
  if (login_.check(login)) {
    exchange->request.user = login.user;
    serve(exchange);
    return;
  }
  login_.failed(origin);
  log(LogLevel::warning, exchange->request.peer + ": login of \"" + printable(login.user) +
                             "\" failed: unknown user or wrong password");
  Refusal refusal = unauthorized();
  exchange->refuse(refusal.status, refusal.text, std::move(refusal.fields));
}

void Desk::handle(Exchange& exchange) {
  if (exchange.isCut()) {
    return;
  }
  try {
    handler_(exchange.request, exchange);
    exchange.finish();
  } catch (const std::exception& error) {
    log(LogLevel::error, exchange.request.peer + ": handling a request failed: " + error.what());
    exchange.refuse(500, "The request could not be handled.\n");
  } catch (...) {
    log(LogLevel::error,
        exchange.request.peer + ": handling a request failed for a reason that was not given");
    exchange.refuse(500, "The request could not be handled.\n");
  }
}

bool Desk::waitForNone(std::chrono::milliseconds patience) {
  std::unique_lock lock(mutex_);
  return none_.wait_for(lock, patience, [this] { return exchanges_.empty(); });
}

void Desk::cutAll() {
  std::vector<std::shared_ptr<Exchange>> all;
  {
    const std::lock_guard lock(mutex_);
    shut_ = true;
    for (const auto& [unused, exchange] : exchanges_) {
      all.push_back(exchange.lock());
    }
  }
  for (const auto& exchange : all) {
    if (exchange) {
      exchange->cut();
    }
  }
}

void Desk::cutStalled(Clock::time_point now) {
  std::vector<std::shared_ptr<Exchange>> all;
  {
    const std::lock_guard lock(mutex_);
    for (const auto& [unused, exchange] : exchanges_) {
      all.push_back(exchange.lock());
    }
  }
  for (const auto& exchange : all) {
    if (exchange && exchange->cutIfStalled(now)) {
      log(LogLevel::warning, exchange->request.peer + ": cut, because it took nothing of its answer for " +
                                 std::to_string(settings_.bounds.stall.count()) + " ms");
    }
  }
}

}  // namespace cimom::http
