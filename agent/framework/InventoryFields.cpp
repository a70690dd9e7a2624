#include <agent/framework/InventoryFields.h>

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

}  // namespace agent::inventory
