#include <agent/discovery/storage/StorageSource.h>

#include <iterator>
#include <utility>

namespace agent::discovery {

void readStorage(SourceContext& context) {
  for (auto* const part : {readAdapters, readNvmeDrives, readScsiDevices}) {
    std::vector<FoundNode> found = part(context);
    std::vector<FoundNode>& nodes = context.result().nodes;
    nodes.insert(nodes.end(), std::make_move_iterator(found.begin()), std::make_move_iterator(found.end()));
    context.publish();
  }
}

}  // namespace agent::discovery
