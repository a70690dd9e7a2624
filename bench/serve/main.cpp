// Measures a live endpoint of this machine. bench/serve/run starts the endpoints and compares.
//
//   serve_bench enumerate PORT CLASS OBJECTS TIMES    prints: http CLASS OBJECTS NANOSECONDS BYTES
//   serve_bench inprocess REGISTRATION MOF|- CLASS OBJECTS TIMES   prints: inprocess CLASS OBJECTS
//   NANOSECONDS serve_bench requests PORT CLASS INSTANCEID CONNECTIONS SECONDS  prints: requests CONNECTIONS
//   PER-SECOND
//
// The times are wall time, the shortest of so many runs.
#include <bench/serve/Connection.h>
#include <cimom/ObjectManager.h>
#include <poll.h>

#include <algorithm>
#include <chrono>
#include <filesystem>
#include <iostream>
#include <memory>
#include <stdexcept>
#include <string>
#include <vector>

namespace {

namespace fs = std::filesystem;
using Clock = std::chrono::steady_clock;

fs::path buildFolder() {
  return fs::read_symlink("/proc/self/exe").parent_path().parent_path();
}

/// The nanoseconds of the shortest of so many calls.
template <class Action>
long shortest(int times, const Action& action) {
  Clock::duration best = Clock::duration::max();
  for (int time = 0; time < times; ++time) {
    const auto begin = Clock::now();
    action();
    best = std::min(best, Clock::now() - begin);
  }
  return std::chrono::duration_cast<std::chrono::nanoseconds>(best).count();
}

void expect(std::size_t objects, std::size_t expected) {
  if (objects != expected) {
    throw std::runtime_error("the answer has " + std::to_string(objects) + " objects, not " +
                             std::to_string(expected));
  }
}

int enumerate(std::uint16_t port, const std::string& className, std::size_t objects, int times) {
  bench::Connection connection(port);
  const std::string request =
      bench::cimRequest("EnumerateInstances", R"(<IPARAMVALUE NAME="ClassName"><CLASSNAME NAME=")" +
                                                  className + R"("/></IPARAMVALUE>)");
  connection.count("<VALUE.NAMEDINSTANCE>");
  connection.send(request);
  connection.receive(true);
  expect(connection.objects(), objects);
  connection.count({});
  const long best = shortest(times, [&] {
    connection.send(request);
    connection.receive(true);
  });
  std::cout << "http " << className << ' ' << objects << ' ' << best << ' ' << connection.bodyBytes() << '\n';
  return 0;
}

int enumerateInProcess(const fs::path& registrations, const fs::path& mof, const std::string& className,
                       std::size_t objects, int times) {
  cimom::Configuration configuration;
  for (const auto& entry : fs::directory_iterator(buildFolder() / "share/swinv/schema")) {
    if (entry.path().extension() == ".mof") {
      configuration.schema.push_back(entry.path());
    }
  }
  std::sort(configuration.schema.begin(), configuration.schema.end());
  if (mof != "-") {
    configuration.schema.push_back(mof);
  }
  configuration.providers = cimom::readRegistrations(registrations);
  configuration.providerFolder = buildFolder() / "lib";
  cimom::ObjectManager manager(configuration);
  const auto ask = [&] {
    const cimom::Outcome outcome = manager.enumerateInstances("root/cimv2", className, std::nullopt,
                                                              [](const cimom::Instance&) { return true; });
    expect(outcome.delivered, objects);
  };
  ask();
  std::cout << "inprocess " << className << ' ' << objects << ' ' << shortest(times, ask) << '\n';
  return 0;
}

int requests(std::uint16_t port, const std::string& className, const std::string& instanceId,
             std::size_t connections, std::chrono::seconds duration) {
  const std::string request = bench::cimRequest(
      "GetInstance", R"(<IPARAMVALUE NAME="InstanceName"><INSTANCENAME CLASSNAME=")" + className +
                         R"("><KEYBINDING NAME="InstanceID"><KEYVALUE VALUETYPE="string">)" + instanceId +
                         "</KEYVALUE></KEYBINDING></INSTANCENAME></IPARAMVALUE>");
  std::vector<std::unique_ptr<bench::Connection>> all;
  std::vector<pollfd> waiting;
  for (std::size_t index = 0; index < connections; ++index) {
    all.push_back(std::make_unique<bench::Connection>(port));
    all.back()->count("<INSTANCE ");
    all.back()->send(request);
    all.back()->receive(true);
    expect(all.back()->objects(), 1);
    all.back()->count({});
    waiting.push_back({all.back()->descriptor(), POLLIN, 0});
  }
  std::size_t answers = 0;
  const auto begin = Clock::now();
  for (const auto& connection : all) {
    connection->send(request);
  }
  while (Clock::now() - begin < duration) {
    if (poll(waiting.data(), waiting.size(), 1000) <= 0) {
      throw std::runtime_error("no answer within a second");
    }
    for (std::size_t index = 0; index < connections; ++index) {
      if (waiting[index].revents != 0 && all[index]->receive(false)) {
        ++answers;
        all[index]->send(request);
      }
    }
  }
  const std::chrono::duration<double> took = Clock::now() - begin;
  std::cout << "requests " << connections << ' '
            << static_cast<long>(static_cast<double>(answers) / took.count()) << '\n';
  return 0;
}

int run(const std::vector<std::string>& arguments) {
  const std::string command = arguments.empty() ? "" : arguments[0];
  const auto number = [&](std::size_t index) { return std::stoul(arguments.at(index)); };
  const auto port = [&] { return static_cast<std::uint16_t>(number(1)); };
  if (command == "enumerate" && arguments.size() == 5) {
    return enumerate(port(), arguments[2], number(3), static_cast<int>(number(4)));
  }
  if (command == "inprocess" && arguments.size() == 6) {
    return enumerateInProcess(arguments[1], arguments[2], arguments[3], number(4),
                              static_cast<int>(number(5)));
  }
  if (command == "requests" && arguments.size() == 6) {
    return requests(port(), arguments[2], arguments[3], number(4), std::chrono::seconds(number(5)));
  }
  std::cerr << "usage: serve_bench enumerate PORT CLASS OBJECTS TIMES\n"
               "       serve_bench inprocess REGISTRATION MOF|- CLASS OBJECTS TIMES\n"
               "       serve_bench requests PORT CLASS INSTANCEID CONNECTIONS SECONDS\n";
  return 2;
}

}  // namespace

int main(int argc, char** argv) {
  try {
    return run({argv + 1, argv + argc});
  } catch (const std::exception& exception) {
    std::cerr << "serve_bench: " << exception.what() << '\n';
    return 1;
  }
}
