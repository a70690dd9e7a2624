#include <agent/discovery/Values.h>
#include <agent/discovery/network/Devlink.h>
#include <agent/discovery/network/Netlink.h>

#include <cstddef>
#include <vector>

#include "Fuzzer.h"

namespace {

using namespace agent::discovery;

void checkVersions(const std::vector<DevlinkVersion>& versions) {
  for (const DevlinkVersion& version : versions) {
    fuzz::promise(meaningful(version.name) == version.name, "a name that says nothing");
    fuzz::promise(meaningful(version.version) == version.version, "a version that says nothing");
  }
}

void checkInfo(std::string_view attributes) {
  const DevlinkInfo info = parseDevlinkInfo(attributes);
  checkVersions(info.fixed);
  checkVersions(info.running);
  checkVersions(info.stored);
  fuzz::promise(info.running.size() <= info.runningTexts.size(), "a running version without its text");
}

}  // namespace

void fuzz::tryOne(std::string_view input) {
  checkInfo(input);
  std::size_t left = input.size() + 1;
  while (const auto message = netlink::takeMessage(input)) {
    promise(input.size() < left, "a message that takes no bytes");
    left = input.size();
    promise(netlink::errorOf(message->payload) >= 0, "an error that is no errno value");
    if (const auto generic = netlink::parseGeneric(message->payload)) {
      checkInfo(generic->attributes);
    }
  }
}
