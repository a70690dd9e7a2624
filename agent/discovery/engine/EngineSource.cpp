#include <agent/discovery/BusAddress.h>
#include <agent/discovery/Elements.h>
#include <agent/discovery/engine/EngineSource.h>
#include <agent/discovery/engine/EngineVersions.h>

#include <utility>

namespace agent::discovery {

namespace {

void readOne(SourceContext& context, const std::string& folder) {
  const std::string path = folder + "/fw_ver";
  context.doing(context.root().outside(path));
  const Outcome<std::string> text = context.root().read(path);
  if (!text) {
    if (reasonOf(text.error) != SourceReport::Reason::Absent) {  // kernels before 4.18 have none
      context.reportError(context.root().outside(path), text.error);
    }
    return;
  }
  const std::vector<EngineVersion> versions = parseEngineVersions(*text.value);
  if (versions.empty()) {
    context.report(context.root().outside(path), SourceReport::Reason::Absent, "it tells no version");
    return;
  }
  const Outcome<std::string> resolved = context.root().resolve(folder);
  const std::string position = functionAddress(context, resolved ? *resolved.value : folder);
  FoundNode device = deviceNode(position, "Management Engine");
  std::string part = position + "/firmware";
  for (const EngineVersion& version : versions) {
    FoundNode firmware = firmwareNode(part, "Management Engine Firmware", version.text);
    firmware.setValue(Oru::NodeLexicon::MajorVersionProperty, version.major);
    firmware.setValue(Oru::NodeLexicon::MinorVersionProperty, version.minor);
    device.children.push_back(std::move(firmware));
    part = position + "/firmware:" + std::to_string(device.children.size() + 1);
  }
  context.result().nodes.push_back(std::move(device));
}

}  // namespace

void readEngine(SourceContext& context) {
  for (const std::string& name : context.listIfAny("sys/class/mei")) {
    readOne(context, "sys/class/mei/" + name);
  }
}

}  // namespace agent::discovery
