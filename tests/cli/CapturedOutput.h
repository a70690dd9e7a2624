// What was written to an `Output`, as a text.
#pragma once

#include <cli/Output.h>

#include <array>
#include <cstdlib>
#include <stdexcept>
#include <string>

#include <sys/mman.h>
#include <unistd.h>

namespace cli_test {

/// An output into memory.
class CapturedOutput {
 public:
  CapturedOutput() : descriptor_(memfd_create("output", MFD_CLOEXEC)), output_(descriptor_) {
    if (descriptor_ < 0) {
      throw std::runtime_error("memfd_create failed");
    }
  }
  ~CapturedOutput() { close(descriptor_); }
  CapturedOutput(const CapturedOutput&) = delete;
  CapturedOutput& operator=(const CapturedOutput&) = delete;

  cli::Output& output() { return output_; }

  /// All that was written so far.
  std::string text() {
    output_.flush();
    std::string text;
    std::array<char, 4096> piece{};
    off_t position = 0;
    for (ssize_t got = 1; got > 0; position += got) {
      got = pread(descriptor_, piece.data(), piece.size(), position);
      text.append(piece.data(), static_cast<std::size_t>(got > 0 ? got : 0));
    }
    return text;
  }

 private:
  int descriptor_;
  cli::Output output_;
};

}  // namespace cli_test
