#include <cimom/Names.h>
#include <cli/BriefPath.h>

namespace cli {
namespace {

bool tells(std::string_view key) {
  return !namesAClass(key) && !namesASystem(key);
}

/// The value of the path's one telling key; empty where there is none, several, or one that is no text.
std::string_view tellingValue(const cimom::ObjectPath& path) {
  std::string_view value;
  for (const cimom::NamedValue& key : path.keys()) {
    if (tells(key.name)) {
      if (!value.empty()) {
        return {};
      }
      value = cimom::text(key.data).value_or("");
      if (value.empty()) {
        return {};
      }
    }
  }
  return value;
}

}  // namespace

bool namesAClass(std::string_view key) {
  return cimom::sameName(key, "CreationClassName") || cimom::sameName(key, "SystemCreationClassName");
}

bool namesASystem(std::string_view key) {
  return cimom::sameName(key, "SystemName");
}

const cimom::mof::Property* tellingKey(const cimom::SchemaClass& info) {
  const cimom::mof::Property* telling = nullptr;
  for (const cimom::mof::Property* key : info.keys()) {
    if (tells(key->name)) {
      if (telling != nullptr || key->type != CMPI_string) {
        return nullptr;
      }
      telling = key;
    }
  }
  return telling;
}

std::string briefPath(const cimom::ObjectPath& path) {
  const std::string_view value = tellingValue(path);
  if (value.empty()) {
    return {};
  }
  // A text with a "=" would be read as a path.
  if (cimom::sameName(path.className(), softwareClass) && value.find('=') == std::string_view::npos) {
    return std::string(value);
  }
  return std::string(path.className()).append("=").append(value);
}

}  // namespace cli
