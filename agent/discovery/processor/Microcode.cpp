#include <agent/discovery/Values.h>
#include <agent/discovery/processor/Microcode.h>

#include <algorithm>
#include <array>
#include <set>
#include <utility>

namespace agent::discovery {

namespace {

std::string_view stripped(std::string_view text) {
  static constexpr std::string_view blanks = " \t\r";
  const std::size_t begin = text.find_first_not_of(blanks);
  return begin == std::string_view::npos ? std::string_view()
                                         : text.substr(begin, text.find_last_not_of(blanks) - begin + 1);
}

bool hasWord(std::string_view text, std::string_view word) {
  for (std::size_t at = text.find(word); at != std::string_view::npos; at = text.find(word, at + 1)) {
    const bool begins = at == 0 || text[at - 1] == ' ';
    const bool ends = at + word.size() == text.size() || text[at + word.size()] == ' ';
    if (begins && ends) {
      return true;
    }
  }
  return false;
}

/// Gathers the lines of one processor after the other.
class Reader {
 public:
  void take(std::string_view key, std::string_view value) {
    if (key == "processor") {
      finish();
      number_ = parseNumber(value);
    } else if (key == "microcode") {
      revision_ = value;
    } else if (key == "model name") {
      model_ = value;
    } else if (key == "vendor_id") {
      maker_ = value;
    } else if (key == "flags") {
      table_.isVirtual = table_.isVirtual || hasWord(value, "hypervisor");
    }
  }

  ProcessorTable end() {
    finish();
    return std::move(table_);
  }

 private:
  void finish() {
    if (number_ && meaningful(revision_) && known_.insert(revision_).second) {
      table_.distinct.push_back({*number_, *meaningful(revision_), meaningful(model_), meaningful(maker_)});
    }
    number_.reset();
    revision_ = model_ = maker_ = {};
  }

  ProcessorTable table_;
  std::set<std::string_view> known_;
  std::optional<std::uint32_t> number_;
  std::string_view revision_;
  std::string_view model_;
  std::string_view maker_;
};

}  // namespace

ProcessorTable parseProcessorTable(std::string_view text) {
  Reader reader;
  while (!text.empty()) {
    const std::size_t end = std::min(text.find('\n'), text.size());
    const std::string_view line = text.substr(0, end);
    text.remove_prefix(std::min(end + 1, text.size()));
    if (const std::size_t colon = line.find(':'); colon != std::string_view::npos) {
      reader.take(stripped(line.substr(0, colon)), stripped(line.substr(colon + 1)));
    }
  }
  return reader.end();
}

bool isMadeUpRevision(std::string_view revision) {
  static constexpr std::array<std::uint32_t, 4> madeUp = {0, 1, 0x01000065, 0xffffffff};
  const std::optional<std::uint32_t> number = parseNumber(revision);
  return !number || std::find(madeUp.begin(), madeUp.end(), *number) != madeUp.end();
}

}  // namespace agent::discovery
