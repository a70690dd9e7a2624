// Standard output with its failures seen: a full disk is an error, a reader that went away is not.
//
// Threads: one.
#pragma once

#include <string>
#include <string_view>

namespace cli {

/// Gathers what is written and hands it to a file descriptor in large pieces. After a failure it swallows
/// what else is written.
class Output {
 public:
  /// The descriptor stays the caller's and must outlive the output.
  explicit Output(int descriptor) : descriptor_(descriptor) {}

  void write(std::string_view text);
  void flush();

  /// The `errno` of the first failure, 0 where there was none.
  [[nodiscard]] int error() const { return error_; }

 private:
  int descriptor_;
  int error_ = 0;
  std::string pending_;
};

}  // namespace cli
