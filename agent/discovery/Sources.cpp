#include <agent/discovery/Sources.h>
#include <agent/discovery/dmi/DmiSource.h>
#include <agent/discovery/drivers/DriverSource.h>
#include <agent/discovery/engine/EngineSource.h>
#include <agent/discovery/esrt/EsrtSource.h>
#include <agent/discovery/gpu/GpuSource.h>
#include <agent/discovery/host/HostSource.h>
#include <agent/discovery/ipmi/IpmiSource.h>
#include <agent/discovery/network/NetworkSource.h>
#include <agent/discovery/processor/ProcessorSource.h>
#include <agent/discovery/storage/StorageSource.h>
#include <agent/discovery/tpm/TpmSource.h>

#include <utility>

namespace agent::discovery {

std::vector<Source> makeSources(const DiscoveryOptions& options, const SystemRoot& root) {
  std::shared_ptr<Ethtool> ethtool = options.ethtool;
  if (ethtool == nullptr && root.isLive()) {
    ethtool = makeKernelEthtool();
  }
  NetlinkOpener netlink = options.netlink;
  if (!netlink && root.isLive()) {
    netlink = kernelNetlink();
  }
  IpmiOpener ipmi = options.ipmi;
  if (!ipmi && root.isLive()) {
    ipmi = kernelIpmi();
  }
  return {
      {"host", readHost},
      {"dmi", readDmi},
      {"ipmi", [ipmi](SourceContext& context) { readIpmi(context, ipmi); }},
      {"esrt", readEsrt},
      {"processor", readProcessor},
      {"tpm", readTpm},
      {"engine", readEngine},
      {"network", [ethtool, netlink](SourceContext& context) { readNetwork(context, ethtool, netlink); }},
      {"storage", readStorage},
      {"gpu", readGpu},
      {"drivers", [modules = options.modules](SourceContext& context) { readDrivers(context, modules); }},
  };
}

}  // namespace agent::discovery
