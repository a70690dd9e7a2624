#include <agent/discovery/host/HostSource.h>

namespace agent::discovery {

void readHost(SourceContext& context) {
  context.result().computerName = context.text("proc/sys/kernel/hostname");
}

}  // namespace agent::discovery
