// Measures one machine size in one process. ./bench/run starts it for each size and compares.
//
//   swinv_bench measure NODES [benchmark options]   prints lines: result NAME NODES NANOSECONDS
//   swinv_bench associate NODES [benchmark options] prints lines: result NAME NODES NANOSECONDS
//   swinv_bench memory NODES                        prints a line: memory NODES BYTES-PER-NODE
//   swinv_bench inventory NODES FILE                writes the sample machine of that size
#include <agent/framework/InventoryFile.h>
#include <bench/Measurements.h>
#include <bench/SampleMachine.h>
#include <benchmark/benchmark.h>

#include <algorithm>
#include <cstdlib>
#include <fstream>
#include <functional>
#include <iostream>
#include <map>
#include <stdexcept>

namespace {

namespace fs = std::filesystem;

fs::path buildFolder() {
  return fs::read_symlink("/proc/self/exe").parent_path().parent_path();
}

/// A sample machine as an inventory file for the framework below the provider, removed at the end.
class InventoryFile {
 public:
  explicit InventoryFile(std::size_t nodes)
      : path_(fs::temp_directory_path() / ("swinv-bench-" + std::to_string(getpid()) + ".json")) {
    std::ofstream(path_) << agent::writeInventory(bench::sampleMachine(nodes));
    setenv("ORU_INVENTORY", path_.c_str(), 1);
    setenv("ORU_LOG_LEVEL", "off", 1);
    setenv("TZ", "UTC", 1);
  }
  InventoryFile(const InventoryFile&) = delete;
  InventoryFile& operator=(const InventoryFile&) = delete;
  ~InventoryFile() {
    std::error_code ignored;
    fs::remove(path_, ignored);
  }

 private:
  fs::path path_;
};

/// Keeps the shortest run of each benchmark: what disturbs a run only lengthens it. Requests run in this
/// thread and wait for nothing, so its processor time is theirs, and time that other processes had is left
/// out.
class ShortestRuns : public benchmark::BenchmarkReporter {
 public:
  bool ReportContext(const Context&) override { return true; }  // NOLINT(readability-identifier-naming)
  void ReportRuns(const std::vector<Run>& runs) override {      // NOLINT(readability-identifier-naming)
    for (const Run& run : runs) {
      if (run.run_type == Run::RT_Iteration && !run.error_occurred) {
        const double nanoseconds = run.cpu_accumulated_time / static_cast<double>(run.iterations) * 1e9;
        const auto [entry, isNew] = shortest.emplace(run.run_name.function_name, nanoseconds);
        entry->second = std::min(entry->second, nanoseconds);
      }
    }
  }

  std::map<std::string, double> shortest;
};

void registerRequests(const std::string& name, bench::Peer& peer, const std::string& instanceId) {
  benchmark::RegisterBenchmark((name + ".EnumInstances").c_str(), [&peer](benchmark::State& state) {
    for ([[maybe_unused]] auto iteration : state) {
      benchmark::DoNotOptimize(peer.instances());
    }
  });
  benchmark::RegisterBenchmark((name + ".EnumInstanceNames").c_str(), [&peer](benchmark::State& state) {
    for ([[maybe_unused]] auto iteration : state) {
      benchmark::DoNotOptimize(peer.names());
    }
  });
  benchmark::RegisterBenchmark((name + ".GetInstance").c_str(), [&peer, instanceId](benchmark::State& state) {
    for ([[maybe_unused]] auto iteration : state) {
      benchmark::DoNotOptimize(peer.get(instanceId));
    }
  });
}

/// Runs what was registered and prints the shortest run of each.
int runAll(std::size_t nodes, int argc, char** argv) {
  benchmark::Initialize(&argc, argv);
  ShortestRuns reporter;
  benchmark::RunSpecifiedBenchmarks(&reporter);
  for (const auto& [name, nanoseconds] : reporter.shortest) {
    std::cout << "result " << name << ' ' << nodes << ' ' << nanoseconds << '\n';
  }
  return 0;
}

int measure(std::size_t nodes, int argc, char** argv) {
  const InventoryFile inventory(nodes);
  bench::Peer provider(buildFolder(), "SoftwareInventoryProvider");
  bench::Peer floor(buildFolder(), "FloorProvider");
  if (provider.describeInstances() != floor.describeInstances()) {
    throw std::runtime_error("the floor does not make the instances that the provider makes");
  }
  const std::vector<std::string> ids = provider.instanceIds();
  const std::string& middle = ids.at(ids.size() / 2);
  registerRequests("provider", provider, middle);
  registerRequests("floor", floor, middle);
  return runAll(nodes, argc, argv);
}

/// What associations cost, for each object of the answer.
int associate(std::size_t nodes, int argc, char** argv) {
  const InventoryFile inventory(nodes);
  std::string middle;
  {
    const std::vector<std::string> ids =
        bench::Peer(buildFolder(), "SoftwareInventoryProvider").instanceIds();
    middle = bench::Associations::software(ids.at(ids.size() / 2));
  }
  bench::Associations associations(buildFolder());
  const std::string computer = bench::Associations::computer();
  const auto answer = [&](const char* name, std::size_t expected,
                          const std::function<std::size_t()>& request) {
    if (const std::size_t objects = request(); objects != expected) {
      throw std::runtime_error(std::string(name) + " delivers " + std::to_string(objects) + " objects, not " +
                               std::to_string(expected));
    }
    benchmark::RegisterBenchmark(name, [request](benchmark::State& state) {
      for ([[maybe_unused]] auto iteration : state) {
        benchmark::DoNotOptimize(request());
      }
    });
  };
  answer("associations.NamesOfComputer", nodes, [&] { return associations.installedNames(computer); });
  answer("associations.NamesOfSoftware", 1, [&] { return associations.installedNames(middle); });
  answer("associations.Installed", nodes, [&] { return associations.installed(); });
  return runAll(nodes, argc, argv);
}

int memory(std::size_t nodes) {
  const InventoryFile inventory(nodes);
  bench::Peer provider(buildFolder(), "SoftwareInventoryProvider");
  const std::size_t before = bench::residentBytes();
  // The first request makes the framework read the whole tree; nothing else stays after the request. It asks
  // for a node that there is not, so that it walks past all nodes and delivers none.
  provider.askForNothing();
  std::cout << "memory " << nodes << ' ' << (bench::residentBytes() - before) / nodes << '\n';
  return 0;
}

int run(int argc, char** argv) {
  const std::string command = argc > 2 ? argv[1] : "";
  const std::size_t nodes = argc > 2 ? std::stoul(argv[2]) : 0;
  if (command == "measure" && nodes > 0) {
    return measure(nodes, argc - 2, argv + 2);
  }
  if (command == "associate" && nodes > 0) {
    return associate(nodes, argc - 2, argv + 2);
  }
  if (command == "memory" && nodes > 0) {
    return memory(nodes);
  }
  if (command == "inventory" && nodes > 0 && argc == 4) {
    std::ofstream file(argv[3]);
    file << agent::writeInventory(bench::sampleMachine(nodes));
    return file.flush() ? 0 : 1;
  }
  std::cerr << "usage: swinv_bench measure|associate|memory NODES, or inventory NODES FILE\n";
  return 2;
}

}  // namespace

int main(int argc, char** argv) {
  try {
    return run(argc, argv);
  } catch (const std::exception& exception) {
    std::cerr << "swinv_bench: " << exception.what() << '\n';
    return 1;
  }
}
