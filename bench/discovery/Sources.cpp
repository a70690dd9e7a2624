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
#include <bench/discovery/Sources.h>

namespace bench {

std::vector<agent::discovery::Source> sourcesOf(const agent::DiscoveryOptions& options) {
  using namespace agent::discovery;
  const bool live = SystemRoot(options.root).isLive();
  const std::shared_ptr<Ethtool> ethtool = live ? makeKernelEthtool() : options.ethtool;
  const NetlinkOpener netlink = live ? kernelNetlink() : options.netlink;
  const IpmiOpener ipmi = live ? kernelIpmi() : options.ipmi;
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

}  // namespace bench
