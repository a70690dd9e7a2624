#include <cli/ScalarText.h>

#include <array>
#include <charconv>

namespace cli {
namespace {

struct Texts {
  std::string operator()(std::monostate) const { return {}; }
  std::string operator()(bool value) const { return value ? "true" : "false"; }
  std::string operator()(std::uint64_t value) const { return std::to_string(value); }
  std::string operator()(std::int64_t value) const { return std::to_string(value); }
  std::string operator()(double value) const {
    std::array<char, 32> text{};  // the shortest form that reads back the same takes 24 at most
    const auto result = std::to_chars(text.data(), text.data() + text.size(), value);
    return {text.data(), result.ptr};
  }
  std::string operator()(const std::string& value) const { return value; }
  std::string operator()(const DateTime& value) const { return value.text; }
  std::string operator()(const Reference& value) const { return value.uri; }
};

}  // namespace

std::string scalarText(const Scalar& value) {
  return std::visit(Texts{}, value);
}

}  // namespace cli
