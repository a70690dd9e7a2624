#include "Captures.h"

#include <cerrno>

namespace agent::discovery::test {

const std::string_view server = R"(
proc/sys/kernel/hostname = rack7-node3
proc/sys/kernel/osrelease = 6.1.0-18-amd64

sys/class/dmi/id -> ../../devices/virtual/dmi/id
sys/devices/virtual/dmi/id/bios_vendor = Corvane Ltd.
sys/devices/virtual/dmi/id/bios_version = U41 v2.66
sys/devices/virtual/dmi/id/bios_date = 3/9/2023
sys/devices/virtual/dmi/id/bios_release = 5.17

# one function with two ports
sys/class/net/ens1 -> ../../devices/pci0000:3a/0000:3a:00.0/0000:3b:00.0/net/ens1
sys/class/net/ens1d1 -> ../../devices/pci0000:3a/0000:3a:00.0/0000:3b:00.0/net/ens1d1
sys/devices/pci0000:3a/0000:3a:00.0/subsystem -> ../../../bus/pci
sys/devices/pci0000:3a/0000:3a:00.0/driver -> ../../../bus/pci/drivers/pcieport
sys/devices/pci0000:3a/0000:3a:00.0/0000:3b:00.0/subsystem -> ../../../../bus/pci
sys/devices/pci0000:3a/0000:3a:00.0/0000:3b:00.0/driver -> ../../../../bus/pci/drivers/twinport_core
sys/devices/pci0000:3a/0000:3a:00.0/0000:3b:00.0/net/ens1/device -> ../../../0000:3b:00.0
sys/devices/pci0000:3a/0000:3a:00.0/0000:3b:00.0/net/ens1/dev_port = 0
sys/devices/pci0000:3a/0000:3a:00.0/0000:3b:00.0/net/ens1/dev_id = 0x0
sys/devices/pci0000:3a/0000:3a:00.0/0000:3b:00.0/net/ens1/ifindex = 4
sys/devices/pci0000:3a/0000:3a:00.0/0000:3b:00.0/net/ens1d1/device -> ../../../0000:3b:00.0
sys/devices/pci0000:3a/0000:3a:00.0/0000:3b:00.0/net/ens1d1/dev_port = 1
sys/devices/pci0000:3a/0000:3a:00.0/0000:3b:00.0/net/ens1d1/dev_id = 0x1
sys/devices/pci0000:3a/0000:3a:00.0/0000:3b:00.0/net/ens1d1/ifindex = 5

# two functions of an onboard card; the first has no firmware
sys/class/net/eno1 -> ../../devices/pci0000:00/0000:02:00.0/net/eno1
sys/class/net/eno2 -> ../../devices/pci0000:00/0000:02:00.1/net/eno2
sys/devices/pci0000:00/0000:02:00.0/subsystem -> ../../../bus/pci
sys/devices/pci0000:00/0000:02:00.0/driver -> ../../../bus/pci/drivers/gig
sys/devices/pci0000:00/0000:02:00.0/net/eno1/device -> ../../../0000:02:00.0
sys/devices/pci0000:00/0000:02:00.0/net/eno1/dev_port = 0
sys/devices/pci0000:00/0000:02:00.0/net/eno1/ifindex = 2
sys/devices/pci0000:00/0000:02:00.1/subsystem -> ../../../bus/pci
sys/devices/pci0000:00/0000:02:00.1/driver -> ../../../bus/pci/drivers/gig
sys/devices/pci0000:00/0000:02:00.1/net/eno2/device -> ../../../0000:02:00.1
sys/devices/pci0000:00/0000:02:00.1/net/eno2/dev_port = 0
sys/devices/pci0000:00/0000:02:00.1/net/eno2/ifindex = 3

# the service processor's own adapter, on USB
sys/class/net/usb0 -> ../../devices/pci0000:00/0000:00:14.0/usb1/1-4/1-4:1.0/net/usb0
sys/devices/pci0000:00/0000:00:14.0/subsystem -> ../../../bus/pci
sys/devices/pci0000:00/0000:00:14.0/usb1/subsystem -> ../../../../bus/usb
sys/devices/pci0000:00/0000:00:14.0/usb1/1-4/subsystem -> ../../../../../bus/usb
sys/devices/pci0000:00/0000:00:14.0/usb1/1-4/1-4:1.0/subsystem -> ../../../../../../bus/usb
sys/devices/pci0000:00/0000:00:14.0/usb1/1-4/1-4:1.0/driver -> ../../../../../../bus/usb/drivers/cdc_ether
sys/devices/pci0000:00/0000:00:14.0/usb1/1-4/1-4:1.0/net/usb0/device -> ../../../1-4:1.0
sys/devices/pci0000:00/0000:00:14.0/usb1/1-4/1-4:1.0/net/usb0/dev_port = 0

# no devices
sys/class/net/bonding_masters = bond0
sys/class/net/bond0 -> ../../devices/virtual/net/bond0
sys/devices/virtual/net/bond0/dev_port = 0
sys/class/net/br0 -> ../../devices/virtual/net/br0
sys/devices/virtual/net/br0/dev_port = 0
sys/class/net/eno1.42 -> ../../devices/virtual/net/eno1.42
sys/devices/virtual/net/eno1.42/dev_port = 0
sys/class/net/lo -> ../../devices/virtual/net/lo
sys/devices/virtual/net/lo/dev_port = 0

# what is bound to which driver
sys/bus/pci/devices/0000:00:14.0 -> ../../../devices/pci0000:00/0000:00:14.0
sys/bus/pci/devices/0000:02:00.0 -> ../../../devices/pci0000:00/0000:02:00.0
sys/bus/pci/devices/0000:02:00.1 -> ../../../devices/pci0000:00/0000:02:00.1
sys/bus/pci/devices/0000:3a:00.0 -> ../../../devices/pci0000:3a/0000:3a:00.0
sys/bus/pci/devices/0000:3b:00.0 -> ../../../devices/pci0000:3a/0000:3a:00.0/0000:3b:00.0
sys/bus/pci/drivers/gig/module -> ../../../../module/gig
sys/bus/pci/drivers/pcieport/
sys/bus/pci/drivers/idle_driver/module -> ../../../../module/idle_driver
sys/bus/pci/drivers/twinport_core/module -> ../../../../module/twinport_core
sys/bus/usb/devices/1-4 -> ../../../devices/pci0000:00/0000:00:14.0/usb1/1-4
sys/bus/usb/devices/1-4:1.0 -> ../../../devices/pci0000:00/0000:00:14.0/usb1/1-4/1-4:1.0
sys/bus/usb/drivers/cdc_ether/module -> ../../../../module/cdc_ether
sys/module/gig/initstate = live
sys/module/gig/version = 5.6.0-k
sys/module/idle_driver/version = 9
sys/module/twinport_core/initstate = live
sys/module/cdc_ether/initstate = live
lib -> usr/lib
usr/lib/modules/6.1.0-18-amd64/
)";

