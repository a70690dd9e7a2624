#include <agent/discovery/network/Ethtool.h>

#include "Fuzzer.h"

void fuzz::tryOne(std::string_view input) {
  if (const auto info = agent::discovery::parseDriverInfo(input)) {
    promise(!info->driverVersion || !info->driverVersion->empty(), "a driver version that says nothing");
    promise(!info->firmwareVersion || !info->firmwareVersion->empty(),
            "a firmware version that says nothing");
  }
}
