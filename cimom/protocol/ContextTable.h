// The open enumerations of an endpoint.
#pragma once

#include <cimom/protocol/Endpoint.h>
#include <cimom/protocol/ObjectQueue.h>

#include <atomic>
#include <chrono>
#include <condition_variable>
#include <cstddef>
#include <map>
#include <memory>
#include <mutex>
#include <optional>
#include <string>
#include <string_view>
#include <thread>
#include <vector>

namespace cimom::protocol {

/// What an enumeration was opened for. Only the pull of its own kind takes from it.
enum class Pulled { instancesWithPath, paths, instances };

/// Whose enumeration it is: nobody else can use it.
struct Owner {
  std::string user;
  std::string nameSpace;
};

/// One open enumeration: a provider that delivers on a thread of its own into a bounded queue.
class OpenEnumeration {
 public:
  OpenEnumeration(Owner owner, Pulled pulled, std::chrono::seconds idleTime, std::size_t bound);
  /// Closes, and waits for the provider.
  ~OpenEnumeration();
  OpenEnumeration(const OpenEnumeration&) = delete;
  OpenEnumeration& operator=(const OpenEnumeration&) = delete;

  void start(Source source);

  [[nodiscard]] ObjectQueue& queue() { return queue_; }
  [[nodiscard]] const Owner& owner() const { return owner_; }
  [[nodiscard]] Pulled pulled() const { return pulled_; }
  [[nodiscard]] std::chrono::seconds idleTime() const { return idleTime_; }
  /// Whether the provider has returned, so that waiting for it takes no time.
  [[nodiscard]] bool hasFinished() const { return finished_; }

 private:
  const Owner owner_;
  const Pulled pulled_;
  const std::chrono::seconds idleTime_;
  ObjectQueue queue_;
  std::atomic<bool> finished_ = false;
  std::thread thread_;
};

/// Threads: several at once, one at a time for each enumeration.
class ContextTable {
 public:
  /// The one request that uses an enumeration at the moment. What is not kept is closed: after an error no
  /// client can tell what it has missed.
  class Lease {
   public:
    Lease(ContextTable& table, std::string context, std::shared_ptr<OpenEnumeration> enumeration)
        : table_(&table), context_(std::move(context)), enumeration_(std::move(enumeration)) {}
    ~Lease();
    Lease(Lease&& other) noexcept = default;
    Lease& operator=(Lease&&) = delete;

    [[nodiscard]] ObjectQueue& queue() const { return enumeration_->queue(); }
    [[nodiscard]] std::chrono::seconds idleTime() const { return enumeration_->idleTime(); }
    [[nodiscard]] const std::string& context() const { return context_; }
    /// The enumeration is open for the next request.
    void keep();

   private:
    ContextTable* table_;
    std::string context_;
    std::shared_ptr<OpenEnumeration> enumeration_;  // null once it was kept, or moved from
  };

  explicit ContextTable(const EndpointSettings& settings);
  /// As `shutDown`; waits for all providers.
  ~ContextTable();
  ContextTable(const ContextTable&) = delete;
  ContextTable& operator=(const ContextTable&) = delete;

  /// Starts an enumeration. Throws `CimError`: serverLimitsExceeded, serverIsShuttingDown.
  [[nodiscard]] Lease open(Owner owner, Pulled pulled, std::chrono::seconds idleTime, Source source);

  /// Throws `CimError` with invalidEnumerationContext for what is not open, is somebody else's, is in another
  /// namespace, is of another kind (none given: any will do), or is used by another request.
  [[nodiscard]] Lease use(std::string_view context, const Owner& owner, std::optional<Pulled> pulled);

  /// Ends an enumeration; a pull that is under way fails with pullHasBeenAbandoned. Throws as `use`.
  void close(std::string_view context, const Owner& owner);

  void shutDown();
  [[nodiscard]] std::size_t size() const;

 private:
  struct Entry {
    std::shared_ptr<OpenEnumeration> enumeration;
    Clock::time_point lastUse;
    bool isUsed = false;
  };
  using Entries = std::map<std::string, Entry, std::less<>>;

  [[nodiscard]] Entries::iterator find(std::string_view context, const Owner& owner);
  void closeEntry(Entries::iterator entry, const Status& status);
  void release(const std::string& context, bool isKept);
  void expire();
  void tidyUp();

  const EndpointSettings& settings_;
  mutable std::mutex mutex_;
  std::condition_variable changed_;
  Entries entries_;
  std::vector<std::shared_ptr<OpenEnumeration>> ending_;  ///< closed, but their providers may still be at it
  bool shuttingDown_ = false;
  bool stopping_ = false;
  std::thread tidier_;
};

}  // namespace cimom::protocol
