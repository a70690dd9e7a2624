#include <agent/endpoints/Delivery.h>
#include <agent/framework/CmpiAccess.h>

#include <Oru/ProviderUtilities.h>
#include <cmpi/cmpimacs.h>

#include <algorithm>
#include <type_traits>

namespace agent::endpoints {
namespace {

using Oru::ProviderUtilities;

/// As CMPI hands over a text of type CMPI_chars: the value pointer is the text.
const CMPIValue* asChars(const std::string& text) {
  return reinterpret_cast<const CMPIValue*>(text.c_str());
}

bool lists(const char** wanted, const char* name) {
  if (wanted == nullptr) {
    return true;
  }
  for (; *wanted != nullptr; ++wanted) {
    if (cmpi::sameName(*wanted, name)) {
      return true;
    }
  }
  return false;
}

}  // namespace

void Delivery::path(const Keys& keys) {
  check(CMReturnObjectPath(result_, makePath(keys)), "take a path of");
}

void Delivery::instance(const Keys& keys, const std::vector<Property>& properties, const char** wanted) {
  CMPIInstance* instance = ProviderUtilities::createInstance(broker_, makePath(keys));
  if (instance == nullptr) {
    throw Failure(CMPI_RC_ERR_FAILED, std::string("the object manager makes no instance of ") + className_);
  }
  for (const Key& key : keys) {
    set(instance, key.name, key.value);
  }
  for (const Property& property : properties) {
    if (lists(wanted, property.name)) {
      set(instance, property.name, property.value);
    }
  }
  check(CMReturnInstance(result_, instance), "take an instance of");
}

void Delivery::done() {
  check(CMReturnDone(result_), "end the answer on");
}

CMPIObjectPath* Delivery::makePath(const Keys& keys) {
  CMPIObjectPath* path = ProviderUtilities::createObjectPath(broker_, className_, nameSpace_);
  if (path == nullptr) {
    throw Failure(CMPI_RC_ERR_FAILED, std::string("the object manager makes no object path of ") +
                                          className_ + " in " + nameSpace_);
  }
  for (const Key& key : keys) {
    check(CMAddKey(path, key.name, asChars(key.value), CMPI_chars),
          std::string("set the key ") + key.name + " of");
  }
  return path;
}

void Delivery::set(CMPIInstance* instance, const char* name, const Value& value) {
  CMPIStatus status{CMPI_RC_OK, nullptr};
  std::visit(
      [&](const auto& held) {
        using Held = std::decay_t<decltype(held)>;
        CMPIValue made{};
        if constexpr (std::is_same_v<Held, std::string>) {
          status = CMSetProperty(instance, name, asChars(held), CMPI_chars);
        } else if constexpr (std::is_same_v<Held, std::uint16_t>) {
          made.uint16 = held;
          status = CMSetProperty(instance, name, &made, CMPI_uint16);
        } else if constexpr (std::is_same_v<Held, std::uint64_t>) {
          made.uint64 = held;
          status = CMSetProperty(instance, name, &made, CMPI_uint64);
        } else {
          made.array = makeArray(name, held);
          status = CMSetProperty(instance, name, &made, CMPI_uint16A);
        }
      },
      value);
  check(status, std::string("set the property ") + name + " of");
}

CMPIArray* Delivery::makeArray(const char* name, const std::vector<std::uint16_t>& numbers) {
  const std::string what = std::string("make the array ") + name + " of";
  CMPIStatus status{CMPI_RC_OK, nullptr};
  CMPIArray* array = CMNewArray(broker_, static_cast<CMPICount>(numbers.size()), CMPI_uint16, &status);
  check(status, what);
  if (array == nullptr) {
    check({CMPI_RC_ERR_FAILED, nullptr}, what);
  }
  for (CMPICount index = 0; index < numbers.size(); ++index) {
    CMPIValue number{};
    number.uint16 = numbers[index];
    check(CMSetArrayElementAt(array, index, &number, CMPI_uint16), what);
  }
  return array;
}

void Delivery::check(const CMPIStatus& status, const std::string& what) const {
  if (status.rc == CMPI_RC_OK) {
    return;
  }
  const char* reason = cmpi::charsOf(status.msg);
  throw Failure(status.rc, "the object manager did not " + what + " " + className_ + ": status " +
                               std::to_string(status.rc) +
                               (reason == nullptr ? "" : std::string(", ") + reason));
}

}  // namespace agent::endpoints
