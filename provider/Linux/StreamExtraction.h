// Reads numbers, characters and words off a text exactly as the standard's formatted stream extraction does
// in the classic locale, without a stream.
//
// The rules decide what a malformed key means, so they are kept to the letter: leading white space is
// skipped; a number may have a sign, and in hexadecimal the prefix 0x; a negative number wraps around 2^64;
// one past 2^64-1 reads as 2^64-1 and fails; a text without a digit reads as 0 and fails; after a failure
// nothing more is read.
#pragma once

#include <cstdint>
#include <string_view>

namespace Oru::SoftwareInventoryProfileProvider {

/// A read position in a text that must outlive it. One thread at a time.
class StreamExtraction {
 public:
  explicit StreamExtraction(std::string_view text) : rest_(text) {}

  /// An unsigned 64-bit number; 0 where nothing can be read.
  std::uint64_t decimal() { return number<10>(); }
  std::uint64_t hexadecimal() { return number<16>(); }

  /// One character that is no white space; '\0' where nothing can be read.
  char character();

  /// The characters up to the next white space; empty where nothing can be read.
  std::string_view word();

  /// True once something could not be read.
  [[nodiscard]] bool failed() const { return failed_; }

 private:
  template <unsigned int base>
  std::uint64_t number();
  template <unsigned int base>
  void skipPrefix();
  bool skipWhiteSpace();

  std::string_view rest_;
  bool failed_ = false;
};

extern template std::uint64_t StreamExtraction::number<10>();
extern template std::uint64_t StreamExtraction::number<16>();

}  // namespace Oru::SoftwareInventoryProfileProvider
