#include <agent/discovery/Elements.h>
#include <agent/discovery/ipmi/DeviceId.h>
#include <agent/discovery/ipmi/IpmiSource.h>

#include <algorithm>
#include <cerrno>
#include <string>
#include <utility>
#include <vector>

namespace agent::discovery {

namespace {

/// Well below the time that a source has, so that it is this question that is reported.
constexpr std::chrono::milliseconds answerLimit{3000};

FoundNode nodeOf(const ControllerFirmware& firmware, std::size_t place) {
  const std::string position = place == 0 ? "bmc" : "bmc:" + std::to_string(place + 1);
  FoundNode node = firmwareNode(position, "BMC Firmware", firmware.version);
  node.setText(Oru::NodeLexicon::BuildIdProperty, firmware.auxiliary);
  node.setValue(Oru::NodeLexicon::MajorVersionProperty, firmware.major);
  if (firmware.minor) {
    node.setValue(Oru::NodeLexicon::MinorVersionProperty, *firmware.minor);
  }
  node.otherVersions = firmware.otherForms;
  return node;
}

/// The kernel's controllers, "ipmi_bmc.0" first.
std::vector<std::string> controllers(SourceContext& context) {
  std::vector<std::string> names = context.listIfAny("sys/bus/platform/devices");
  std::erase_if(names, [](const std::string& name) { return !name.starts_with("ipmi_bmc."); });
  std::stable_sort(names.begin(), names.end(), [](const std::string& left, const std::string& right) {
    return left.size() < right.size();  // they are sorted as texts: 10 stands behind 9 by its length
  });
  return names;
}

void readAttributes(SourceContext& context) {
  std::size_t place = 0;
  for (const std::string& name : controllers(context)) {
    const std::string folder = "sys/bus/platform/devices/" + name;
    const std::size_t own = place++;
    // The kernel may ask the controller for each of these again, and wait for it.
    const std::optional<std::string> revision = context.text(folder + "/firmware_revision");
    if (!revision) {
      continue;
    }
    const std::optional<std::string> auxiliary = context.textIfAny(folder + "/aux_firmware_revision");
    if (const auto firmware = parseRevisionText(*revision, auxiliary)) {
      context.result().nodes.push_back(nodeOf(*firmware, own));
      context.publish();
    } else {
      context.report(context.root().outside(folder + "/firmware_revision"), SourceReport::Reason::Unreadable,
                     "\"" + *revision + "\" is no revision of the form major.minor");
    }
  }
}

void reportFailure(SourceContext& context, const std::string& what, int error) {
  if (error == ETIMEDOUT) {
    context.report(what, SourceReport::Reason::TimedOut,
                   "the controller did not answer within " + std::to_string(answerLimit.count()) + " ms");
  } else if (error == EBADMSG) {
    context.report(what, SourceReport::Reason::Unreadable,
                   "only messages came that do not answer the question");
  } else {
    context.reportError(what, error);
  }
}

void readAnswer(SourceContext& context, const std::string& what, const std::vector<std::byte>& bytes) {
  static constexpr std::byte noAnswer{0xc3};  // the kernel's word for a controller that kept silent
  static constexpr std::string_view digits = "0123456789abcdef";
  if (bytes.empty()) {
    context.report(what, SourceReport::Reason::Unreadable, "the answer is empty");
    return;
  }
  if (const std::byte code = bytes.front(); code != std::byte{0}) {
    const auto number = std::to_integer<unsigned>(code);
    context.report(what, code == noAnswer ? SourceReport::Reason::TimedOut : SourceReport::Reason::Unreadable,
                   std::string("the controller answered with completion code 0x") + digits[number >> 4U] +
                       digits[number & 0x0fU]);
    return;
  }
  const auto firmware = parseDeviceId(std::span(bytes).subspan(1));
  if (!firmware) {
    context.report(what, SourceReport::Reason::Unreadable,
                   "only " + std::to_string(bytes.size()) + " bytes came");
    return;
  }
  context.result().nodes.push_back(nodeOf(*firmware, 0));
}

void askController(SourceContext& context, const IpmiOpener& open) {
  const std::string device = context.root().outside(ipmiDevice);
  if (!open) {
    if (!context.listIfAny("sys/class/ipmi").empty()) {
      context.report("Get Device ID on " + device, SourceReport::Reason::Absent,
                     "only the running kernel can ask, and it is not asked for another system root");
    }
    return;
  }
  context.doing(device);
  const OpenedIpmi opened = open();
  if (opened.channel == nullptr) {
    if (opened.error != ENOENT) {  // most machines have no controller
      context.reportError(device, opened.error);
    }
    return;
  }
  const std::string what = "Get Device ID on " + device;
  context.doing(what);
  const DeviceIdAnswer answer = askDeviceId(*opened.channel, answerLimit);
  if (answer.error != 0) {
    reportFailure(context, what, answer.error);
  } else {
    readAnswer(context, what, answer.bytes);
  }
}

}  // namespace

void readIpmi(SourceContext& context, const IpmiOpener& open) {
  readAttributes(context);
  if (context.result().nodes.empty()) {
    askController(context, open);
  }
}

}  // namespace agent::discovery
