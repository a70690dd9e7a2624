#include <agent/discovery/dmi/DmiSource.h>
#include <agent/discovery/dmi/DmiValues.h>

#include <Oru/NodeLexicon.h>

#include <utility>

namespace agent::discovery {

namespace {

constexpr const char* idFolder = "sys/class/dmi/id";

void readDate(SourceContext& context, FoundNode& bios) {
  const std::string path = std::string(idFolder) + "/bios_date";
  const std::optional<std::string> text = context.text(path);
  if (!text) {
    return;
  }
  const std::optional<std::string> date = parseBiosDate(*text);
  if (!date) {
    context.report(context.root().outside(path), SourceReport::Reason::Unreadable,
                   "\"" + *text + "\" is no date of the form month/day/year");
  }
  bios.setText(Oru::NodeLexicon::ReleaseDateProperty, date);
}

void readRelease(SourceContext& context, FoundNode& bios) {
  const std::string path = std::string(idFolder) + "/bios_release";
  const std::optional<std::string> text = context.text(path);
  if (!text) {
    return;
  }
  const std::optional<BiosRelease> release = parseBiosRelease(*text);
  if (!release) {
    context.report(context.root().outside(path), SourceReport::Reason::Unreadable,
                   "\"" + *text + "\" is no release of the form major.minor");
  } else if (release->isAbsent()) {
    context.report(context.root().outside(path), SourceReport::Reason::Absent,
                   "it says nothing: \"" + *text + "\"");
  } else {
    bios.setValue(Oru::NodeLexicon::MajorVersionProperty, release->major);
    bios.setValue(Oru::NodeLexicon::MinorVersionProperty, release->minor);
  }
}

}  // namespace

void readDmi(SourceContext& context) {
  const std::string folder = idFolder;
  context.doing(context.root().outside(folder));
  if (const Outcome<std::string> found = context.root().resolve(folder); !found) {
    context.reportError(context.root().outside(folder), found.error);
    return;
  }
  FoundNode bios{Oru::NodeLexicon::FirmwareNode, "bios", "BIOS", {}, {}, {}};
  bios.setText(Oru::NodeLexicon::ManufacturerProperty, context.text(folder + "/bios_vendor"));
  bios.setText(Oru::NodeLexicon::VersionStringProperty, context.text(folder + "/bios_version"));
  readDate(context, bios);
  readRelease(context, bios);
  if (!bios.texts.empty() || !bios.numbers.empty()) {
    context.result().nodes.push_back(std::move(bios));
  }
}

}  // namespace agent::discovery
