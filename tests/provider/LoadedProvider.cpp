#include <dlfcn.h>

#include <cstdlib>
#include <iostream>

#include "ProviderAccess.h"

namespace {

void* symbol(void* library, const char* name) {
  void* found = library != nullptr ? dlsym(library, name) : nullptr;
  if (found == nullptr) {
    std::cerr << "cannot use the provider library: " << dlerror() << '\n';
    std::exit(1);
  }
  return found;
}

template <typename Function>
void find(void* library, const char* name, Function& function) {
  function = reinterpret_cast<Function>(symbol(library, name));
}

ProviderAccess load() {
  ProviderAccess access;
  // Its framework, liboru.so, is in this process already: the stand-in that this test is linked to.
  void* provider = dlopen(PROVIDER_LIBRARY, RTLD_NOW | RTLD_LOCAL);
  find(provider, "SoftwareInventoryProvider_Create_InstanceMI", access.createInstanceMI);
  find(provider, "SoftwareInventoryProvider_Create_AssociationMI", access.createAssociationMI);
  access.world = &standin::world();
  return access;
}

}  // namespace

const ProviderAccess& providerAccess() {
  static const ProviderAccess access = load();
  return access;
}
