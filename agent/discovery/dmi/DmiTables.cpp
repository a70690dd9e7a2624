#include <agent/discovery/Elements.h>
#include <agent/discovery/Values.h>
#include <agent/discovery/dmi/DeclaredFirmware.h>
#include <agent/discovery/dmi/DmiTables.h>
#include <agent/discovery/dmi/DmiValues.h>
#include <agent/discovery/dmi/SmbiosEntryPoint.h>
#include <agent/discovery/dmi/SmbiosStructures.h>

#include <Oru/NodeLexicon.h>

#include <algorithm>
#include <string_view>
#include <utility>
#include <vector>

namespace agent::discovery {

namespace {

using smbios::Structure;
using smbios::TableReader;
using Reason = SourceReport::Reason;

smbios::Bytes bytesOf(const std::string& content) {
  return std::as_bytes(std::span(content.data(), content.size()));
}

std::string hexadecimal(std::uint16_t number) {
  static constexpr std::string_view digits = "0123456789abcdef";
  std::string text = "0x";
  for (int shift = 12; shift >= 0; shift -= 4) {
    text += digits[(number >> static_cast<unsigned int>(shift)) & 0xfU];
  }
  return text;
}

/// One walk over the tables, and what it found.
class Tables {
 public:
  explicit Tables(SourceContext& context)
      : context_(context), tablePath_(context.root().outside(within(tablesFolder, "DMI"))) {}

  TableOutcome read();

 private:
  smbios::EntryPoint readEntryPoint();
  void walk(smbios::Bytes table, const smbios::EntryPoint& entryPoint);
  void reportEnd(const TableReader& reader, std::size_t size, std::size_t expectedSize);
  /// The first structure of a type, or null.
  [[nodiscard]] const Structure* firstOf(smbios::Type type) const;
  void useBios(const Structure& structure);
  void useTpm(const Structure& structure);
  void useDeclared();

  [[nodiscard]] std::string placeOf(const Structure& structure) const {
    return tablePath_ + ": structure " + hexadecimal(structure.handle()) + " of type " +
           std::to_string(structure.type());
  }
  /// The value of a field of the system firmware; reported where it says nothing.
  std::optional<std::string> field(const std::string& place, const char* name,
                                   const std::optional<std::string_view>& text);

