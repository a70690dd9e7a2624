// What a server for other machines needs: an authority, certificates, a password file.
#pragma once

#include "../cli/Process.h"
#include "tests/support/Certificates.h"

#include <filesystem>
#include <string>
#include <vector>

namespace serve_test {

/// Files in a folder of their own, gone with it. The user "ada" has the password "analytical".
class Secrets {
 public:
  Secrets();

  [[nodiscard]] std::filesystem::path file(const char* name) const { return folder_.at(name); }
  [[nodiscard]] const tests::Certificate& authority() const { return authority_; }

  /// The options of a server with TLS and passwords, at any free port.
  [[nodiscard]] std::vector<std::string> options() const;

  /// Writes a new certificate over the server's, of the same authority or of another one.
  void renewCertificate(const std::string& commonName, const tests::Certificate* authority = nullptr) const;

  /// Runs swinv passwd for the user of a server.
  static cli_test::Result setPassword(const std::filesystem::path& file, const std::string& user,
                                      const std::string& password);

 private:
  cli_test::TemporaryFolder folder_;
  tests::Certificate authority_ = tests::makeCertificate("test authority", tests::CertificateUse::authority);
};

}  // namespace serve_test
