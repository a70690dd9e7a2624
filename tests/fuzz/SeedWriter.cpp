// Writes the seeds of a fuzzer, which are described as text, into a folder, one file each.
#include <charconv>
#include <filesystem>
#include <fstream>
#include <iostream>
#include <sstream>
#include <stdexcept>
#include <string>
#include <string_view>

namespace {

struct Seed {
  std::string title;
  bool isHexadecimal = false;
  std::string text;
};

std::string bytesOf(const std::string& hexadecimal, const std::string& title) {
  std::string bytes;
  std::istringstream lines(hexadecimal);
  for (std::string line; std::getline(lines, line);) {
    std::istringstream words(line.substr(0, line.find('#')));
    for (std::string word; words >> word;) {
      unsigned int value = 0;
      const char* const end = word.data() + word.size();
      const auto [at, error] = std::from_chars(word.data(), end, value, 16);
      if (error != std::errc() || at != end || word.size() != 2) {
        throw std::runtime_error("seed '" + title + "': '" + word + "' is no byte of two hexadecimal digits");
      }
      bytes.push_back(static_cast<char>(value));
    }
  }
  return bytes;
}

void write(const Seed& seed, const std::filesystem::path& folder) {
  std::string name = seed.title;
  for (char& each : name) {
    each = each == ' ' || each == '/' ? '-' : each;
  }
  std::ofstream file(folder / name, std::ios::binary);
  file << (seed.isHexadecimal ? bytesOf(seed.text, seed.title) : seed.text);
  if (!file.flush()) {
    throw std::runtime_error("cannot write " + (folder / name).string());
  }
}

void writeAll(const std::filesystem::path& description, const std::filesystem::path& folder) {
  std::ifstream file(description);
  if (!file) {
    throw std::runtime_error("cannot read " + description.string());
  }
  std::filesystem::create_directories(folder);
  Seed seed;
  constexpr std::string_view mark = "=== ";
  constexpr std::string_view hexadecimal = " hex";
  for (std::string line; std::getline(file, line);) {
    if (!line.starts_with(mark)) {
      seed.text += line + '\n';
      continue;
    }
    if (!seed.title.empty()) {
      write(seed, folder);
    }
    seed = {line.substr(mark.size()), line.ends_with(hexadecimal), {}};
  }
  if (seed.title.empty()) {
    throw std::runtime_error(description.string() + " has no seed: expected a line '=== title'");
  }
  write(seed, folder);
}

}  // namespace

int main(int argc, char** argv) {
  if (argc != 3) {
    std::cerr << "usage: seed_writer SEEDS FOLDER\n";
    return 2;
  }
  try {
    writeAll(argv[1], argv[2]);
  } catch (const std::exception& error) {
    std::cerr << "seed_writer: " << error.what() << '\n';
    return 1;
  }
}
