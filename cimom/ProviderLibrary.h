// One provider: a library loaded through dlopen, and the MIs that its factories make.
#pragma once

#include <cimom/broker/Broker.h>
#include <cmpi/cmpidt.h>
#include <cmpi/cmpift.h>

#include <filesystem>
#include <functional>
#include <mutex>
#include <stdexcept>
#include <string>
#include <string_view>

namespace cimom {

/// Why a provider cannot be had: which file or symbol, and what the system or the factory said.
class ProviderError : public std::runtime_error {
  using std::runtime_error::runtime_error;
};

/// Loads at the first request, with every symbol bound and none shared, and stays loaded until it is
/// destroyed: then the MIs' cleanup is called and the library closed, unless a cleanup forbids that. A failed
/// load is tried anew by the next request. Threads: several may ask at once.
class ProviderLibrary {
 public:
  /// `provider` is the prefix of the factories' names. The broker must outlive the library, and so must
  /// whatever `log` refers to.
  ProviderLibrary(std::filesystem::path file, std::string provider, const Broker& broker,
                  std::function<void(std::string_view)> log);
  ~ProviderLibrary();
  ProviderLibrary(const ProviderLibrary&) = delete;
  ProviderLibrary& operator=(const ProviderLibrary&) = delete;

  [[nodiscard]] const std::string& provider() const { return provider_; }

  /// Loads the library and calls the factory if that was not done yet. Throws `ProviderError`.
  CMPIInstanceMI& instanceMI();
  CMPIAssociationMI& associationMI();

 private:
  template <class MI>
  MI& made(MI*& mi, const char* factorySuffix);
  void load();
  template <class MI>
  bool cleanUp(MI* mi);

  std::filesystem::path file_;
  std::string provider_;
  const Broker& broker_;
  std::function<void(std::string_view)> log_;
  std::mutex mutex_;
  void* handle_ = nullptr;
  CMPIInstanceMI* instanceMI_ = nullptr;
  CMPIAssociationMI* associationMI_ = nullptr;
};

}  // namespace cimom
