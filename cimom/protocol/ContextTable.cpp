#include <cimom/Names.h>
#include <cimom/protocol/CimError.h>
#include <cimom/protocol/ContextTable.h>
#include <cimom/xml/Conversion.h>

#include <sys/random.h>

#include <algorithm>
#include <array>
#include <iterator>
#include <system_error>
#include <utility>

namespace cimom::protocol {

namespace {

// How often the tidier looks for enumerations that nobody uses.
constexpr std::chrono::seconds tidyInterval{1};

/// 128 random bits in hexadecimal: nobody guesses another client's.
std::string newContext() {
  std::array<unsigned char, 16> bytes{};
  if (getrandom(bytes.data(), bytes.size(), 0) != static_cast<ssize_t>(bytes.size()))
    throw CimError(CMPI_RC_ERR_FAILED, "the system has no random bytes for an enumeration's context");
  constexpr std::string_view digits = "0123456789abcdef";
  std::string text;
  for (const unsigned char byte : bytes) {
    text += digits[byte >> 4U];
    text += digits[byte & 15U];
  }
  return text;
}

/// Runs the provider; whatever it throws is how it ended.
Status runSource(const Source& source, ObjectSink& sink) {
  try {
    return source(sink).status;
  } catch (const CimError& error) {
    return {error.code(), error.what()};
  } catch (const xml::ConversionError& error) {
    return {error.code(), error.what()};
  } catch (const std::exception& error) {
    return {CMPI_RC_ERR_FAILED, error.what()};
  }
}

}  // namespace

OpenEnumeration::OpenEnumeration(Owner owner, Pulled pulled, std::chrono::seconds idleTime, std::size_t bound)
    : owner_(std::move(owner)), pulled_(pulled), idleTime_(idleTime), queue_(bound) {}

OpenEnumeration::~OpenEnumeration() {
  queue_.close({serverIsShuttingDown, ""});
  if (thread_.joinable())
    thread_.join();
}

void OpenEnumeration::start(Source source) {
  thread_ = std::thread([this, source = std::move(source)] {
    queue_.end(runSource(source, queue_));
    finished_ = true;
  });
}

ContextTable::Lease::~Lease() {
  if (enumeration_ == nullptr)
    return;
  enumeration_.reset();
  table_->release(context_, false);
}

void ContextTable::Lease::keep() {
  enumeration_.reset();
  table_->release(context_, true);
}

ContextTable::ContextTable(const EndpointSettings& settings)
    : settings_(settings), tidier_([this] { tidyUp(); }) {}

ContextTable::~ContextTable() {
  shutDown();
  {
    const std::scoped_lock lock(mutex_);
    stopping_ = true;
    changed_.notify_all();
  }
  tidier_.join();
}

ContextTable::Lease ContextTable::open(Owner owner, Pulled pulled, std::chrono::seconds idleTime,
                                       Source source) {
  const std::scoped_lock lock(mutex_);
  if (shuttingDown_)
    throw CimError(serverIsShuttingDown, "");
  expire();
  // Providers that do not come to their end count too, or there would be no bound on their threads.
  if (entries_.size() >= settings_.contexts || entries_.size() + ending_.size() >= 2 * settings_.contexts)
    throw CimError(serverLimitsExceeded, "there are " + std::to_string(entries_.size()) +
                                             " open enumerations, and " + std::to_string(ending_.size()) +
                                             " that end; close one, or try again later");
  std::string context = newContext();
  auto enumeration =
      std::make_shared<OpenEnumeration>(std::move(owner), pulled, idleTime, settings_.waitingObjects);
  try {
    enumeration->start(std::move(source));
  } catch (const std::system_error& error) {
    throw CimError(serverLimitsExceeded, std::string("no thread for the enumeration: ") + error.what());
  }
  entries_.emplace(context, Entry{enumeration, settings_.now(), true});
  changed_.notify_all();
  return {*this, std::move(context), std::move(enumeration)};
}

ContextTable::Entries::iterator ContextTable::find(std::string_view context, const Owner& owner) {
  const auto found = entries_.find(context);
  if (found == entries_.end() || found->second.enumeration->owner().user != owner.user)
    throw CimError(invalidEnumerationContext,
                   "the enumeration is not open: it has ended, was closed, or was not used for too long");
  if (!sameName(found->second.enumeration->owner().nameSpace, owner.nameSpace))
    throw CimError(invalidEnumerationContext, "the enumeration was opened in another namespace");
  return found;
}

ContextTable::Lease ContextTable::use(std::string_view context, const Owner& owner,
                                      std::optional<Pulled> pulled) {
  const std::scoped_lock lock(mutex_);
  expire();
  const auto found = find(context, owner);
  if (pulled && found->second.enumeration->pulled() != *pulled)
    throw CimError(invalidEnumerationContext, "the enumeration is pulled from with another operation");
  if (found->second.isUsed)
    throw CimError(invalidEnumerationContext, "another request is pulling from the enumeration");
  found->second.isUsed = true;
  return {*this, found->first, found->second.enumeration};
}

void ContextTable::close(std::string_view context, const Owner& owner) {
  const std::scoped_lock lock(mutex_);
  expire();
  closeEntry(find(context, owner), {pullHasBeenAbandoned, ""});
}

void ContextTable::closeEntry(Entries::iterator entry, const Status& status) {
  entry->second.enumeration->queue().close(status);
  ending_.push_back(std::move(entry->second.enumeration));
  entries_.erase(entry);
  changed_.notify_all();
}

void ContextTable::release(const std::string& context, bool isKept) {
  const std::scoped_lock lock(mutex_);
  const auto found = entries_.find(context);
  if (found == entries_.end())
    return;  // closed meanwhile
  found->second.isUsed = false;
  found->second.lastUse = settings_.now();
  if (!isKept)
    closeEntry(found, {pullHasBeenAbandoned, ""});
}

void ContextTable::expire() {
  const Clock::time_point now = settings_.now();
  for (auto entry = entries_.begin(); entry != entries_.end();) {
    const auto next = std::next(entry);
    if (!entry->second.isUsed && now - entry->second.lastUse >= entry->second.enumeration->idleTime())
      closeEntry(entry, {invalidEnumerationContext, ""});
    entry = next;
  }
}

void ContextTable::shutDown() {
  const std::scoped_lock lock(mutex_);
  shuttingDown_ = true;
  while (!entries_.empty())
    closeEntry(entries_.begin(), {serverIsShuttingDown, ""});
}

std::size_t ContextTable::size() const {
  const std::scoped_lock lock(mutex_);
  return entries_.size();
}

void ContextTable::tidyUp() {
  std::unique_lock lock(mutex_);
  while (!stopping_ || !ending_.empty()) {
    if (!stopping_ && entries_.empty() && ending_.empty())
      changed_.wait(lock);
    else if (!stopping_)
      changed_.wait_for(lock, tidyInterval);
    expire();
    const auto finished = std::partition(ending_.begin(), ending_.end(), [this](const auto& each) {
      return !stopping_ && !each->hasFinished();
    });
    std::vector<std::shared_ptr<OpenEnumeration>> gone(std::make_move_iterator(finished),
                                                       std::make_move_iterator(ending_.end()));
    ending_.erase(finished, ending_.end());
    // Outside of the lock, because the last of it waits for providers.
    lock.unlock();
    gone.clear();
    lock.lock();
  }
}

}  // namespace cimom::protocol
