#include "ControllerProtocol.h"

#include <array>
#include <cstddef>
#include <numeric>

namespace machine {

namespace {

constexpr std::uint8_t EndOfMessage = 0xa0;
constexpr std::uint8_t EndOfCommand =
    0xa1;  // a command to the emulation itself, such as the version of this protocol
constexpr std::uint8_t Escape = 0xaa;  // the next byte is one of these three, with EscapeBit set
constexpr std::uint8_t EscapeBit = 0x10;

constexpr std::size_t HeaderSize = 3;

std::uint8_t sumOf(const Message& bytes) {
  return static_cast<std::uint8_t>(std::accumulate(bytes.begin(), bytes.end(), 0U) & 0xffU);
}

Message withCompletion(const Message& request, std::uint8_t code) {
  constexpr std::uint8_t responseBit = 0x04;  // the lowest bit of the function
  return {request.at(0), static_cast<std::uint8_t>(request.at(1) | responseBit), request.at(2), code};
}

}  // namespace

std::optional<Message> MessageReader::take(std::uint8_t byte) {
  if (byte == EndOfMessage || byte == EndOfCommand) {
    Message message;
    message.swap(bytes_);
    escaped_ = false;
    if (byte == EndOfCommand || message.size() <= HeaderSize || sumOf(message) != 0) {
      return std::nullopt;
    }
    message.pop_back();
    return message;
  }
  if (byte == Escape) {
    escaped_ = true;
    return std::nullopt;
  }
  bytes_.push_back(escaped_ ? static_cast<std::uint8_t>(byte & ~EscapeBit) : byte);
  escaped_ = false;
  return std::nullopt;
}

std::vector<std::uint8_t> framed(const Message& message) {
  Message whole = message;
  whole.push_back(static_cast<std::uint8_t>(0x100U - sumOf(message)));
  std::vector<std::uint8_t> bytes;
  for (const std::uint8_t byte : whole) {
    if (byte == EndOfMessage || byte == EndOfCommand || byte == Escape) {
      bytes.push_back(Escape);
      bytes.push_back(byte | EscapeBit);
    } else {
      bytes.push_back(byte);
    }
  }
  bytes.push_back(EndOfMessage);
  return bytes;
}

Message answerTo(const Message& request) {
  constexpr std::uint8_t application = 0x06;
  constexpr std::uint8_t getDeviceId = 0x01;
  constexpr std::uint8_t completed = 0x00;
  constexpr std::uint8_t noSuchCommand = 0xc1;
  if (request.at(1) >> 2 != application || request.at(2) != getDeviceId) {
    return withCompletion(request, noSuchCommand);
  }
  // Device id and revision; firmware 7.31, the second part in BCD; the version of the standard, 2.0; a sensor
  // device; maker and product; the auxiliary revision.
  constexpr std::array<std::uint8_t, 15> device{0x20, 0x01, 0x07, 0x31, 0x02, 0x01, 0x57, 0x01,
                                                0x00, 0x31, 0x00, 0x01, 0xa0, 0x0c, 0x00};
  Message answer = withCompletion(request, completed);
  answer.insert(answer.end(), device.begin(), device.end());
  return answer;
}

Message oddAnswerTo(const Message& request) {
  constexpr std::size_t revision = 6;
  Message answer = answerTo(request);
  if (answer.size() > revision + 1) {
    answer[revision] |= 0x80U;
    answer[revision + 1] = 0x1f;
  }
  return answer;
}

}  // namespace machine
