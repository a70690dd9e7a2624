#include <agent/endpoints/Failure.h>
#include <agent/endpoints/RequestPath.h>
#include <agent/framework/CmpiAccess.h>
#include <agent/framework/NodeTree.h>

#include <Oru/ProviderUtilities.h>
#include <cmpi/cmpift.h>

#include <algorithm>

namespace agent::endpoints {

RequestPath::RequestPath(const CMPIObjectPath* path, const Kind& kind)
    : nameSpace_(Oru::ProviderUtilities::getNamespace(path)) {
  for (const char* name : kind.keyNames) {
    wanted_.push_back({name, false, std::nullopt});
  }
  const bool isCounted =
      cmpi::forEachKey(path, [this](const char* name, const CMPIData& value) { take(name, value); });
  if (nameSpace_.empty() || !isCounted) {
    throw Failure(CMPI_RC_ERR_FAILED, std::string("the object manager does not tell the ") +
                                          (nameSpace_.empty() ? "namespace" : "keys") +
                                          " of the request's path");
  }
}

/// Of several keys of one name the first stands. One without a value narrows nothing.
void RequestPath::take(const char* name, const CMPIData& value) {
  const auto found = std::find_if(wanted_.begin(), wanted_.end(), [&](const Wanted& wanted) {
    return name != nullptr && cmpi::sameName(wanted.name, name);
  });
  if (found == wanted_.end() || found->isGiven || !cmpi::hasValue(value)) {
    return;
  }
  found->isGiven = true;
  if (const char* chars = cmpi::charsOf(value)) {
    found->value = chars;
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
      text.append(wanted.value ? "\"" + cleanText(*wanted.value) + "\"" : "(no text)");
    }
  }
  return text;
}

}  // namespace agent::endpoints
