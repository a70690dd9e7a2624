// Certificates for tests, made anew each time.
#pragma once

#include <chrono>
#include <string>

namespace tests {

/// PEM texts.
struct Certificate {
  std::string certificate;
  std::string key;
};

enum class CertificateUse { authority, server, client };

/// A certificate with an elliptic key, signed by `issuer`, or by itself where that is nullptr. It is valid
/// from an hour ago; servers are called localhost, 127.0.0.1 and ::1.
[[nodiscard]] Certificate makeCertificate(const std::string& commonName, CertificateUse use,
                                          const Certificate* issuer = nullptr,
                                          std::chrono::seconds validFor = std::chrono::hours(24));

}  // namespace tests
