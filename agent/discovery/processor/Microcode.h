// What /proc/cpuinfo tells of the microcode.
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace agent::discovery {

/// One logical processor that is the first with its microcode revision.
struct ProcessorMicrocode {
  std::uint32_t processor = 0;  ///< the kernel's number of it
  std::string revision;         ///< as it stands there: "0xde"
  std::optional<std::string> model;
  std::optional<std::string> maker;  ///< as the processor spells it: "GenuineIntel"
};

struct ProcessorTable {
  std::vector<ProcessorMicrocode> distinct;  ///< one for each revision, in the order of the processors
  bool isVirtual = false;                    ///< a processor has the "hypervisor" flag
};

/// Reads the text of /proc/cpuinfo; lines of another form are passed over.
ProcessorTable parseProcessorTable(std::string_view text);

/// Whether a hypervisor made the revision up: 0, 1, 0x01000065 and 0xffffffff are what they show guests. Also
/// where it is no number.
bool isMadeUpRevision(std::string_view revision);

}  // namespace agent::discovery
