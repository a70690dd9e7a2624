#include <agent/discovery/esrt/ResourceEntry.h>
#include <agent/framework/Case.h>

#include <algorithm>
#include <array>

namespace agent::discovery {

std::optional<std::string> parseClassId(std::string_view text) {
  static constexpr std::string_view form = "xxxxxxxx-xxxx-xxxx-xxxx-xxxxxxxxxxxx";
  if (text.size() != form.size()) {
    return std::nullopt;
  }
  std::string id(text);
  std::transform(id.begin(), id.end(), id.begin(), lower);
  for (std::size_t i = 0; i < form.size(); ++i) {
    const bool fits =
        form[i] == '-' ? id[i] == '-' : std::string_view("0123456789abcdef").find(id[i]) != std::string::npos;
    if (!fits) {
      return std::nullopt;
    }
  }
  return id.find_first_not_of("0-") == std::string::npos ? std::nullopt : std::optional(id);
}

std::optional<std::string> versionText(std::uint32_t version) {
  static constexpr std::string_view digits = "0123456789abcdef";
  if (version == 0) {
    return std::nullopt;
  }
  std::string text = "0x";
  for (int shift = 28; shift >= 0; shift -= 4) {
    text += digits[(version >> static_cast<unsigned>(shift)) & 0x0fU];
  }
  return text;
}

std::vector<std::string> versionForms(std::uint32_t version) {
  const auto part = [&](unsigned shift, unsigned bits) {
    return std::to_string((version >> shift) & ((1U << bits) - 1U));
  };
  return {std::to_string(version), part(24, 8) + "." + part(16, 8) + "." + part(8, 8) + "." + part(0, 8),
          part(16, 16) + "." + part(0, 16), part(24, 8) + "." + part(16, 8) + "." + part(0, 16)};
}

std::string attemptText(std::uint32_t status) {
  static constexpr std::array<std::string_view, 9> texts = {"success",
                                                            "failed",
                                                            "insufficient resources",
                                                            "incorrect version",
                                                            "invalid format",
                                                            "authentication failed",
                                                            "power, not on mains",
                                                            "power, battery too low",
                                                            "unsatisfied dependencies"};
  return status < texts.size() ? std::string(texts.at(status)) : "status " + std::to_string(status);
}

const char* resourceDescription(std::uint32_t type) {
  switch (type) {
    case 1:
      return "UEFI System Firmware";
    case 2:
      return "Device Firmware Resource";
    case 3:
      return "UEFI Driver";
    default:
      return "Firmware Resource";
  }
}

}  // namespace agent::discovery
