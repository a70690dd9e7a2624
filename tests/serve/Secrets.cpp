#include "Secrets.h"

#include <fstream>
#include <stdexcept>

namespace serve_test {
namespace {

void write(const std::filesystem::path& file, const std::string& text) {
  std::ofstream(file) << text;
  std::filesystem::permissions(file,
                               std::filesystem::perms::owner_read | std::filesystem::perms::owner_write);
}

}  // namespace

Secrets::Secrets() {
  write(file("ca.pem"), authority_.certificate);
  renewCertificate("localhost");
  const cli_test::Result result = setPassword(file("passwords"), "ada", "analytical");
  if (result.exitCode != 0) {
    throw std::runtime_error(result.standardError);
  }
}

std::vector<std::string> Secrets::options() const {
  return {"--listen",          "127.0.0.1:0",
          "--tls-certificate", file("cert.pem").string(),
          "--tls-key",         file("key.pem").string(),
          "--passwords",       file("passwords").string()};
}

void Secrets::renewCertificate(const std::string& commonName, const tests::Certificate* authority) const {
  const tests::Certificate certificate = tests::makeCertificate(
      commonName, tests::CertificateUse::server, authority == nullptr ? &authority_ : authority);
  write(file("cert.pem"), certificate.certificate);
  write(file("key.pem"), certificate.key);
}

cli_test::Result Secrets::setPassword(const std::filesystem::path& file, const std::string& user,
                                      const std::string& password) {
  return cli_test::run(
      {{"-c", R"(printf '%s\n' "$3" | "$0" passwd "$1" "$2")", SWINV_PROGRAM, file.string(), user, password},
       {},
       "/bin/sh"});
}

}  // namespace serve_test
