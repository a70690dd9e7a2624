#include <agent/discovery/engine/EngineVersions.h>
#include <agent/discovery/esrt/ResourceEntry.h>
#include <agent/discovery/ipmi/DeviceId.h>
#include <agent/discovery/processor/Microcode.h>
#include <agent/discovery/storage/AtaPage.h>
#include <agent/discovery/storage/ScsiPlace.h>
#include <agent/discovery/tpm/TpmCapabilities.h>

#include <span>
#include <string>

#include "Fuzzer.h"

namespace discovery = agent::discovery;

namespace {

void saysSomething(const std::optional<std::string>& text) {
  fuzz::promise(!text || !text->empty(), "a value that says nothing");
}

}  // namespace

// What devices and the kernel say of them, each parser on the same bytes. A value is absent or says
// something.
void fuzz::tryOne(std::string_view input) {
  if (const auto firmware = discovery::parseDeviceId(std::as_bytes(std::span(input.data(), input.size())))) {
    promise(!firmware->version.empty(), "a controller without a version");
    saysSomething(firmware->auxiliary);
  }
  const std::size_t line = input.find('\n');
  const auto auxiliary =
      line == std::string_view::npos ? std::nullopt : std::optional<std::string>(input.substr(line + 1));
  if (const auto firmware = discovery::parseRevisionText(input.substr(0, line), auxiliary)) {
    promise(!firmware->version.empty(), "a controller without a version");
  }
  if (const auto identity = discovery::parseAtaPage(input)) {
    saysSomething(identity->firmware);
    saysSomething(identity->model);
  }
  static_cast<void>(discovery::parseScsiAddress(input));
  static_cast<void>(discovery::hostIn(std::string(input)));
  for (const auto& each : discovery::parseProcessorTable(input).distinct) {
    promise(!each.revision.empty(), "microcode without a revision");
    static_cast<void>(discovery::isMadeUpRevision(each.revision));
  }
  const discovery::TpmCapabilities tpm = discovery::parseTpmCapabilities(input);
  saysSomething(tpm.maker);
  saysSomething(tpm.version);
  saysSomething(discovery::parseClassId(input));
  for (const auto& each : discovery::parseEngineVersions(input)) {
    promise(!each.text.empty(), "a management engine without a version");
  }
}
