#include <agent/discovery/dmi/SmbiosEntryPoint.h>

#include <string_view>

namespace agent::discovery::smbios {

namespace {

constexpr std::size_t oldLength = 0x0f;

bool hasAnchor(Bytes bytes, std::string_view anchor) {
  return bytes.size() >= anchor.size() &&
         std::string_view(reinterpret_cast<const char*>(bytes.data()), anchor.size()) == anchor;
}

/// The first `length` bytes where there are so many and they add up to 0; else says in `error` what is wrong.
std::optional<Bytes> checked(Bytes bytes, std::size_t length, const char* what, std::string& error) {
  if (bytes.size() < length) {
    error = std::string(what) + " has " + std::to_string(bytes.size()) + " bytes, expected " +
            std::to_string(length);
    return std::nullopt;
  }
  unsigned int sum = 0;
  for (const std::byte byte : bytes.first(length)) {
    sum += std::to_integer<unsigned int>(byte);
  }
  if ((sum & 0xffU) != 0) {
    error =
        std::string("the bytes of ") + what + " add up to " + std::to_string(sum & 0xffU) + ", expected 0";
    return std::nullopt;
  }
  return bytes.first(length);
}

/// What "_DMI_" begins: the whole of an old entry point, the second half of a 32-bit one.
EntryPoint oldPart(Bytes bytes) {
  EntryPoint entryPoint;
  const unsigned int revision = numberAt<std::uint8_t>(bytes, 0x0e).value_or(0U);
  entryPoint.major = revision / 16;
  entryPoint.minor = revision % 16;
  entryPoint.tableLength = numberAt<std::uint16_t>(bytes, 0x06).value_or(0U);
  entryPoint.structures = numberAt<std::uint16_t>(bytes, 0x0c);
  if (entryPoint.structures == 0) {
    entryPoint.structures.reset();
  }
  return entryPoint;
}

EntryPointOutcome parseOld(Bytes bytes) {
  EntryPointOutcome outcome;
  if (const auto whole = checked(bytes, oldLength, "the entry point", outcome.error)) {
    outcome.entryPoint = oldPart(*whole);
  }
  return outcome;
}

EntryPointOutcome parse32(Bytes bytes) {
  static constexpr std::size_t length = 0x1f;
  static constexpr std::size_t mistakenLength = 0x1e;  // what the text of version 2.1 gave it
  static constexpr std::size_t oldOffset = 0x10;
  EntryPointOutcome outcome;
  const std::size_t told = numberAt<std::uint8_t>(bytes, 0x05).value_or(0);
  if (told != length && told != mistakenLength) {
    outcome.error = "the 32-bit entry point gives its length as " + std::to_string(told) + ", expected " +
                    std::to_string(length);
    return outcome;
  }
  const auto whole = checked(bytes, told, "the 32-bit entry point", outcome.error);
  if (!whole) {
    return outcome;
  }
  if (!hasAnchor(whole->subspan(oldOffset), "_DMI_")) {
    outcome.error = "no \"_DMI_\" in the 32-bit entry point";
    return outcome;
  }
  outcome.entryPoint = oldPart(whole->subspan(oldOffset));
  outcome.entryPoint->major = numberAt<std::uint8_t>(*whole, 0x06).value_or(0U);
  outcome.entryPoint->minor = numberAt<std::uint8_t>(*whole, 0x07).value_or(0U);
  return outcome;
}

EntryPointOutcome parse64(Bytes bytes) {
  static constexpr std::size_t leastLength = 0x18;
  EntryPointOutcome outcome;
  const std::size_t told = numberAt<std::uint8_t>(bytes, 0x06).value_or(0);
  if (told < leastLength) {
    outcome.error = "the 64-bit entry point gives its length as " + std::to_string(told) + ", expected " +
                    std::to_string(leastLength) + " or more";
    return outcome;
  }
  if (const auto whole = checked(bytes, told, "the 64-bit entry point", outcome.error)) {
    outcome.entryPoint = EntryPoint{numberAt<std::uint8_t>(*whole, 0x07).value_or(0U),
                                    numberAt<std::uint8_t>(*whole, 0x08).value_or(0U),
                                    numberAt<std::uint32_t>(*whole, 0x0c).value_or(0U), std::nullopt};
  }
  return outcome;
}

}  // namespace

EntryPointOutcome parseEntryPoint(Bytes bytes) {
  if (hasAnchor(bytes, "_SM3_")) {
    return parse64(bytes);
  }
  if (hasAnchor(bytes, "_SM_")) {
    return parse32(bytes);
  }
  if (hasAnchor(bytes, "_DMI_")) {
    return parseOld(bytes);
  }
  return {std::nullopt, R"(it begins with none of "_SM3_", "_SM_" and "_DMI_")"};
}

}  // namespace agent::discovery::smbios
