// Module information through libkmod: the .modinfo section of a module's file, or modules.builtin.modinfo.
#include <agent/discovery/drivers/ModuleDatabase.h>

#include <array>
#include <cerrno>
#include <cstdarg>
#include <string_view>
#include <utility>

#include <libkmod.h>

namespace agent::discovery {

namespace {

struct Unref {
  void operator()(kmod_ctx* context) const { kmod_unref(context); }
  void operator()(kmod_module* module) const { kmod_module_unref(module); }
};

struct FreeInfo {
  void operator()(kmod_list* list) const { kmod_module_info_free_list(list); }
};

/// libkmod writes to standard error otherwise; its errors come back as return values as well.
void dropMessage(void* /*data*/, int /*priority*/, const char* /*file*/, int /*line*/,
                 const char* /*function*/, const char* /*format*/, va_list /*arguments*/) {}

class KmodModules : public ModuleDatabase {
 public:
  explicit KmodModules(std::unique_ptr<kmod_ctx, Unref> context) : context_(std::move(context)) {}

  Answer version(const std::string& module) override {
    kmod_module* raw = nullptr;
    if (const int error = kmod_module_new_from_name(context_.get(), module.c_str(), &raw); error < 0) {
      return {-error, std::nullopt};
    }
    const std::unique_ptr<kmod_module, Unref> found(raw);
    kmod_list* entries = nullptr;
    if (const int error = kmod_module_get_info(found.get(), &entries); error < 0) {
      return {-error, std::nullopt};
    }
    const std::unique_ptr<kmod_list, FreeInfo> info(entries);
    return {0, versionIn(info.get())};
  }

 private:
  static std::optional<std::string> versionIn(const kmod_list* entries) {
    for (const kmod_list* entry = entries; entry != nullptr; entry = kmod_list_next(entries, entry)) {
      const char* key = kmod_module_info_get_key(entry);
      const char* value = kmod_module_info_get_value(entry);
      if (key != nullptr && value != nullptr && std::string_view(key) == "version") {
        return value;
      }
    }
    return std::nullopt;
  }

  std::unique_ptr<kmod_ctx, Unref> context_;
};

}  // namespace

std::shared_ptr<ModuleDatabase> makeModuleDatabase(const std::filesystem::path& folder) {
  std::array<const char*, 1> noConfiguration = {nullptr};
  std::unique_ptr<kmod_ctx, Unref> context(kmod_new(folder.c_str(), noConfiguration.data()));
  if (context == nullptr) {
    return nullptr;
  }
  kmod_set_log_fn(context.get(), dropMessage, nullptr);
  return std::make_shared<KmodModules>(std::move(context));
}

}  // namespace agent::discovery
