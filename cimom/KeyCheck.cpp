#include <cimom/KeyCheck.h>

#include <string>

namespace cimom {

namespace {

bool isInteger(CMPIType type) {
  return (type & CMPI_ARRAY) == 0 && (type & CMPI_UINT) != 0 && type < CMPI_ENC;
}

bool isReal(CMPIType type) {
  return type == CMPI_real32 || type == CMPI_real64;
}

bool agree(CMPIType declared, CMPIType given) {
  return declared == given || (isInteger(declared) && isInteger(given)) ||
         (isReal(declared) && isReal(given));
}

Status invalid(std::string description) {
  return {CMPI_RC_ERR_INVALID_PARAMETER, std::move(description)};
}

}  // namespace

Status checkKeys(const ObjectPath& path, const ClassInfo& info) {
  const std::string className(info.name());
  for (const std::uint16_t index : info.keys()) {
    const PropertyInfo& key = info.properties()[index];
    if (path.find(key.name) == nullptr)
      return invalid("key " + std::string(key.name) + " of class " + className + " is missing");
  }
  if (Status status = checkGivenKeys(path, info); status.code != CMPI_RC_OK)
    return status;
  if (info.keys().empty())
    return invalid("class " + className + " has no keys: its instances cannot be named");
  return {};
}

Status checkGivenKeys(const ObjectPath& path, const ClassInfo& info) {
  const std::string className(info.name());
  for (const NamedValue& given : path.keys()) {
    const PropertyInfo* key = info.find(given.name);
    if (key == nullptr || !key->isKey)
      return invalid("class " + className + " has no key " + std::string(given.name));
    if (isNull(given.data))
      return invalid("key " + std::string(key->name) + " has no value");
    if (!agree(key->type, given.data.type))
      return invalid("key " + std::string(key->name) + " of class " + className + " has the wrong type");
  }
  return {};
}

}  // namespace cimom
