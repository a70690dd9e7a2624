// Every parser on texts that nobody wrote, the same ones in each run.
#include "Machine.h"

#include <agent/discovery/Values.h>
#include <agent/discovery/dmi/DmiValues.h>
#include <agent/discovery/network/Interfaces.h>

#include <gtest/gtest.h>

#include <chrono>
#include <functional>
#include <random>

namespace agent::discovery::test {
namespace {

constexpr std::uint32_t seed = 20231121;
constexpr auto share = std::chrono::milliseconds(200);

/// Changes a few bytes of a sample: replaced, inserted, cut away.
class Mutator {
 public:
  explicit Mutator(std::vector<std::string> samples) : samples_(std::move(samples)) {}

  std::string next() {
    std::string text = samples_[below(samples_.size())];
    for (std::size_t changes = below(4); changes > 0; --changes) {
      change(text);
    }
    return text;
  }

 private:
  void change(std::string& text) {
    static constexpr std::string_view liked = "0123456789/.:x -+\0\xff";
    const char byte = below(2) == 0 ? liked[below(liked.size())] : static_cast<char>(below(256));
    const std::size_t place = below(text.size() + 1);
    switch (below(3)) {
      case 0:
        text.insert(place, 1, byte);
        break;
      case 1:
        text.resize(place);
        break;
      default:
        if (place < text.size()) {
          text[place] = byte;
        }
    }
  }
  std::size_t below(std::size_t limit) { return random_() % limit; }

  std::vector<std::string> samples_;
  std::mt19937 random_{seed};  // NOLINT(cert-msc32-c,cert-msc51-cpp): the same texts in each run
};

/// Texts in blocks of their own on the heap, so that the sanitizers see a read beyond their end.
void feed(std::vector<std::string> samples, const std::function<void(std::string_view)>& check) {
  Mutator mutator(std::move(samples));
  const auto end = std::chrono::steady_clock::now() + share;
  do {
    const std::string text = mutator.next();
    const std::vector<char> exact(text.begin(), text.end());
    check({exact.data(), exact.size()});
  } while (std::chrono::steady_clock::now() < end && !testing::Test::HasFailure());
}

TEST(ParserFuzz, ADateIsADateOrNone) {
  feed({"12/31/2010", "3/9/99", "02/29/2024"}, [](std::string_view text) {
    const auto date = parseBiosDate(text);
    if (date) {
      ASSERT_EQ(date->size(), 10U) << text;
      ASSERT_EQ(parseBiosDate(*date), date) << text;
    }
  });
}

TEST(ParserFuzz, AReleaseIsTwoBytesOrNone) {
  feed({"5.17", "255.255", "0.0"}, [](std::string_view text) {
    const auto release = parseBiosRelease(text);
    ASSERT_TRUE(!release || (release->major <= 255 && release->minor <= 255)) << text;
  });
}

TEST(ParserFuzz, DriverInfoIsReadWithinItsBytes) {
  feed({driverInfoBytes("5.6.0-k", "1.61, 0x80000d62"),
        driverInfoBytes(std::string(32, 'v'), std::string(32, 'f'))},
       [](std::string_view bytes) {
         const auto info = parseDriverInfo(bytes);
         if (info && info->firmwareVersion) {
           ASSERT_FALSE(info->firmwareVersion->empty());
           ASSERT_EQ(meaningful(*info->firmwareVersion), info->firmwareVersion);
         }
       });
}

TEST(ParserFuzz, ValuesStayWithinTheirBounds) {
  feed({"42", "0x1f", "N/A", "To be filled by O.E.M.", "  1.2 \n"}, [](std::string_view text) {
    const auto number = parseNumber(text, 1000);
    ASSERT_TRUE(!number || *number <= 1000) << text;
    const auto meant = meaningful(text);
    ASSERT_EQ(meant, meant ? meaningful(*meant) : std::nullopt) << text;
  });
}

TEST(ParserFuzz, APciAddressHasOneForm) {
  feed({"0000:3b:00.0", "10000:e1:1f.7", "virtio2"}, [](std::string_view text) {
    ASSERT_TRUE(!isPciAddress(text) ||
                (text.size() >= 12 && text.size() <= 16 && text[text.size() - 2] == '.'))
        << text;
  });
}

}  // namespace
}  // namespace agent::discovery::test
