#include <agent/endpoints/RequestPath.h>
#include <agent/framework/CmpiAccess.h>

#include <algorithm>

namespace agent::endpoints {

RequestPath::RequestPath(const CMPIObjectPath* path, const Kind& kind) {
  const auto* table = cmpi::tableOf(path);
  for (const char* name : kind.keyNames) {
    Wanted wanted{name, false, std::nullopt};
    const std::optional<CMPIData> data =
        table == nullptr ? std::nullopt
                         : cmpi::findByName<CMPIObjectPath>(path, name, table->getKey, table->getKeyCount,
                                                            table->getKeyAt);
    if (data && cmpi::hasValue(*data)) {
      wanted.isGiven = true;
      if (const char* chars = cmpi::charsOf(*data)) {
        wanted.value = chars;
      }
    }
    wanted_.push_back(std::move(wanted));
  }
}

bool RequestPath::passes(const Keys& keys) const {
  return std::equal(
      wanted_.begin(), wanted_.end(), keys.begin(), keys.end(),
      [](const Wanted& wanted, const Key& key) { return !wanted.isGiven || wanted.value == key.value; });
}

const char* RequestPath::missingKey() const {
  const auto missing =
      std::find_if(wanted_.begin(), wanted_.end(), [](const Wanted& wanted) { return !wanted.isGiven; });
  return missing == wanted_.end() ? nullptr : missing->name;
}

std::string RequestPath::text() const {
  std::string text;
  for (const Wanted& wanted : wanted_) {
    if (wanted.isGiven) {
      text.append(text.empty() ? "" : ",").append(wanted.name).append("=");
      text.append(wanted.value ? "\"" + *wanted.value + "\"" : "(no text)");
    }
  }
  return text;
}

}  // namespace agent::endpoints