  SourceContext& context_;
  std::string tablePath_;
  std::vector<Structure> structures_;
};

/// Without lengths where it cannot be read: the table then says itself where it ends.
smbios::EntryPoint Tables::readEntryPoint() {
  const std::string path = within(tablesFolder, "smbios_entry_point");
  const std::string outside = context_.root().outside(path);
  context_.doing(outside);
  const Outcome<std::string> content = context_.root().read(path);
  if (!content) {
    context_.reportError(outside, content.error);
    return {};
  }
  const smbios::EntryPointOutcome outcome = smbios::parseEntryPoint(bytesOf(*content.value));
  if (!outcome.entryPoint) {
    context_.report(outside, Reason::Unreadable,
                    outcome.error + "; the table is read without knowing its length");
  }
  return outcome.entryPoint.value_or(smbios::EntryPoint{});
}

void Tables::reportEnd(const TableReader& reader, std::size_t size, std::size_t expectedSize) {
  std::string what;
  switch (reader.end()) {
    case TableReader::End::None:
      return;
    case TableReader::End::Marker:
    case TableReader::End::Counted:
      if (reader.offset() == size) {
        return;
      }
      what = "what follows its end is left out";
      break;
    case TableReader::End::NoMarker:
      what = "it has no end marker";
      break;
    case TableReader::End::CutShort:
      what = "it ends within a structure";
      break;
    case TableReader::End::NotAStructure:
      what = "it has no end marker, and what follows is no structure";
      break;
  }
  what += ": " + std::to_string(reader.count()) + " structures are read, up to byte " +
          std::to_string(reader.offset()) + " of " + std::to_string(size);
  if (size < expectedSize) {
    what += ", where the entry point tells of " + std::to_string(expectedSize);
  }
  context_.report(tablePath_, Reason::Unreadable, what);
}

void Tables::walk(smbios::Bytes table, const smbios::EntryPoint& entryPoint) {
  TableReader reader =
      entryPoint.structures ? TableReader(table, *entryPoint.structures) : TableReader(table);
  while (const std::optional<Structure> structure = reader.next()) {
    structures_.push_back(*structure);
  }
  reportEnd(reader, table.size(), entryPoint.tableLength);
}

std::optional<std::string> Tables::field(const std::string& place, const char* name,
                                         const std::optional<std::string_view>& text) {
  std::optional<std::string> meant = text ? meaningful(*text) : std::nullopt;
  if (!meant) {
    context_.report(place + ", " + name, Reason::Absent,
                    text ? "it says nothing: \"" + cleanText(*text) + "\"" : "it is not set");
  }
  return meant;
}

void Tables::useBios(const Structure& structure) {
  const std::string place = placeOf(structure);
  const smbios::Bios bios = smbios::decodeBios(structure);
  FoundNode node = systemFirmware();
  node.setText(Oru::NodeLexicon::ManufacturerProperty, field(place, "vendor", bios.vendor));
  node.setText(Oru::NodeLexicon::VersionStringProperty, field(place, "version", bios.version));
  if (const auto text = field(place, "release date", bios.date)) {
    const std::optional<std::string> date = parseBiosDate(*text);
    if (!date) {
      context_.report(place + ", release date", Reason::Unreadable,
                      "\"" + *text + "\" is no date of the form month/day/year");
    }
    node.setText(Oru::NodeLexicon::ReleaseDateProperty, date);
  }
  if (bios.release) {
    node.setValue(Oru::NodeLexicon::MajorVersionProperty, bios.release->major);
    node.setValue(Oru::NodeLexicon::MinorVersionProperty, bios.release->minor);
  }
  if (!node.texts.empty() || !node.numbers.empty()) {
    context_.result().nodes.push_back(std::move(node));
  }
  if (bios.controllerRelease) {
    context_.result().nodes.push_back(
        embeddedController(bios.controllerRelease->major, bios.controllerRelease->minor));
  }
}

void Tables::useTpm(const Structure& structure) {
  const smbios::Tpm tpm = smbios::decodeTpm(structure);
  if (!tpm.release) {
    context_.report(placeOf(structure), Reason::Absent, "it tells no firmware version of the TPM");
    return;
  }
  const Label label{std::nullopt, meaningful(tpm.vendor)};
  FoundNode firmware = firmwareNode(std::string(tpmPosition) + "/firmware", tpmFirmware, tpm.version, label);
  firmware.setValue(Oru::NodeLexicon::MajorVersionProperty, tpm.release->major);
  firmware.setValue(Oru::NodeLexicon::MinorVersionProperty, tpm.release->minor);
  firmware.otherVersions = tpm.otherVersions;
  context_.result().declared.push_back(
      {structure.type(), std::move(firmware), tpmFirmware,
       deviceNode(tpmPosition, "TPM",
                  {tpm.description ? meaningful(*tpm.description) : std::nullopt, label.maker})});
}

void Tables::useDeclared() {
  StructuresByHandle byHandle;
  for (const Structure& structure : structures_) {
    byHandle.emplace(structure.handle(), structure);
  }
  std::size_t count = 0;
  for (const Structure& structure : structures_) {
    if (structure.type() != smbios::FirmwareType || ++count > declaredLimit) {
      continue;
    }
    if (auto declared = declaredFirmware(context_, placeOf(structure), structure, byHandle)) {
      context_.result().declared.push_back(std::move(*declared));
    }
  }
  if (count > declaredLimit) {
    context_.report(tablePath_, Reason::Unreadable,
                    std::to_string(count) + " structures of type 45, expected " +
                        std::to_string(declaredLimit) + " at most: the others are left out");
  }
}

const Structure* Tables::firstOf(smbios::Type type) const {
  const auto found = std::find_if(structures_.begin(), structures_.end(),
                                  [type](const Structure& structure) { return structure.type() == type; });
  return found == structures_.end() ? nullptr : &*found;
}

TableOutcome Tables::read() {
  context_.doing(tablePath_);
  const Outcome<std::string> content = context_.root().read(within(tablesFolder, "DMI"), tableLimit);
  if (!content) {
    const Reason reason = reasonOf(content.error);
    if (reason == Reason::Absent) {
      return TableOutcome::Absent;
    }
    context_.report(tablePath_, reason,
                    errorText(content.error) +
                        (reason == Reason::NoPermission ? "; root reads here " : "; missing are ") +
                        "the TPM's firmware and what else the machine declares");
    return TableOutcome::NotRead;
  }
  walk(bytesOf(*content.value), readEntryPoint());
  const Structure* const bios = firstOf(smbios::BiosType);
  if (bios != nullptr) {
    useBios(*bios);
  } else {
    context_.report(tablePath_, Reason::Absent, "no structure of type 0 tells of the system firmware");
  }
  if (const Structure* const tpm = firstOf(smbios::TpmType)) {
    useTpm(*tpm);
  }
  useDeclared();
  return bios == nullptr ? TableOutcome::NotRead : TableOutcome::SystemFirmware;
}

}  // namespace

TableOutcome readTables(SourceContext& context) {
  return Tables(context).read();
}

FoundNode systemFirmware() {
  return {Oru::NodeLexicon::FirmwareNode, "bios", "BIOS", {}, {}, {}};
}

FoundNode embeddedController(unsigned int major, unsigned int minor) {
  FoundNode device = deviceNode("ec", "Embedded Controller");
  FoundNode firmware = firmwareNode("ec/firmware", "Embedded Controller Firmware",
                                    std::to_string(major) + "." + std::to_string(minor));
  firmware.setValue(Oru::NodeLexicon::MajorVersionProperty, major);
  firmware.setValue(Oru::NodeLexicon::MinorVersionProperty, minor);
  device.children.push_back(std::move(firmware));
  return device;
}

}  // namespace agent::discovery
