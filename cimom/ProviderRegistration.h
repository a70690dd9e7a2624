// Which library serves which class: registration files in the INI form that small-footprint brokers read.
//
//   [KELVO_SoftwareIdentity]
//      provider: SoftwareInventoryProvider
//      location: SoftwareInventoryProvider
//      type: instance
//      namespace: root/cimv2
//
// One section for each class. A comment line starts with `#` or `;`. Types are any of `instance` and
// `association`, divided by blanks; namespaces likewise.
//
//      keeps: nothing
//
// This entry, which is this object manager's own, says that the provider uses nothing again that it has
// returned: neither the object nor whatever else it had made through the broker by then, copies that getters
// gave it included. That memory is taken back at each return, so that it does not grow with the answer. What
// the provider was called with and what its own requests to other providers were answered with stays until
// the call ends. Without the entry everything does.
#pragma once

#include <filesystem>
#include <stdexcept>
#include <string>
#include <string_view>
#include <vector>

namespace cimom {

struct ProviderRegistration {
  std::string className;
  std::string provider;                 ///< prefix of the factories: PROVIDER_Create_InstanceMI
  std::string location;                 ///< the library: libLOCATION.so; from a program, also a path
  bool instance = false;                ///< serves the instance operations
  bool association = false;             ///< serves the association operations
  std::vector<std::string> nameSpaces;  ///< at least one, without a leading slash
  std::string where;                    ///< file and line of the section, for messages
  bool keepsNothing = false;            ///< uses nothing again that it has returned

  friend bool operator==(const ProviderRegistration&, const ProviderRegistration&) = default;
};

/// What is wrong with a registration file: "swinv.reg:7: unknown type 'method'; known are instance,
/// association".
class RegistrationError : public std::runtime_error {
  using std::runtime_error::runtime_error;
};

/// Parses the text of a registration file; `fileName` is for messages and may be any text. Throws
/// `RegistrationError` for a line that is none of the form's, a section that lacks an entry or has it twice,
/// and a class that has two sections.
[[nodiscard]] std::vector<ProviderRegistration> parseRegistrations(std::string_view text,
                                                                   std::string_view fileName);

/// Reads and parses a registration file. Throws `RegistrationError`, also where the file cannot be read or is
/// larger than a registration can sensibly be (1 MiB).
[[nodiscard]] std::vector<ProviderRegistration> readRegistrations(const std::filesystem::path& file);

}  // namespace cimom