std::shared_ptr<Ethtool> serverEthtool() {
  return std::make_shared<FakeEthtool>(std::map<std::string, FakeEthtool::Told>{
      {"ens1", {"6.1.0-18-amd64", "16.32.1010 (MT_0000000012)", 0}},
      {"ens1d1", {"6.1.0-18-amd64", "16.32.1010 (MT_0000000012)", 0}},
      {"eno1", {"5.6.0-k", "N/A", 0}},
      {"eno2", {"5.6.0-k", "1.61, 0x80000d62, 1.2527.0", 0}},
      {"usb0", {"", "", EOPNOTSUPP}},
  });
}

const std::string_view virtualMachine = R"(
proc/sys/kernel/hostname = vm
proc/sys/kernel/osrelease = 6.18.44
sys/class/net/eth0 -> ../../devices/pci0000:00/0000:00:03.0/virtio2/net/eth0
sys/class/net/lo -> ../../devices/virtual/net/lo
sys/devices/virtual/net/lo/dev_port = 0
sys/devices/pci0000:00/0000:00:03.0/subsystem -> ../../../bus/pci
sys/devices/pci0000:00/0000:00:03.0/driver -> ../../../bus/pci/drivers/virtio-pci
sys/devices/pci0000:00/0000:00:03.0/virtio2/subsystem -> ../../../../bus/virtio
sys/devices/pci0000:00/0000:00:03.0/virtio2/driver -> ../../../../bus/virtio/drivers/virtio_net
sys/devices/pci0000:00/0000:00:03.0/virtio2/net/eth0/device -> ../../../virtio2
sys/devices/pci0000:00/0000:00:03.0/virtio2/net/eth0/dev_port = 0
sys/devices/platform/serial8250/driver -> ../../../bus/platform/drivers/serial8250
sys/bus/cpu/devices/
sys/bus/pci/devices/0000:00:03.0 -> ../../../devices/pci0000:00/0000:00:03.0
sys/bus/pci/drivers/virtio-pci/
sys/bus/platform/devices/serial8250 -> ../../../devices/platform/serial8250
sys/bus/platform/drivers/serial8250/
sys/bus/virtio/devices/virtio2 -> ../../../devices/pci0000:00/0000:00:03.0/virtio2
sys/bus/virtio/drivers/virtio_net/
sys/module/virtio_pci/version = 1
sys/module/virtio_net/parameters/
)";

}  // namespace agent::discovery::test
