#include "Wbemcli.h"

#include <algorithm>

namespace serve_test {
namespace {

/// Behind "HOST:PORT/".
std::string withoutHost(const std::string& line) {
  const std::size_t slash = line.find('/');
  return slash == std::string::npos ? line : line.substr(slash + 1);
}

Printed parsed(const cli_test::Result& result) {
  Printed printed;
  printed.exitCode = result.exitCode;
  for (const std::string& line : cli_test::linesOf(result.standardError)) {
    if (line.starts_with("* ")) {
      printed.error += line.substr(2);
    }
  }
  for (const std::string& line : cli_test::linesOf(result.standardOutput)) {
    if (line.starts_with('-') && !printed.objects.empty()) {
      const std::size_t equals = line.find('=');
      printed.objects.back().properties[line.substr(1, equals - 1)] = line.substr(equals + 1);
    } else if (!line.empty()) {
      printed.objects.push_back({withoutHost(line), {}});
    }
  }
  return printed;
}

}  // namespace

std::vector<std::string> Printed::paths() const {
  std::vector<std::string> all;
  for (const PrintedObject& object : objects) {
    all.push_back(object.path);
  }
  return all;
}

std::vector<std::string> Printed::values(const std::string& property) const {
  std::vector<std::string> all;
  for (const PrintedObject& object : objects) {
    const auto found = object.properties.find(property);
    all.push_back(found == object.properties.end() ? "(not there)" : found->second);
  }
  return all;
}

Printed WbemServer::ask(const std::string& operation, const std::string& object,
                        const std::vector<std::string>& more) const {
  // It would wait for ever for an answer that does not come.
  std::vector<std::string> arguments{"60", "/usr/bin/wbemcli", operation, "-nl"};
  arguments.insert(arguments.end(), options.begin(), options.end());
  arguments.push_back(url + "/" + object);
  arguments.insert(arguments.end(), more.begin(), more.end());
  return parsed(cli_test::run({std::move(arguments), {}, "/usr/bin/timeout"}));
}

Printed WbemServer::ask(const std::vector<std::string>& narrowed, const std::string& operation,
                        const std::string& object) const {
  WbemServer server = *this;
  server.options.insert(server.options.end(), narrowed.begin(), narrowed.end());
  return server.ask(operation, object);
}

}  // namespace serve_test
