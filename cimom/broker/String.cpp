#include <cimom/broker/Objects.h>
#include <cimom/broker/Tables.h>

#include <cstring>
#include <new>

namespace cimom {

String::String(Arena* arena, std::size_t size) : CMPIString{this, &stringTable}, arena_(arena), size_(size) {}

String* String::place(Arena& arena, std::string_view text, Arena* owner) {
  auto* const memory = static_cast<char*>(arena.allocate(sizeof(String) + text.size() + 1));
  auto* const string = ::new (memory) String(owner, text.size());
  char* const chars = memory + sizeof(String);
  if (!text.empty()) {
    std::memcpy(chars, text.data(), text.size());
  }
  chars[text.size()] = '\0';
  return string;
}

String* String::create(Arena& arena, std::string_view text) {
  return place(arena, text, &arena);
}

String* String::createShared(Arena& arena, std::string_view text) {
  return place(arena, text, nullptr);
}

String* String::from(const CMPIString* handle) {
  return objectBehind<String>(handle, stringTable);
}

String* String::in(Arena& arena) const {
  return arena_ == nullptr || arena_ == &arena ? const_cast<String*>(this) : create(arena, view());
}

String* String::copyTo(Arena& arena) const {
  return create(arena, view());
}

namespace {

const char* getCharPtr(const CMPIString* handle, CMPIStatus* status) {
  const String* const string = String::from(handle);
  if (string == nullptr) {
    return noObject(status, CMPI_RC_ERR_INVALID_HANDLE);
  }
  setStatus(status, CMPI_RC_OK);
  return string->view().data();
}

}  // namespace

CMPIStringFT stringTable = {tableVersion, releaseHandle<String>, cloneHandle<String>, getCharPtr};

}  // namespace cimom
