#include <Oru/Exceptions.h>

namespace Oru {
namespace {

const char* textOf(const char* message) {
  return message == nullptr ? "" : message;
}

}  // namespace

InstrumentationException::InstrumentationException(const char* message) : message_(textOf(message)) {}
InstrumentationException::InstrumentationException(const InstrumentationException&) = default;
InstrumentationException& InstrumentationException::operator=(const InstrumentationException&) = default;
InstrumentationException::~InstrumentationException() = default;
const char* InstrumentationException::what() const noexcept {
  return message_.c_str();
}

FrameworkException::FrameworkException(const char* message) : message_(textOf(message)) {}
FrameworkException::FrameworkException(const FrameworkException&) = default;
FrameworkException& FrameworkException::operator=(const FrameworkException&) = default;
FrameworkException::~FrameworkException() = default;
const char* FrameworkException::what() const noexcept {
  return message_.c_str();
}

ProviderException::ProviderException(const char* message) : message_(textOf(message)) {}
ProviderException::ProviderException(const ProviderException&) = default;
ProviderException& ProviderException::operator=(const ProviderException&) = default;
ProviderException::~ProviderException() = default;
const char* ProviderException::what() const noexcept {
  return message_.c_str();
}

}  // namespace Oru
