#include <cimom/AssociationDelivery.h>
#include <cimom/Names.h>

namespace cimom {

bool DeliveredPaths::Equal::operator()(const ObjectPath* left, const ObjectPath* right) const {
  const auto meant = [this](const ObjectPath* path) {
    return path->nameSpace().empty() ? nameSpace : path->nameSpace();
  };
  return sameName(meant(left), meant(right)) && samePath(*left, *right);
}

DeliveredPaths::DeliveredPaths(std::string_view nameSpace) : paths_(0, Hash(), Equal{nameSpace}) {}

bool DeliveredPaths::isFromBefore(const ObjectPath& path, std::size_t answer) const {
  const auto found = paths_.find(&path);
  return found != paths_.end() && found->second < answer;
}

void DeliveredPaths::add(const ObjectPath& path, std::size_t answer) {
  if (!paths_.contains(&path))
    paths_.emplace(path.copyTo(arena_), answer);
}

void AssociatorDelivery::startAnswer(const Roles* roles) {
  roles_ = roles;
  ++answer_;
  forgetStrangers();
}

Delivery::Verdict AssociatorDelivery::judge(const ObjectPath& path, const Instance* /*instance*/) {
  const ClassInfo* info = path.classInfo();
  if (narrowing_.resultClass != nullptr && (info == nullptr || !info->isA(*narrowing_.resultClass)))
    return Verdict::LeftOut;
  if (narrowing_.resultRole != nullptr && !roles_->stands(info, narrowing_.resultRole))
    return Verdict::LeftOut;
  // Without keys a path names no object, so it cannot tell two apart.
  if (path.keys().empty())
    return Verdict::Wanted;
  if (answer_ > 1 && known_.isFromBefore(path, answer_))
    return Verdict::LeftOut;
  if (answer_ < answers_)
    known_.add(path, answer_);
  return Verdict::Wanted;
}

bool ReferenceDelivery::holdsSource(const NamedValue& reference) const {
  const ObjectPath* end = objectPath(reference.data);
  if (end == nullptr)
    return false;
  if (!source_.keys().empty())
    return samePath(*end, source_);
  return end->classInfo() != nullptr && end->classInfo()->isA(*source_.classInfo());
}

Delivery::Verdict ReferenceDelivery::judge(const ObjectPath& path, const Instance* instance) {
  const Verdict verdict = EnumerationDelivery::judge(path, instance);
  if (verdict != Verdict::Wanted || role_ == nullptr)
    return verdict;
  const NamedValue* reference = instance == nullptr ? nullptr : instance->find(role_);
  if (reference == nullptr)
    reference = path.find(role_);
  return reference == nullptr || holdsSource(*reference) ? Verdict::Wanted : Verdict::LeftOut;
}

}  // namespace cimom
