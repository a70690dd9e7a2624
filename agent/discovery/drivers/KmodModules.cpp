// Module information through libkmod: the .modinfo section of a module's file, or modules.builtin.modinfo.
#include <agent/discovery/drivers/ModuleDatabase.h>

#include <array>
#include <cerrno>
#include <cstdarg>
#include <string_view>
#include <utility>

#include <dlfcn.h>
#include <libkmod.h>

namespace agent::discovery {

namespace {

/// The functions of libkmod, which brings decompressors and a crypto library along and is seldom asked: it is
/// loaded when the first database is opened, and stays. Null where it is not installed.
struct Kmod {
  decltype(&kmod_new) open;
  decltype(&kmod_unref) close;
  decltype(&kmod_set_log_fn) setLog;
  decltype(&kmod_load_resources) loadResources;
  decltype(&kmod_module_new_from_name) find;
  decltype(&kmod_module_unref) forget;
  decltype(&kmod_module_get_info) info;
  decltype(&kmod_module_info_free_list) freeInfo;
  decltype(&kmod_list_next) next;
  decltype(&kmod_module_info_get_key) key;
  decltype(&kmod_module_info_get_value) value;

  static const Kmod* loaded();
};

template <class Function>
bool bind(void* library, const char* name, Function& function) {
  function = reinterpret_cast<Function>(dlsym(library, name));
  return function != nullptr;
}

const Kmod* load() {
  void* const library = dlopen("libkmod.so.2", RTLD_NOW | RTLD_LOCAL);
  if (library == nullptr) {
    return nullptr;
  }
  static Kmod kmod{};
  const bool whole =
      bind(library, "kmod_new", kmod.open) && bind(library, "kmod_unref", kmod.close) &&
      bind(library, "kmod_set_log_fn", kmod.setLog) &&
      bind(library, "kmod_load_resources", kmod.loadResources) &&
      bind(library, "kmod_module_new_from_name", kmod.find) &&
      bind(library, "kmod_module_unref", kmod.forget) && bind(library, "kmod_module_get_info", kmod.info) &&
      bind(library, "kmod_module_info_free_list", kmod.freeInfo) &&
      bind(library, "kmod_list_next", kmod.next) && bind(library, "kmod_module_info_get_key", kmod.key) &&
      bind(library, "kmod_module_info_get_value", kmod.value);
  return whole ? &kmod : nullptr;
}

const Kmod* Kmod::loaded() {
  static const Kmod* const kmod = load();
  return kmod;
}

struct Unref {
  void operator()(kmod_ctx* context) const { Kmod::loaded()->close(context); }
  void operator()(kmod_module* module) const { Kmod::loaded()->forget(module); }
};

struct FreeInfo {
  void operator()(kmod_list* list) const { Kmod::loaded()->freeInfo(list); }
};

/// libkmod writes to standard error otherwise; its errors come back as return values as well.
void dropMessage(void* /*data*/, int /*priority*/, const char* /*file*/, int /*line*/,
                 const char* /*function*/, const char* /*format*/, va_list /*arguments*/) {}

class KmodModules : public ModuleDatabase {
 public:
  KmodModules(const Kmod& kmod, std::unique_ptr<kmod_ctx, Unref> context)
      : kmod_(kmod), context_(std::move(context)) {}

  Answer version(const std::string& module) override {
    kmod_module* raw = nullptr;
    if (const int error = kmod_.find(context_.get(), module.c_str(), &raw); error < 0) {
      return {-error, std::nullopt};
    }
    const std::unique_ptr<kmod_module, Unref> found(raw);
    kmod_list* entries = nullptr;
    if (const int error = kmod_.info(found.get(), &entries); error < 0) {
      return {-error, std::nullopt};
    }
    const std::unique_ptr<kmod_list, FreeInfo> info(entries);
    return {0, versionIn(info.get())};
  }

 private:
  [[nodiscard]] std::optional<std::string> versionIn(const kmod_list* entries) const {
    for (const kmod_list* entry = entries; entry != nullptr; entry = kmod_.next(entries, entry)) {
      const char* key = kmod_.key(entry);
      const char* value = kmod_.value(entry);
      if (key != nullptr && value != nullptr && std::string_view(key) == "version") {
        return value;
      }
    }
    return std::nullopt;
  }

  const Kmod& kmod_;
  std::unique_ptr<kmod_ctx, Unref> context_;
};

}  // namespace

std::shared_ptr<ModuleDatabase> makeModuleDatabase(const std::filesystem::path& folder) {
  const Kmod* const kmod = Kmod::loaded();
  if (kmod == nullptr) {
    return nullptr;
  }
  std::array<const char*, 1> noConfiguration = {nullptr};
  std::unique_ptr<kmod_ctx, Unref> context(kmod->open(folder.c_str(), noConfiguration.data()));
  if (context == nullptr) {
    return nullptr;
  }
  kmod->setLog(context.get(), dropMessage, nullptr);
  // The indexes stay open: each look-up would open and read them anew otherwise. What fails here fails again,
  // and is told, where a module is asked for.
  kmod->loadResources(context.get());
  return std::make_shared<KmodModules>(*kmod, std::move(context));
}

}  // namespace agent::discovery
