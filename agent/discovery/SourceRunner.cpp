#include <agent/discovery/SourceBoard.h>
#include <agent/discovery/SourceRunner.h>
#include <agent/framework/SignalsBlocked.h>

#include <algorithm>
#include <exception>
#include <system_error>
#include <thread>
#include <utility>

namespace agent::discovery {

void SourceBoard::doing(const std::string& what) {
  const std::lock_guard lock(mutex_);
  doing_ = what;
}

void SourceBoard::publish(SourceResult result, bool last) {
  const std::lock_guard lock(mutex_);
  if (ended_) {
    return;
  }
  result_ = std::move(result);
  ended_ = last;
  changed_.notify_all();
}

SourceBoard::Taken SourceBoard::takeBy(std::chrono::steady_clock::time_point deadline) {
  std::unique_lock lock(mutex_);
  changed_.wait_until(lock, deadline, [this] { return ended_; });
  return {std::move(result_), std::exchange(ended_, true), doing_};
}

namespace {

using Clock = std::chrono::steady_clock;

struct Running {
  std::shared_ptr<SourceBoard> board = std::make_shared<SourceBoard>();
  std::thread thread;
};

void readSource(const Source& source, SourceContext& context, SourceBoard& board) {
  try {
    source.read(context);
  } catch (const std::exception& failure) {
    context.report("", SourceReport::Reason::Unreadable, failure.what());
  }
  board.publish(std::move(context.result()), true);
}

Running start(const Source& source, const SystemRoot& root) {
  Running running;
  try {
    running.thread = std::thread([source, root, board = running.board] {
      SourceContext context(source.name, root, board);
      readSource(source, context, *board);
    });
  } catch (const std::system_error& failure) {
    SourceResult result;
    result.reports.push_back({source.name, "", SourceReport::Reason::Unreadable,
                              std::string("no thread could be started: ") + failure.what()});
    running.board->publish(std::move(result), true);
  }
  return running;
}

SourceResult finish(const std::string& source, Running& running, std::chrono::milliseconds limit,
                    Clock::time_point deadline) {
  SourceBoard::Taken taken = running.board->takeBy(deadline);
  if (!taken.ended) {
    taken.result.reports.push_back({source, taken.lastDone, SourceReport::Reason::TimedOut,
                                    "no answer within " + std::to_string(limit.count()) + " ms"});
    running.thread.detach();
  } else if (running.thread.joinable()) {
    running.thread.join();
  }
  return std::move(taken.result);
}

}  // namespace

std::vector<SourceResult> runSources(const std::vector<Source>& sources, const SystemRoot& root,
                                     std::chrono::milliseconds limit) {
  constexpr std::chrono::milliseconds longest = std::chrono::hours(24);  // what a clock can add to any now
  const Clock::time_point deadline = Clock::now() + std::min(limit, longest);
  std::vector<Running> running;
  {
    const SignalsBlocked blocked;
    for (const Source& source : sources) {
      running.push_back(start(source, root));
    }
  }
  std::vector<SourceResult> results;
  for (std::size_t i = 0; i < sources.size(); ++i) {
    results.push_back(finish(sources[i].name, running[i], limit, deadline));
  }
  return results;
}

}  // namespace agent::discovery
