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

bool Delivery::isWanted(Kind given, const ObjectPath& path, const Instance* instance) {
  const Verdict verdict = given == kind_ ? judge(path, instance) : Verdict::Stranger;
  if (verdict == Verdict::Stranger && strangers_++ == 0)
    strangersClass_ = path.className();
  return verdict == Verdict::Wanted;
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
  if (!isWanted(Kind::Instances, instance.path(), &instance))
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
  if (!isWanted(Kind::Names, path, nullptr))
    return open_;
  return handOn([this, &path] { return receiver_.path(path); });
}

void Delivery::rethrow() const {
  if (thrown_ != nullptr)
    std::rethrow_exception(thrown_);
}

void EnumerationDelivery::startRoute(const Routes& routes, const Route& route, const ClassInfo& requested,
                                     std::string_view nameSpace) {
  routes_ = &routes;
  route_ = &route;
  requested_ = &requested;
  nameSpace_ = nameSpace;
  forgetStrangers();
}

Delivery::Verdict EnumerationDelivery::judge(const ObjectPath& path, const Instance* /*instance*/) {
  const ClassInfo* info = path.classInfo();
  if (info == route_->info)
    return Verdict::Wanted;
  if (info == nullptr || !info->isA(*requested_))
    return Verdict::Stranger;
  const bool isOurs = routes_->responsible(nameSpace_, *info, operation_) == route_;
  return isOurs ? Verdict::Wanted : Verdict::LeftOut;
}

}  // namespace cimom
