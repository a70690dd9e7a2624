#include <agent/framework/InventoryFields.h>
#include <agent/framework/InventoryScalar.h>

#include <algorithm>
#include <utility>

namespace agent::inventory {
namespace {

constexpr std::array<std::pair<SourceReport::Reason, std::string_view>, 4> reasons{{
    {SourceReport::Reason::Absent, "absent"},
    {SourceReport::Reason::NoPermission, "noPermission"},
    {SourceReport::Reason::Unreadable, "unreadable"},
    {SourceReport::Reason::TimedOut, "timedOut"},
}};

}  // namespace

const FieldDescription* fieldNamed(Place place, std::string_view name) {
  const auto* found = std::find_if(fields.begin(), fields.end(), [&](const FieldDescription& field) {
    return field.place == place && field.name == name;
  });
  return found == fields.end() ? nullptr : found;
}

std::string fieldNames(Place place) {
  std::string names;
  for (const FieldDescription& field : fields) {
    if (field.place == place) {
      names += (names.empty() ? "" : ", ") + std::string(field.name);
    }
  }
  return names;
}

std::string_view reasonName(SourceReport::Reason reason) {
  const auto* found =
      std::find_if(reasons.begin(), reasons.end(), [&](const auto& entry) { return entry.first == reason; });
  return found == reasons.end() ? std::string_view("unreadable") : found->second;
}

std::optional<SourceReport::Reason> reasonNamed(std::string_view name) {
  const auto* found =
      std::find_if(reasons.begin(), reasons.end(), [&](const auto& entry) { return entry.second == name; });
  return found == reasons.end() ? std::nullopt : std::optional(found->first);
}

std::string shownPath(std::string_view path) {
  constexpr std::size_t longest = 200;
  constexpr std::size_t half = longest / 2;
  if (path.size() <= longest) {
    return std::string(path);
  }
  const auto isInsideCharacter = [path](std::size_t at) {
    return (static_cast<unsigned char>(path[at]) & 0xc0U) == 0x80;
  };
  std::size_t headEnd = path.rfind('.', half);
  if (headEnd == std::string_view::npos) {
    for (headEnd = half; isInsideCharacter(headEnd); --headEnd) {
    }
  }
  std::size_t tailBegin = path.find('.', path.size() - half);
  if (tailBegin == std::string_view::npos) {
    for (tailBegin = path.size() - half; isInsideCharacter(tailBegin); ++tailBegin) {
    }
  }
  return std::string(path.substr(0, headEnd)) + "\u2026" + std::string(path.substr(tailBegin));
}

}  // namespace agent::inventory
