#include <agent/discovery/Elements.h>
#include <agent/discovery/Values.h>
#include <agent/discovery/esrt/EsrtSource.h>
#include <agent/discovery/esrt/ResourceEntry.h>

#include <algorithm>
#include <utility>

namespace agent::discovery {

namespace {

constexpr const char* entriesFolder = "sys/firmware/efi/esrt/entries";

std::optional<std::uint32_t> readNumber(SourceContext& context, const std::string& path) {
  const std::optional<std::string> text = context.text(path);
  const std::optional<std::uint32_t> number = text ? parseNumber(*text) : std::nullopt;
  if (text && !number) {
    context.report(context.root().outside(path), SourceReport::Reason::Unreadable,
                   "\"" + *text + "\" is no number of 32 bits");
  }
  return number;
}

/// How the last update went; nothing where there was none.
std::optional<std::string> readLastAttempt(SourceContext& context, const std::string& folder) {
  const std::optional<std::uint32_t> number = readNumber(context, folder + "/last_attempt_version");
  const std::optional<std::uint32_t> status = readNumber(context, folder + "/last_attempt_status");
  const std::optional<std::string> version = number ? versionText(*number) : std::nullopt;
  return version && status ? std::optional(*version + ": " + attemptText(*status)) : std::nullopt;
}

void readEntry(SourceContext& context, const std::string& folder, const std::string& classText) {
  const std::optional<std::string> classId = parseClassId(classText);
  if (!classId) {  // an unused entry
    return;
  }
  const std::optional<std::uint32_t> type = readNumber(context, folder + "/fw_type");
  const std::optional<std::uint32_t> number = readNumber(context, folder + "/fw_version");
  if (!number) {
    return;
  }
  const std::optional<std::string> version = versionText(*number);
  if (!version) {
    context.report(context.root().outside(folder + "/fw_version"), SourceReport::Reason::Absent,
                   "it says nothing: \"0\"");
    return;
  }
  FoundNode node = firmwareNode("esrt:" + *classId, resourceDescription(type.value_or(0)), *version);
  node.setText(FirmwareIdProperty, classId);
  const std::optional<std::uint32_t> lowest = readNumber(context, folder + "/lowest_supported_fw_version");
  node.setText(LowestVersionProperty, lowest ? versionText(*lowest) : std::nullopt);
  node.setText(LastAttemptProperty, readLastAttempt(context, folder));
  node.otherVersions = versionForms(*number);
  context.result().nodes.push_back(std::move(node));
}

}  // namespace

void readEsrt(SourceContext& context) {
  for (const std::string& name : context.listIfAny(entriesFolder)) {
    const std::string folder = within(entriesFolder, name);
    const std::string path = folder + "/fw_class";
    context.doing(context.root().outside(path));
    const Outcome<std::string> classText = context.root().read(path);
    if (!classText) {
      context.reportError(context.root().outside(path), classText.error);
      if (reasonOf(classText.error) == SourceReport::Reason::NoPermission) {
        return;  // one line for all entries
      }
      continue;
    }
    readEntry(context, folder, cleanText(*classText.value));
  }
}

}  // namespace agent::discovery
