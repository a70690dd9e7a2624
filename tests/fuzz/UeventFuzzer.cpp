#include <agent/discovery/events/Uevent.h>

#include "Fuzzer.h"

// What a message says lies within the message.
void fuzz::tryOne(std::string_view input) {
  if (const auto event = agent::discovery::parseUevent(input)) {
    promise(!event->action.empty() && event->action.size() + event->devicePath.size() <= input.size(),
            "an event without an action, or with more than its message");
    static_cast<void>(agent::discovery::concernsInventory(*event));
  }
}
