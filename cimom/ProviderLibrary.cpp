#include <cimom/ProviderLibrary.h>
#include <cimom/broker/Context.h>
#include <cimom/broker/Objects.h>
#include <cimom/broker/Request.h>

#include <dlfcn.h>

#include <ctime>
#include <utility>

namespace cimom {

namespace {

/// What the dynamic linker has to say. It is only asked after a failure, by the thread that failed.
std::string linkerMessage() {
  const char* message = dlerror();  // NOLINT(concurrency-mt-unsafe): glibc keeps one text for each thread
  return message == nullptr ? "no reason given" : message;
}

/// Providers read the C library's time zone, which nobody else may have set up. It is written once, before
/// any provider can be reading it.
void setTimeZone() {
  static std::once_flag once;
  std::call_once(once, tzset);
}

std::string described(const CMPIStatus& status) {
  std::string text = "status " + std::to_string(status.rc);
  const String* message = String::from(status.msg);
  if (message != nullptr)
    text += ": " + std::string(message->view());
  return text;
}

}  // namespace

ProviderLibrary::ProviderLibrary(std::filesystem::path file, std::string provider, const Broker& broker,
                                 std::function<void(std::string_view)> log)
    : file_(std::move(file)), provider_(std::move(provider)), broker_(broker), log_(std::move(log)) {}

ProviderLibrary::~ProviderLibrary() {
  if (handle_ == nullptr)
    return;
  const bool instanceLets = cleanUp(instanceMI_);
  const bool associationLets = cleanUp(associationMI_);
  if (instanceLets && associationLets)
    dlclose(handle_);
}

CMPIInstanceMI& ProviderLibrary::instanceMI() {
  return made(instanceMI_, "_Create_InstanceMI");
}

CMPIAssociationMI& ProviderLibrary::associationMI() {
  return made(associationMI_, "_Create_AssociationMI");
}

template <class MI>
MI& ProviderLibrary::made(MI*& mi, const char* factorySuffix) {
  const std::scoped_lock lock(mutex_);
  if (mi != nullptr)
    return *mi;
  load();
  using Factory = MI* (*)(const CMPIBroker*, const CMPIContext*, CMPIStatus*);
  const std::string name = provider_ + factorySuffix;
  const auto factory = reinterpret_cast<Factory>(dlsym(handle_, name.c_str()));
  if (factory == nullptr)
    throw ProviderError(file_.string() + " has no factory " + name +
                        "; does the registration name the right provider?");
  Request request;
  const RequestScope scope(&request);
  CMPIStatus status{CMPI_RC_OK, nullptr};
  MI* result = factory(broker_.handle(), Context::create(request.held()), &status);
  if (status.rc != CMPI_RC_OK)
    throw ProviderError(name + " of " + file_.string() + " failed with " + described(status));
  if (result == nullptr || result->ft == nullptr)
    throw ProviderError(name + " of " + file_.string() + " made nothing");
  mi = result;
  return *mi;
}

void ProviderLibrary::load() {
  if (handle_ != nullptr)
    return;
  setTimeZone();
  handle_ = dlopen(file_.c_str(), RTLD_NOW | RTLD_LOCAL);
  if (handle_ == nullptr)
    throw ProviderError("provider " + provider_ + " cannot be loaded: " + linkerMessage());
}

/// Whether the library may be closed.
template <class MI>
bool ProviderLibrary::cleanUp(MI* mi) {
  if (mi == nullptr || mi->ft->cleanup == nullptr)
    return true;
  Request request;
  const RequestScope scope(&request);
  constexpr CMPIBoolean terminating = 1;
  const CMPIStatus status = mi->ft->cleanup(mi, Context::create(request.held()), terminating);
  if (status.rc == CMPI_RC_DO_NOT_UNLOAD || status.rc == CMPI_RC_NEVER_UNLOAD)
    return false;
  if (status.rc != CMPI_RC_OK && log_)
    log_("cleanup of provider " + provider_ + " failed with " + described(status));
  return true;
}

}  // namespace cimom
