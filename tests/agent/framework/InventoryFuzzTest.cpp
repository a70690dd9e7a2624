// Damaged inventories are either read or refused: nothing else ever happens.
#include "RandomTree.h"

#include <agent/framework/InventoryFile.h>

#include <gtest/gtest.h>

#include <algorithm>
#include <chrono>
#include <fstream>
#include <iterator>
#include <string>
#include <vector>

namespace agent {
namespace {

std::string exampleText() {
  std::ifstream file(std::string(EXAMPLES_DIR) + "/server.json", std::ios::binary);
  return {std::istreambuf_iterator<char>(file), std::istreambuf_iterator<char>()};
}

void damage(std::string& text, testing::RandomTree& random) {
  static const std::vector<std::string> pieces{"{",
                                               "}",
                                               "[",
                                               "]",
                                               ",",
                                               ":",
                                               "\"",
                                               "\\",
                                               "\\u0000",
                                               "\\ud800",
                                               "null",
                                               "-1",
                                               "1e400",
                                               "0.5",
                                               "true",
                                               "4294967296",
                                               "\"id\"",
                                               "\"1\"",
                                               "\xFF",
                                               "\xEF\xBB\xBF",
                                               "\n",
                                               "\"type\":3,",
                                               "\"children\":[{}],",
                                               "\"properties\":{\"307\":1},",
                                               "18446744073709551616"};
  const std::size_t place = random.below(text.size() + 1);
  const std::size_t length = std::min(random.below(30), text.size() - place);
  switch (random.below(6)) {
    case 0:
      text.insert(place, pieces[random.below(pieces.size())]);
      break;
    case 1:
      text.replace(place, length, pieces[random.below(pieces.size())]);
      break;
    case 2:
      text.erase(place, length);
      break;
    case 3:
      text.insert(place, text.substr(random.below(text.size() + 1), length));
      break;
    case 4:
      text.resize(place);
      break;
    default:
      if (place < text.size()) {
        text[place] = static_cast<char>(random.below(256));
      }
  }
}

TEST(InventoryFuzz, DamagedTextsAreReadOrRefused) {
  testing::RandomTree random(20240611);
  std::vector<std::string> seeds{exampleText()};
  while (seeds.size() < 12) {
    try {
      seeds.push_back(writeInventory(random.make(12)));
    } catch (const InventoryError&) {
      continue;
    }
  }
  ASSERT_FALSE(seeds.front().empty());

  std::size_t read = 0;
  std::size_t refused = 0;
  // Rounds, not seconds, decide what is tried, so that a finding comes back; the clock only ends slow builds.
  const auto end = std::chrono::steady_clock::now() + std::chrono::seconds(4);
  for (int round = 0; round < 150'000 && std::chrono::steady_clock::now() < end; ++round) {
    std::string text = seeds[random.below(seeds.size())];
    for (std::size_t i = 1 + random.below(3); i > 0 && !text.empty(); --i) {
      damage(text, random);
    }
    try {
      const NodeTree tree = parseInventory(text, "fuzz.json");
      ASSERT_EQ(parseInventory(writeInventory(tree), "fuzz.json"), tree) << text;
      ++read;
    } catch (const InventoryError& error) {
      ASSERT_EQ(std::string(error.what()).rfind("fuzz.json:", 0), 0U) << error.what();
      ++refused;
    }
  }
  EXPECT_GT(read, 0U);
  EXPECT_GT(refused, 0U);
}

}  // namespace
}  // namespace agent
