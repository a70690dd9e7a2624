// What an emulator and a management controller outside of it say to each other.
#pragma once

#include <cstdint>
#include <optional>
#include <vector>

namespace machine {

/// The bytes of one message, without checksum and framing: a sequence number, the function with the logical
/// unit in its lowest two bits, the command, and data. An answer has a completion code before its data.
using Message = std::vector<std::uint8_t>;

/// Takes the messages out of what an emulator sends. It drops what is for the emulation itself, and damaged
/// messages.
class MessageReader {
 public:
  /// The message that ends with this byte, if one does.
  std::optional<Message> take(std::uint8_t byte);

 private:
  Message bytes_;
  bool escaped_ = false;
};

/// The bytes that a message is sent as.
std::vector<std::uint8_t> framed(const Message& message);

/// What a controller with firmware 7.31 answers to a request of at least three bytes. It knows Get Device ID
/// alone; to all else it answers that it knows no such command.
Message answerTo(const Message& request);

/// The same of a controller that is not ready, by the highest bit of its revision, and whose revision ends in
/// no number: 7.1f.
Message oddAnswerTo(const Message& request);

}  // namespace machine
