// What is wrong with a MOF text.
#pragma once

#include <stdexcept>
#include <string>
#include <string_view>

namespace cimom {

/// "schema/x.mof:17: expected ';' after property InstallDate, got '}'".
class MofError : public std::runtime_error {
 public:
  MofError(std::string_view file, int line, std::string_view message)
      : std::runtime_error(std::string(file) + (line > 0 ? ":" + std::to_string(line) : std::string()) +
                           ": " + std::string(message)),
        line_(line) {}

  /// 0 where the file as a whole is meant: it cannot be read, for example.
  [[nodiscard]] int line() const noexcept { return line_; }

 private:
  int line_;
};

}  // namespace cimom
