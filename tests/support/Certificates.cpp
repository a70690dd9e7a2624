#include <arpa/inet.h>
#include <gnutls/x509.h>
#include <tests/support/Certificates.h>

#include <array>
#include <atomic>
#include <ctime>
#include <stdexcept>

namespace tests {
namespace {

void check(int error, const char* what) {
  if (error < 0) {
    throw std::runtime_error(std::string("certificate: ") + what + ": " + gnutls_strerror(error));
  }
}

class Key {
 public:
  Key() { check(gnutls_x509_privkey_init(&key_), "key"); }
  ~Key() { gnutls_x509_privkey_deinit(key_); }
  Key(const Key&) = delete;
  Key& operator=(const Key&) = delete;
  [[nodiscard]] gnutls_x509_privkey_t get() const { return key_; }

 private:
  gnutls_x509_privkey_t key_ = nullptr;
};

class Signed {
 public:
  Signed() { check(gnutls_x509_crt_init(&certificate_), "certificate"); }
  ~Signed() { gnutls_x509_crt_deinit(certificate_); }
  Signed(const Signed&) = delete;
  Signed& operator=(const Signed&) = delete;
  [[nodiscard]] gnutls_x509_crt_t get() const { return certificate_; }

 private:
  gnutls_x509_crt_t certificate_ = nullptr;
};

gnutls_datum_t datum(const std::string& text) {
  return {reinterpret_cast<unsigned char*>(const_cast<char*>(text.data())),
          static_cast<unsigned>(text.size())};
}

std::string taken(gnutls_datum_t& text) {
  std::string copy(reinterpret_cast<char*>(text.data), text.size);
  gnutls_free(text.data);
  return copy;
}

void describe(gnutls_x509_crt_t certificate, const std::string& commonName, CertificateUse use) {
  check(gnutls_x509_crt_set_dn_by_oid(certificate, GNUTLS_OID_X520_COMMON_NAME, 0, commonName.data(),
                                      static_cast<unsigned>(commonName.size())),
        "name");
  if (use == CertificateUse::authority) {
    check(gnutls_x509_crt_set_basic_constraints(certificate, 1, -1), "constraints");
    check(gnutls_x509_crt_set_key_usage(certificate, GNUTLS_KEY_KEY_CERT_SIGN), "usage");
    return;
  }
  const bool isServer = use == CertificateUse::server;
  check(gnutls_x509_crt_set_basic_constraints(certificate, 0, -1), "constraints");
  check(gnutls_x509_crt_set_key_usage(certificate, GNUTLS_KEY_DIGITAL_SIGNATURE), "usage");
  check(gnutls_x509_crt_set_key_purpose_oid(
            certificate, isServer ? GNUTLS_KP_TLS_WWW_SERVER : GNUTLS_KP_TLS_WWW_CLIENT, 0),
        "purpose");
  if (isServer) {
    const std::string host = "localhost";
    const in_addr four{htonl(INADDR_LOOPBACK)};
    check(gnutls_x509_crt_set_subject_alt_name(certificate, GNUTLS_SAN_DNSNAME, host.data(),
                                               static_cast<unsigned>(host.size()), GNUTLS_FSAN_APPEND),
          "host");
    check(gnutls_x509_crt_set_subject_alt_name(certificate, GNUTLS_SAN_IPADDRESS, &four, sizeof four,
                                               GNUTLS_FSAN_APPEND),
          "address");
    check(gnutls_x509_crt_set_subject_alt_name(certificate, GNUTLS_SAN_IPADDRESS, &in6addr_loopback,
                                               sizeof in6addr_loopback, GNUTLS_FSAN_APPEND),
          "address");
  }
}

void sign(const Signed& certificate, const Key& key, const Certificate* issuer) {
  if (issuer == nullptr) {
    check(gnutls_x509_crt_sign2(certificate.get(), certificate.get(), key.get(), GNUTLS_DIG_SHA256, 0),
          "signing");
    return;
  }
  const Signed authority;
  const Key authorityKey;
  const gnutls_datum_t certificateText = datum(issuer->certificate);
  const gnutls_datum_t keyText = datum(issuer->key);
  check(gnutls_x509_crt_import(authority.get(), &certificateText, GNUTLS_X509_FMT_PEM), "issuer");
  check(gnutls_x509_privkey_import(authorityKey.get(), &keyText, GNUTLS_X509_FMT_PEM), "issuer's key");
  check(gnutls_x509_crt_sign2(certificate.get(), authority.get(), authorityKey.get(), GNUTLS_DIG_SHA256, 0),
        "signing");
}

}  // namespace

Certificate makeCertificate(const std::string& commonName, CertificateUse use, const Certificate* issuer,
                            std::chrono::seconds validFor) {
  constexpr std::time_t anHour = 3600;
  static std::atomic<unsigned char> serial = 1;
  const Key key;
  check(gnutls_x509_privkey_generate(key.get(), GNUTLS_PK_ECDSA,
                                     GNUTLS_CURVE_TO_BITS(GNUTLS_ECC_CURVE_SECP256R1), 0),
        "new key");
  const Signed certificate;
  const std::time_t now = std::time(nullptr);
  const std::array<unsigned char, 2> number{1, serial++};
  check(gnutls_x509_crt_set_version(certificate.get(), 3), "version");
  check(gnutls_x509_crt_set_serial(certificate.get(), number.data(), number.size()), "serial");
  check(gnutls_x509_crt_set_activation_time(certificate.get(), now - anHour), "time");
  check(gnutls_x509_crt_set_expiration_time(certificate.get(), now + validFor.count()), "time");
  check(gnutls_x509_crt_set_key(certificate.get(), key.get()), "key");
  describe(certificate.get(), commonName, use);
  sign(certificate, key, issuer);

  Certificate made;
  gnutls_datum_t text{};
  check(gnutls_x509_crt_export2(certificate.get(), GNUTLS_X509_FMT_PEM, &text), "export");
  made.certificate = taken(text);
  check(gnutls_x509_privkey_export2(key.get(), GNUTLS_X509_FMT_PEM, &text), "export");
  made.key = taken(text);
  return made;
}

}  // namespace tests
