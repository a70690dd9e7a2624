// A client that asks over HTTP and throws the answers away.
#pragma once

#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>

namespace bench {

/// One keep-alive connection to the endpoint on this machine. Throws std::runtime_error where anything but
/// a whole answer with status 200 comes.
class Connection {
 public:
  explicit Connection(std::uint16_t port);
  ~Connection();
  Connection(const Connection&) = delete;
  Connection& operator=(const Connection&) = delete;

  void send(std::string_view request);

  /// Reads what is there, and the rest of the answer where `wait`. True: the answer is whole.
  bool receive(bool wait);

  /// The bytes of the body of the last answer, and how often `counted` is in them.
  [[nodiscard]] std::size_t bodyBytes() const { return body_; }
  [[nodiscard]] std::size_t objects() const { return objects_; }
  void count(std::string_view counted) { counted_ = counted; }

  [[nodiscard]] int descriptor() const { return socket_; }

 private:
  enum class Part { Head, Sized, ChunkHead, Chunk, ChunkEnd, Trailer };

  bool take(std::string_view bytes);
  bool takeLine(std::string_view& bytes);
  void readHead();
  void takeBody(std::string_view bytes);

  int socket_ = -1;
  Part part_ = Part::Head;
  std::string line_;      ///< of the head, of a chunk's size or a trailer, as far as it came
  std::size_t left_ = 0;  ///< of a chunk, or of a body with a length
  std::size_t body_ = 0;
  std::size_t objects_ = 0;
  std::string counted_;
  std::string tail_;  ///< of the body, where what is counted may have begun
};

/// The HTTP request for a CIM operation with these parameters, which are CIM-XML.
std::string cimRequest(const std::string& operation, const std::string& parameters);

}  // namespace bench
