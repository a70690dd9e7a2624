#include <agent/discovery/Elements.h>
#include <agent/discovery/processor/Microcode.h>
#include <agent/discovery/processor/ProcessorSource.h>

#include <cerrno>
#include <utility>

namespace agent::discovery {

namespace {

constexpr const char* tablePath = "proc/cpuinfo";
constexpr std::size_t tableLimit = std::size_t{4} * 1024 * 1024;  // about 2500 processors

ProcessorTable readTable(SourceContext& context) {
  context.doing(context.root().outside(tablePath));
  const Outcome<std::string> text = context.root().read(tablePath, tableLimit);
  if (text) {
    return parseProcessorTable(*text.value);
  }
  if (reasonOf(text.error) != SourceReport::Reason::Absent && text.error != EFBIG) {
    context.reportError(context.root().outside(tablePath), text.error);
  }
  return {};
}

}  // namespace

void readProcessor(SourceContext& context) {
  ProcessorTable table = readTable(context);
  if (table.isVirtual) {
    return;
  }
  if (table.distinct.empty()) {
    if (const auto revision = context.textIfAny("sys/devices/system/cpu/cpu0/microcode/version")) {
      table.distinct.push_back({0, *revision, std::nullopt, std::nullopt});
    }
  }
  for (const ProcessorMicrocode& first : table.distinct) {
    if (isMadeUpRevision(first.revision)) {
      continue;
    }
    const std::string position = "processor:" + std::to_string(first.processor);
    const Label label{first.model, first.maker};
    FoundNode processor = deviceNode(position, "Processor", label);
    processor.children.push_back(
        firmwareNode(position + "/microcode", "Processor Microcode", first.revision, label));
    context.result().nodes.push_back(std::move(processor));
  }
}

}  // namespace agent::discovery
