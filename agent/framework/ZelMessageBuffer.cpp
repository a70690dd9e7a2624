#include <ZelLog/ZelMessageBuffer.h>

#include <ostream>
#include <sstream>
#include <string>
#include <string_view>

namespace ZelLog {
namespace {

std::ostringstream& streamOf(void* state) {
  return *static_cast<std::ostringstream*>(state);
}

// Straight into the stream's buffer: width, fill and error flags that somebody left on the stream are none of
// the text's business.
void append(void* state, std::string_view text) {
  streamOf(state).rdbuf()->sputn(text.data(), static_cast<std::streamsize>(text.size()));
}

}  // namespace

ZelMessageBuffer::ZelMessageBuffer() : state_(new std::ostringstream) {}

ZelMessageBuffer::~ZelMessageBuffer() {
  delete static_cast<std::ostringstream*>(state_);
}

ZelMessageBuffer& ZelMessageBuffer::operator<<(const char* text) {
  append(state_, text == nullptr ? "(null)" : text);
  return *this;
}

ZelMessageBuffer& ZelMessageBuffer::operator<<(const std::string& text) {
  append(state_, text);
  return *this;
}

ZelMessageBuffer::operator std::ostream&() {
  return streamOf(state_);
}

std::string str(ZelMessageBuffer& buffer) {
  return streamOf(buffer.state_).str();
}

std::string str(std::ostream& stream) {
  const auto* buffer = dynamic_cast<const std::stringbuf*>(stream.rdbuf());
  return buffer == nullptr ? std::string() : buffer->str();
}

}  // namespace ZelLog
