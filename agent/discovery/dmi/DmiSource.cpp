#include <agent/discovery/dmi/DmiSource.h>
#include <agent/discovery/dmi/DmiTables.h>
#include <agent/discovery/dmi/DmiValues.h>

#include <Oru/NodeLexicon.h>

#include <utility>

namespace agent::discovery {

namespace {

constexpr const char* idFolder = "sys/class/dmi/id";

void readDate(SourceContext& context, FoundNode& bios) {
  const std::string path = within(idFolder, "bios_date");
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

/// The numbers of an attribute's text; nothing where there is none, or none that says anything.
std::optional<ReleaseNumbers> readRelease(SourceContext& context, const std::string& path,
                                          const std::optional<std::string>& text) {
  if (!text) {
    return std::nullopt;
  }
  std::optional<ReleaseNumbers> release = parseBiosRelease(*text);
  if (!release) {
    context.report(context.root().outside(path), SourceReport::Reason::Unreadable,
                   "\"" + *text + "\" is no release of the form major.minor");
  } else if (release->isAbsent()) {
    context.report(context.root().outside(path), SourceReport::Reason::Absent,
                   "it says nothing: \"" + *text + "\"");
    release.reset();
  }
  return release;
}

/// What the kernel took from the table, for everybody to read.
void readAttributes(SourceContext& context) {
  FoundNode bios = systemFirmware();
  bios.setText(Oru::NodeLexicon::ManufacturerProperty, context.text(within(idFolder, "bios_vendor")));
  bios.setText(Oru::NodeLexicon::VersionStringProperty, context.text(within(idFolder, "bios_version")));
  readDate(context, bios);
  const std::string release = within(idFolder, "bios_release");
  if (const auto numbers = readRelease(context, release, context.text(release))) {
    bios.setValue(Oru::NodeLexicon::MajorVersionProperty, numbers->major);
    bios.setValue(Oru::NodeLexicon::MinorVersionProperty, numbers->minor);
  }
  if (!bios.texts.empty() || !bios.numbers.empty()) {
    context.result().nodes.push_back(std::move(bios));
  }
  // Most machines have no embedded controller, and the kernel then has no such attribute.
  const std::string controller = within(idFolder, "ec_firmware_release");
  if (const auto numbers = readRelease(context, controller, context.textIfAny(controller))) {
    context.result().nodes.push_back(embeddedController(numbers->major, numbers->minor));
  }
}

}  // namespace

void readDmi(SourceContext& context) {
  const TableOutcome tables = readTables(context);
  if (tables == TableOutcome::SystemFirmware) {
    return;
  }
  context.doing(context.root().outside(idFolder));
  if (const Outcome<std::string> found = context.root().resolve(idFolder); !found) {
    context.reportError(context.root().outside(idFolder), found.error);
    return;
  }
  if (tables == TableOutcome::Absent) {
    context.report(context.root().outside(tablesFolder), SourceReport::Reason::Absent,
                   "no table to read: the TPM's firmware and declared firmware stay unknown");
  }
  readAttributes(context);
}

}  // namespace agent::discovery
