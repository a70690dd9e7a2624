#include <agent/framework/SignalsBlocked.h>
#include <agent/framework/TreeStore.h>

#include <Oru/Exceptions.h>
#include <ZelLog/ZelLogger.h>

#include <ctime>
#include <exception>
#include <thread>
#include <utility>

namespace agent {
namespace {

void logFailure(const char* function, unsigned int line, const std::string& message) {
  constexpr int errorLevel = 3000;
  constexpr const char* file = "agent/framework/TreeStore.cpp";
  const std::string category = "Oru.Framework";
  ZelLog::ZelLogger::logLevelMessage(function, file, line, category, errorLevel, nullptr, 0, 0, message);
  ZelLog::ZelLogger::traceLevelMessage(function, file, line, category, errorLevel, nullptr, 0, 0, message);
}

void logUnwatched(const std::string& reason) {
  logFailure(
      __func__, __LINE__,
      "changes of the machine show after a minute only, because its events cannot be followed: " + reason);
}

}  // namespace

TreeStore& TreeStore::instance() {
  static TreeStore* const store = std::make_unique<TreeStore>().release();
  return *store;
}

std::chrono::steady_clock::time_point TreeStore::lastTick() {
  timespec time{};
  if (clock_gettime(CLOCK_MONOTONIC_COARSE, &time) != 0) {
    return std::chrono::steady_clock::now();
  }
  return std::chrono::steady_clock::time_point(std::chrono::seconds(time.tv_sec) +
                                               std::chrono::nanoseconds(time.tv_nsec));
}

TreeStore::TreeStore(Duration lifetime, Clock clock) : lifetime_(lifetime), clock_(std::move(clock)) {}

TreeStore::~TreeStore() {
  watcher_.stop();
  waitForRereading();
}

void TreeStore::waitForRereading() {
  std::unique_lock lock(mutex_);
  reread_.wait(lock, [this] { return !isRereading_; });
}

std::shared_ptr<const NodeTree> TreeStore::current() {
  const std::lock_guard lock(mutex_);
  const bool isRead = tree_ || !failure_.empty();
  const bool isOld = isRead && !isRereading_ && (isOutdated_ || clock_() - readAt_ >= lifetime_);
  if (tree_) {
    if (isOld) {
      startRereading();
    }
    return tree_;
  }
  if (!isRead || isOld) {
    readFirst();
  }
  if (!tree_) {
    throw Oru::InstrumentationException(failure_.c_str());
  }
  return tree_;
}

void TreeStore::lookAnew() {
  const std::lock_guard lock(mutex_);
  isOutdated_ = true;
  if (tree_ && !isRereading_) {
    startRereading();
  }
}

void TreeStore::publish(NodeTree tree) {
  Tree fresh = std::make_shared<const NodeTree>(std::move(tree));
  const std::lock_guard lock(mutex_);
  tree_.swap(fresh);  // the earlier tree, where this is its last owner, goes after the lock
  failure_.clear();
  isFailureLogged_ = false;
  isOutdated_ = false;
  readAt_ = clock_();
}

TreeStore::Reading TreeStore::read(const TreeSource& source) {
  try {
    return {std::make_shared<const NodeTree>(readTree(source)), {}};
  } catch (const std::exception& error) {
    return {nullptr, std::string("the inventory cannot be read: ") + error.what()};
  }
}

/// With the lock: who asks meanwhile has nothing to go on with.
void TreeStore::readFirst() {
  isOutdated_ = false;
  source_ = TreeSource::fromEnvironment();
  Reading reading = read(source_);
  tree_ = std::move(reading.tree);
  failure_ = std::move(reading.failure);
  readAt_ = clock_();
  if (tree_) {
    isFailureLogged_ = false;
    watch();
  } else if (noteFailure()) {
    logFailure(__func__, __LINE__, failure_);
  }
}

/// With the lock. The environment is read here, in the thread of a request: the process may change it between
/// its requests.
void TreeStore::startRereading() {
  isRereading_ = true;
  isOutdated_ = false;
  source_ = TreeSource::fromEnvironment();
  watch();
  try {
    const SignalsBlocked blocked;
    std::thread([this, source = source_, old = tree_] { reread(source, old); }).detach();
  } catch (const std::exception& error) {
    isRereading_ = false;
    readAt_ = clock_();
    if (noteFailure()) {
      logFailure(
          __func__, __LINE__,
          std::string("the inventory cannot be read again: no thread could be started: ") + error.what());
    }
  }
}

/// With the lock.
void TreeStore::watch() {
  if (isWatched_) {
    return;
  }
  try {
    std::unique_ptr<Events> events = eventsOf(source_);
    if (events) {
      isWatched_ = true;
      watcher_.start(std::move(events), {[this] { readAfterChange(); }, logUnwatched});
    }
  } catch (const std::exception& error) {
    isWatched_ = true;
    logUnwatched(error.what());
  }
}

/// In the watcher's thread. A reading under way may have begun before the change.
void TreeStore::readAfterChange() {
  std::unique_lock lock(mutex_);
  reread_.wait(lock, [this] { return !isRereading_; });
  if (!tree_ || !source_.isLive()) {
    return;
  }
  const TreeSource source = source_;
  const Tree old = tree_;
  isRereading_ = true;
  lock.unlock();
  reread(source, old);
}

void TreeStore::reread(const TreeSource& source, const Tree& old) {
  Reading reading = read(source);
  if (reading.tree && *reading.tree == *old) {
    reading.tree = old;
  }
  finishRereading(old, std::move(reading));
}

void TreeStore::finishRereading(const Tree& old, Reading reading) {
  std::unique_lock lock(mutex_);
  // A tree that was published meanwhile is newer than what was read.
  const bool isCurrent = tree_ == old;
  const bool isToLog = isCurrent && !reading.tree && noteFailure();
  if (isCurrent) {
    readAt_ = clock_();
    if (reading.tree) {
      tree_.swap(reading.tree);
      isFailureLogged_ = false;
    }
  }
  if (isToLog) {
    lock.unlock();  // requests go on while the log is written
    logFailure(__func__, __LINE__, reading.failure + "; what was read before is shown on");
    lock.lock();
  }
  isRereading_ = false;
  reread_.notify_all();  // with the lock: without it the store could go in between
}

/// Whether this failure is the first since a reading succeeded.
bool TreeStore::noteFailure() {
  return !std::exchange(isFailureLogged_, true);
}

}  // namespace agent
