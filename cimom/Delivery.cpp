#include <cimom/Delivery.h>

namespace cimom {

std::optional<std::vector<std::string_view>> propertyNames(const char** properties) {
  if (properties == nullptr)
    return std::nullopt;
  std::vector<std::string_view> names;
  for (; *properties != nullptr; ++properties)
    names.emplace_back(*properties);
  return names;
}

void Delivery::startRoute(const Routes& routes, const Route& route, const ClassInfo& requested,
                          std::string_view nameSpace) {
  routes_ = &routes;
  route_ = &route;
  requested_ = &requested;
  nameSpace_ = nameSpace;
  strangers_ = 0;
}

bool Delivery::isWanted(Enumerated what, const ClassInfo* info, std::string_view className) {
  if (info == route_->info && what == what_)
    return true;
  if (what == what_ && info != nullptr && info->isA(*requested_))
    return routes_->responsible(nameSpace_, *info) == route_;
  if (strangers_++ == 0)
    strangersClass_ = className;
  return false;
}

template <class Action>
bool Delivery::handOn(const Action& action) {
  if (!open_)
    return false;
  try {
    ++delivered_;
    open_ = action();
  } catch (...) {
    thrown_ = std::current_exception();
    open_ = false;
  }
  return open_;
}

bool Delivery::instance(Instance& instance) {
  if (!isWanted(Enumerated::Instances, &instance.classInfo(), instance.className()))
    return open_;
  return handOn([this, &instance] {
    if (!properties_)
      return receiver_.instance(instance);
    // The provider may go on using its instance: a copy loses the properties.
    scratch_.reset();
    Instance* copy = instance.copyTo(scratch_);
    copy->restrictTo(*properties_);
    return receiver_.instance(*copy);
  });
}

bool Delivery::path(ObjectPath& path) {
  if (!isWanted(Enumerated::Names, path.classInfo(), path.className()))
    return open_;
  return handOn([this, &path] { return receiver_.path(path); });
}

void Delivery::rethrow() const {
  if (thrown_ != nullptr)
    std::rethrow_exception(thrown_);
}

}  // namespace cimom
