// The text of one log message, gathered piece by piece.
//
// Threads: one buffer belongs to one thread. Ownership: it owns its text.
#pragma once

#include <iosfwd>
#include <string>

#pragma GCC visibility push(default)
namespace ZelLog {

class ZelMessageBuffer {
 public:
  ZelMessageBuffer();
  ~ZelMessageBuffer();
  ZelMessageBuffer(const ZelMessageBuffer&) = delete;
  ZelMessageBuffer& operator=(const ZelMessageBuffer&) = delete;

  /// Appends a text; a null one prints as the C library prints it, "(null)".
  ZelMessageBuffer& operator<<(const char* text);
  /// Appends a text.
  ZelMessageBuffer& operator<<(const std::string& text);

  /// The buffer as a stream: what is written to it is appended. It lives as long as the buffer.
  operator std::ostream&();

 private:
  friend std::string str(ZelMessageBuffer& buffer);
  void* state_;
};

/// The text gathered so far.
std::string str(ZelMessageBuffer& buffer);
/// The text gathered so far in the stream of a buffer, or in any string stream; empty for another stream.
std::string str(std::ostream& stream);

}  // namespace ZelLog
#pragma GCC visibility pop
