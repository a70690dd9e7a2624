// Times a first discovery, and each of its sources alone, in wall time: sources wait, and run side by side.
//
//   discovery_bench live LOOKS                this machine
//   discovery_bench generated DEVICES LOOKS   a machine of that many devices, as files
//
// Prints lines: look NAME MICROSECONDS NODES, of the whole (by that name) and of each source the shortest of
// so many looks. Each look is the first of its process.
#include <agent/discovery/SourceRunner.h>
#include <agent/discovery/Sources.h>
#include <bench/discovery/GeneratedMachine.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <array>
#include <chrono>
#include <exception>
#include <functional>
#include <iostream>
#include <stdexcept>
#include <string>

namespace {

using agent::discovery::FoundNode;
using Clock = std::chrono::steady_clock;

struct Look {
  std::chrono::nanoseconds took{0};
  std::size_t nodes = 0;
};

Look timed(const std::function<std::size_t()>& look) {
  const Clock::time_point begin = Clock::now();
  const std::size_t nodes = look();
  return {Clock::now() - begin, nodes};
}

/// A child that has looked at nothing yet looks, and tells through a pipe. This process has no other thread.
Look lookAfresh(const std::function<std::size_t()>& look) {
  std::array<int, 2> ends{};
  if (pipe(ends.data()) != 0) {
    throw std::runtime_error("no pipe could be made");
  }
  const pid_t child = fork();
  if (child == 0) {
    int status = 1;
    try {
      const Look found = timed(look);
      status = write(ends[1], &found, sizeof found) == static_cast<ssize_t>(sizeof found) ? 0 : 1;
    } catch (const std::exception& failure) {
      std::cerr << "discovery_bench: " << failure.what() << '\n';
    }
    _exit(status);
  }
  close(ends[1]);
  Look found;
  const bool told = child > 0 && read(ends[0], &found, sizeof found) == static_cast<ssize_t>(sizeof found);
  close(ends[0]);
  if (child > 0) {
    waitpid(child, nullptr, 0);
  }
  if (!told) {
    throw std::runtime_error("a look did not come to its end");
  }
  return found;
}

void show(const std::string& name, int looks, const std::function<std::size_t()>& look) {
  Look shortest = lookAfresh(look);
  for (int i = 1; i < looks; ++i) {
    const Look next = lookAfresh(look);
    if (next.nodes != shortest.nodes) {
      throw std::runtime_error(name +
                               " found other nodes than before: the machine changed, or a source "
                               "did not end in time");
    }
    shortest.took = std::min(shortest.took, next.took);
  }
  std::cout << "look " << name << ' ' << std::chrono::duration<double, std::micro>(shortest.took).count()
            << ' ' << shortest.nodes << std::endl;
}

std::size_t count(const std::vector<FoundNode>& nodes) {
  std::size_t all = nodes.size();
  for (const FoundNode& node : nodes) {
    all += count(node.children);
  }
  return all;
}

void measure(const agent::DiscoveryOptions& options, int looks) {
  const agent::discovery::SystemRoot root(options.root);
  show("whole", looks, [&] { return agent::discover(options).size(); });
  for (const agent::discovery::Source& source : agent::discovery::makeSources(options, root)) {
    show(source.name, looks, [&] {
      const auto results = agent::discovery::runSources({source}, root, options.deadline);
      return count(results.front().nodes) + results.front().declared.size();
    });
  }
}

int run(int argc, char** argv) {
  const std::string command = argc > 1 ? argv[1] : "";
  if (command == "live" && argc == 3) {
    measure({}, std::stoi(argv[2]));
    return 0;
  }
  if (command == "generated" && argc == 4) {
    const bench::GeneratedMachine machine(std::stoul(argv[2]));
    // In a process of its own as well, so that this one stays without threads.
    const std::size_t nodes = lookAfresh([&] { return agent::discover(machine.options()).size(); }).nodes;
    if (nodes != machine.nodes()) {
      throw std::runtime_error("the discovery found " + std::to_string(nodes) + " nodes, not " +
                               std::to_string(machine.nodes()));
    }
    measure(machine.options(), std::stoi(argv[3]));
    return 0;
  }
  std::cerr << "usage: discovery_bench live LOOKS, or generated DEVICES LOOKS\n";
  return 2;
}

}  // namespace

int main(int argc, char** argv) {
  try {
    return run(argc, argv);
  } catch (const std::exception& failure) {
    std::cerr << "discovery_bench: " << failure.what() << '\n';
    return 1;
  }
}
