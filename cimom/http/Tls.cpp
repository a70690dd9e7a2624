#include <cimom/http/Files.h>
#include <cimom/http/Tls.h>
#include <gnutls/x509.h>

#include <memory>
#include <stdexcept>
#include <type_traits>

namespace cimom::http {
namespace {

using Credentials = std::unique_ptr<std::remove_pointer_t<gnutls_certificate_credentials_t>,
                                    decltype(&gnutls_certificate_free_credentials)>;
using Certificate =
    std::unique_ptr<std::remove_pointer_t<gnutls_x509_crt_t>, decltype(&gnutls_x509_crt_deinit)>;

gnutls_datum_t datum(std::string& text) {
  return {reinterpret_cast<unsigned char*>(text.data()), static_cast<unsigned>(text.size())};
}

std::string textOf(const std::optional<File>& file, const std::string& path) {
  if (!file) {
    throw std::runtime_error(path + ": does not exist");
  }
  return file->text;
}

Credentials makeCredentials() {
  gnutls_certificate_credentials_t credentials = nullptr;
  if (gnutls_certificate_allocate_credentials(&credentials) != GNUTLS_E_SUCCESS) {
    throw std::bad_alloc();
  }
  return {credentials, gnutls_certificate_free_credentials};
}

void check(TlsFiles& files, const Settings& settings) {
  const Credentials credentials = makeCredentials();
  const gnutls_datum_t certificate = datum(files.certificate);
  const gnutls_datum_t key = datum(files.key);
  const int error =
      gnutls_certificate_set_x509_key_mem(credentials.get(), &certificate, &key, GNUTLS_X509_FMT_PEM);
  if (error < 0) {
    throw std::runtime_error("certificate " + settings.certificateFile + " and key " + settings.keyFile +
                             " cannot be used together: " + gnutls_strerror(error));
  }
  if (settings.clientCaFile.empty()) {
    return;
  }
  const gnutls_datum_t authorities = datum(files.authorities);
  const int count =
      gnutls_certificate_set_x509_trust_mem(credentials.get(), &authorities, GNUTLS_X509_FMT_PEM);
  if (count <= 0) {
    throw std::runtime_error("authorities " + settings.clientCaFile + ": there is no certificate in it" +
                             (count < 0 ? std::string(": ") + gnutls_strerror(count) : std::string()));
  }
}

std::string describe(unsigned status) {
  gnutls_datum_t text{};
  if (gnutls_certificate_verification_status_print(status, GNUTLS_CRT_X509, &text, 0) != GNUTLS_E_SUCCESS) {
    return "it cannot be verified";
  }
  std::string description(reinterpret_cast<const char*>(text.data), text.size);
  gnutls_free(text.data);
  return description;
}

std::string subjectOf(const gnutls_datum_t& der) {
  gnutls_x509_crt_t raw = nullptr;
  if (gnutls_x509_crt_init(&raw) != GNUTLS_E_SUCCESS) {
    return {};
  }
  const Certificate certificate(raw, gnutls_x509_crt_deinit);
  gnutls_datum_t name{};
  if (gnutls_x509_crt_import(raw, &der, GNUTLS_X509_FMT_DER) != GNUTLS_E_SUCCESS ||
      gnutls_x509_crt_get_dn3(raw, &name, 0) != GNUTLS_E_SUCCESS) {
    return {};
  }
  std::string subject(reinterpret_cast<const char*>(name.data), name.size);
  gnutls_free(name.data);
  return subject;
}

}  // namespace

const char* tlsPriorities() {
  return "SECURE128:-VERS-ALL:+VERS-TLS1.3:+VERS-TLS1.2:%SERVER_PRECEDENCE";
}

TlsFiles readTlsFiles(const Settings& settings) {
  TlsFiles files;
  files.certificate = textOf(readPublicFile(settings.certificateFile), settings.certificateFile);
  files.key = textOf(readSecretFile(settings.keyFile), settings.keyFile);
  if (!settings.clientCaFile.empty()) {
    files.authorities = textOf(readPublicFile(settings.clientCaFile), settings.clientCaFile);
  }
  check(files, settings);
  return files;
}

std::string clientSubject(gnutls_session_t session, std::string& why) {
  unsigned count = 0;
  const gnutls_datum_t* chain = gnutls_certificate_get_peers(session, &count);
  if (chain == nullptr || count == 0) {
    return {};
  }
  std::string purpose = GNUTLS_KP_TLS_WWW_CLIENT;
  gnutls_typed_vdata_st wanted{};
  wanted.type = GNUTLS_DT_KEY_PURPOSE_OID;
  wanted.data = reinterpret_cast<unsigned char*>(purpose.data());
  unsigned status = 0;
  const int error = gnutls_certificate_verify_peers(session, &wanted, 1, &status);
  if (error != GNUTLS_E_SUCCESS) {
    why = gnutls_strerror(error);
    return {};
  }
  if (status != 0) {
    why = describe(status);
    return {};
  }
  std::string subject = subjectOf(*chain);
  if (subject.empty()) {
    why = "it names no subject";
  }
  return subject;
}

}  // namespace cimom::http
