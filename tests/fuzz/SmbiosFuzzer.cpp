#include <agent/discovery/BusAddress.h>
#include <agent/discovery/dmi/SmbiosEntryPoint.h>
#include <agent/discovery/dmi/SmbiosStructures.h>
#include <agent/discovery/dmi/SmbiosTable.h>

#include <span>

#include "Fuzzer.h"

namespace smbios = agent::discovery::smbios;

namespace {

void decode(const smbios::Structure& structure) {
  static_cast<void>(smbios::decodeBios(structure));
  fuzz::promise(smbios::decodeTpm(structure).vendor.size() <= 4,
                "a TPM's vendor of more than four characters");
  const smbios::Firmware firmware = smbios::decodeFirmware(structure);
  fuzz::promise(firmware.components.size() <= structure.length() / 2, "more components than have room");
  const auto address = smbios::pciAddress(structure);
  fuzz::promise(!address || agent::discovery::isPciAddress(*address), "a PCI address that is none");
}

}  // namespace

// A table is walked within its bytes, and the walk ends and says why.
void fuzz::tryOne(std::string_view input) {
  const auto bytes = std::as_bytes(std::span(input.data(), input.size()));
  smbios::TableReader reader(bytes);
  std::size_t before = 0;
  while (const auto structure = reader.next()) {
    promise(reader.offset() >= before + structure->length() + 2, "two structures share bytes");
    promise(reader.offset() <= bytes.size(), "a structure beyond the table");
    before = reader.offset();
    decode(*structure);
  }
  promise(reader.end() != smbios::TableReader::End::None, "a walk that ended without a reason");

  const auto outcome = smbios::parseEntryPoint(bytes);
  promise(outcome.entryPoint.has_value() == outcome.error.empty(),
          "an entry point that neither is one nor says why");
}
