#include "TestServer.h"

#include <sys/stat.h>

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <stdexcept>
#include <thread>

namespace tests {

void Log::add(std::string_view line) {
  const std::lock_guard lock(mutex_);
  text_.append(line).push_back('\n');
  changed_.notify_all();
}

std::string Log::text() {
  const std::lock_guard lock(mutex_);
  return text_;
}

bool Log::waitFor(std::string_view part) {
  std::unique_lock lock(mutex_);
  return changed_.wait_for(lock, patience, [&] { return text_.find(part) != std::string::npos; });
}

Settings loopback(Log& log) {
  Settings settings;
  settings.listeners = {{"127.0.0.1:0", false, -1}};
  settings.bounds.flush = std::chrono::milliseconds(2);
  settings.log = [&log](LogLevel, std::string_view line) { log.add(line); };
  return settings;
}

bool eventually(const std::function<bool()>& condition) {
  const auto end = std::chrono::steady_clock::now() + patience;
  while (!condition()) {
    if (std::chrono::steady_clock::now() > end) {
      return false;
    }
    std::this_thread::sleep_for(std::chrono::milliseconds(2));
  }
  return true;
}

void beginText(Answer& answer, std::vector<Field> more) {
  more.push_back({"Content-Type", "text/plain"});
  answer.begin(200, std::move(more));
}

void echo(const Request& request, Answer& answer) {
  beginText(answer);
  answer.write(request.body.empty() ? request.method + " " + request.target : request.body);
}

std::string pattern(std::size_t size) {
  std::string bytes;
  bytes.reserve(size + 8);
  for (std::size_t at = 0; bytes.size() < size; ++at) {
    bytes += std::to_string(at) + " ";
  }
  bytes.resize(size);
  return bytes;
}

Folder::Folder() {
  std::string name = std::filesystem::temp_directory_path() / "http-test-XXXXXX";
  if (::mkdtemp(name.data()) == nullptr) {
    throw std::runtime_error("no temporary folder");
  }
  path_ = name;
}

Folder::~Folder() {
  std::error_code ignored;
  std::filesystem::remove_all(path_, ignored);
}

std::string Folder::write(const std::string& name, std::string_view text, unsigned mode) const {
  std::string file = path(name);
  std::ofstream(file, std::ios::binary) << text;
  if (::chmod(file.c_str(), mode) != 0) {
    throw std::runtime_error("no mode for " + file);
  }
  return file;
}

}  // namespace tests
