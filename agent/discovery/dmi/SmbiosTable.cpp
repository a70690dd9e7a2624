#include <agent/discovery/dmi/SmbiosTable.h>

#include <algorithm>

namespace agent::discovery::smbios {

std::optional<std::string_view> Structure::stringAt(std::size_t offset) const {
  const std::uint8_t number = at<std::uint8_t>(offset).value_or(0);
  if (number == 0) {
    return std::nullopt;
  }
  std::string_view rest = strings_;
  for (std::uint8_t before = 1; before < number && !rest.empty(); ++before) {
    rest.remove_prefix(std::min(rest.find('\0'), rest.size() - 1) + 1);
  }
  if (rest.empty()) {
    return std::nullopt;
  }
  return rest.substr(0, rest.find('\0'));
}

std::optional<Structure> TableReader::stop(End end) {
  end_ = end;
  return std::nullopt;
}

std::optional<Structure> TableReader::next() {
  static constexpr std::string_view twoNuls("\0\0", 2);
  if (end_ != End::None) {
    return std::nullopt;
  }
  if (count_ == limit_) {
    return stop(End::Counted);
  }
  const Bytes rest = table_.subspan(offset_);
  if (rest.empty()) {
    return stop(End::NoMarker);
  }
  if (rest.size() < Structure::headerLength) {
    return stop(End::CutShort);
  }
  const std::size_t length = std::to_integer<std::size_t>(rest[1]);
  if (length < Structure::headerLength) {
    return stop(End::NotAStructure);
  }
  if (length > rest.size()) {
    return stop(End::CutShort);
  }
  const Bytes behind = rest.subspan(length);
  const std::string_view text(reinterpret_cast<const char*>(behind.data()), behind.size());
  const std::size_t textEnd = text.find(twoNuls);
  if (textEnd == std::string_view::npos) {
    return stop(End::CutShort);
  }
  // The first NUL ends the last string; without strings both stand alone.
  const Structure structure(rest.first(length), text.substr(0, textEnd == 0 ? 0 : textEnd + 1));
  offset_ += length + textEnd + twoNuls.size();
  ++count_;
  if (structure.type() == endMarker) {
    end_ = End::Marker;
  }
  return structure;
}

}  // namespace agent::discovery::smbios
