// The three exceptions of the framework and its users.
//
// They are thrown in one library and caught in another. Their vtables and type information are therefore
// defined once, in the framework library, and every other library refers to those: nothing here is inline.
#pragma once

#include <exception>
#include <string>

#pragma GCC visibility push(default)
namespace Oru {

/// Failure in the node tree: no such node, nothing passes a filter, a property that must be there is not.
class InstrumentationException : public std::exception {
 public:
  /// `message` is copied. A null message reads as an empty one.
  explicit InstrumentationException(const char* message);
  InstrumentationException(const InstrumentationException&);
  InstrumentationException& operator=(const InstrumentationException&);
  ~InstrumentationException() override;
  /// The message; it lives as long as the exception.
  const char* what() const noexcept override;

 private:
  std::string message_;
};

/// A moniker without the key that an operation needs.
class FrameworkException : public std::exception {
 public:
  /// `message` is copied. A null message reads as an empty one.
  explicit FrameworkException(const char* message);
  FrameworkException(const FrameworkException&);
  FrameworkException& operator=(const FrameworkException&);
  ~FrameworkException() override;
  /// The message; it lives as long as the exception.
  const char* what() const noexcept override;

 private:
  std::string message_;
};

/// A failed look-up of another provider's instances through the object manager.
class ProviderException : public std::exception {
 public:
  /// `message` is copied. A null message reads as an empty one.
  explicit ProviderException(const char* message);
  ProviderException(const ProviderException&);
  ProviderException& operator=(const ProviderException&);
  ~ProviderException() override;
  /// The message; it lives as long as the exception.
  const char* what() const noexcept override;

 private:
  std::string message_;
};

}  // namespace Oru
#pragma GCC visibility pop
