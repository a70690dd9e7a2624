#include <agent/discovery/BusAddress.h>
#include <agent/discovery/Elements.h>
#include <agent/discovery/tpm/TpmCapabilities.h>
#include <agent/discovery/tpm/TpmSource.h>

#include <utility>

namespace agent::discovery {

namespace {

/// The lines of `caps`; older kernels have it with the device. Its lines matter, so it is not read as one
/// text.
std::optional<std::string> readCapabilities(SourceContext& context, const std::string& folder) {
  for (const std::string& path : {folder + "/caps", folder + "/device/caps"}) {
    context.doing(context.root().outside(path));
    const Outcome<std::string> text = context.root().read(path);
    if (text) {
      return *text.value;
    }
    if (reasonOf(text.error) != SourceReport::Reason::Absent) {
      context.reportError(context.root().outside(path), text.error);
    }
  }
  return std::nullopt;
}

void readOne(SourceContext& context, const std::string& folder) {
  const std::optional<std::string> text = readCapabilities(context, folder);
  if (!text) {
    if (context.textIfAny(folder + "/tpm_version_major") == "2") {
      context.report(context.root().outside(folder), SourceReport::Reason::Absent,
                     "the kernel shows no firmware version of a TPM 2.0");
    }
    return;
  }
  const TpmCapabilities capabilities = parseTpmCapabilities(*text);
  if (!capabilities.version) {
    context.report(context.root().outside(folder), SourceReport::Reason::Absent,
                   "its capabilities tell no firmware version");
    return;
  }
  const Outcome<std::string> resolved = context.root().resolve(folder);
  const std::string position = "tpm:" + functionAddress(context, resolved ? *resolved.value : folder);
  const Label label{std::nullopt, capabilities.maker};
  FoundNode device = deviceNode(position, "TPM", label);
  FoundNode firmware = firmwareNode(position + "/firmware", "TPM Firmware", *capabilities.version, label);
  if (capabilities.major && capabilities.minor) {
    firmware.setValue(Oru::NodeLexicon::MajorVersionProperty, *capabilities.major);
    firmware.setValue(Oru::NodeLexicon::MinorVersionProperty, *capabilities.minor);
  }
  device.children.push_back(std::move(firmware));
  context.result().nodes.push_back(std::move(device));
}

}  // namespace

void readTpm(SourceContext& context) {
  for (const std::string& name : context.listIfAny("sys/class/tpm")) {
    readOne(context, "sys/class/tpm/" + name);
  }
}

}  // namespace agent::discovery
