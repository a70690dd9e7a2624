#include <cimom/DeclaredAnswers.h>
#include <cimom/Dispatcher.h>
#include <cimom/Names.h>
#include <cimom/broker/Arena.h>

#include <cstddef>
#include <functional>
#include <string_view>
#include <utility>

namespace cimom {

/// A request under way.
struct DeclaredAnswers::Work {
  Kind kind;
  const Asked& asked;
  ResultSink& sink;
  Arena scratch = Arena();  ///< one object at a time
  Outcome outcome = {{}, true, 0};
  bool wantsMore = true;

  void note(const Status& status) {
    if (outcome.status.code == CMPI_RC_OK)
      outcome.status = status;
  }

  void give(Instance& instance) {
    ++outcome.delivered;
    wantsMore = kind == Kind::Instances ? sink.instance(instance)
                                        : sink.path(*instance.path().copyTo(*instance.arena()));
  }
};

namespace {

bool isRole(const NamedValue& reference, const char* role) {
  return role == nullptr || sameName(reference.name, role);
}

bool isWithin(const DeclaredInstance& declared, const Route& route) {
  return &declared.classInfo() == route.info;
}

/// Whether a status says that there is no such object. It is in no association then; any other failure is one
/// of the request.
bool isUnknown(const Status& status) {
  return status.code == CMPI_RC_ERR_NOT_FOUND || status.code == CMPI_RC_ERR_INVALID_PARAMETER;
}

/// Takes the paths of a class's instances.
class Ends final : public ResultSink {
 public:
  /// `action(path)` answers whether it wants more.
  using Action = std::function<bool(const ObjectPath&)>;
  Ends(std::string_view nameSpace, Action action) : nameSpace_(nameSpace), action_(std::move(action)) {}

  bool instance(Instance& /*instance*/) override { return true; }
  bool path(ObjectPath& path) override {
    scratch_.reset();
    ObjectPath* const end = path.copyTo(scratch_);
    if (end->nameSpace().empty())
      end->setNameSpace(nameSpace_);
    return action_(*end);
  }

 private:
  std::string_view nameSpace_;
  Action action_;
  Arena scratch_;
};

/// Hands objects on, those without a namespace in the one that they were asked for in: whoever asked for
/// associations may have done so in another.
class Placed final : public ResultSink {
 public:
  Placed(std::string_view nameSpace, ResultSink& sink) : nameSpace_(nameSpace), sink_(sink) {}

  bool instance(Instance& instance) override {
    ++count_;
    if (!instance.path().nameSpace().empty())
      return sink_.instance(instance);
    scratch_.reset();
    Instance* const copy = instance.copyTo(scratch_);
    (void)copy->setPath(*placed(instance.path()));
    return sink_.instance(*copy);
  }

  bool path(ObjectPath& path) override {
    ++count_;
    if (!path.nameSpace().empty())
      return sink_.path(path);
    scratch_.reset();
    return sink_.path(*placed(path));
  }

  [[nodiscard]] std::size_t count() const { return count_; }

 private:
  [[nodiscard]] ObjectPath* placed(const ObjectPath& path) {
    ObjectPath* const copy = path.copyTo(scratch_);
    copy->setNameSpace(nameSpace_);
    return copy;
  }

  std::string_view nameSpace_;
  ResultSink& sink_;
  Arena scratch_;
  std::size_t count_ = 0;
};

}  // namespace

bool DeclaredAnswers::mayHold(const NamedValue& reference, const ObjectPath& object) const {
  const ObjectPath* const end = objectPath(reference.data);
  if (end == nullptr || object.keys().empty() || object.classInfo() == nullptr)
    return false;
  if (!object.nameSpace().empty() &&
      !dispatcher_.routes().isSameNameSpace(end->nameSpace(), object.nameSpace()))
    return false;
  return end->keys().empty() ? object.classInfo()->isA(*end->classInfo()) : samePath(*end, object);
}

const NamedValue* DeclaredAnswers::near(const DeclaredInstance& declared, const ObjectPath& object,
                                        const char* role) const {
  for (const NamedValue& property : declared.instance->properties()) {
    if (isRole(property, role) && mayHold(property, object))
      return &property;
  }
  return nullptr;
}

bool DeclaredAnswers::concern(const Route& route, const ObjectPath& source) const {
  for (const DeclaredInstance& each : dispatcher_.routes().declared()) {
    if (isWithin(each, route) && near(each, source, nullptr) != nullptr)
      return true;
  }
  return false;
}

bool DeclaredAnswers::holds(Work& work, const NamedValue& reference, const ObjectPath& object) const {
  return !objectPath(reference.data)->keys().empty() || exists(work, object);
}

bool DeclaredAnswers::exists(Work& work, const ObjectPath& object) const {
  const char* nothing[] = {nullptr};
  Nobody nobody;
  const Outcome found = dispatcher_.get({object, nothing, work.asked.context}, nobody);
  // Without a provider there are no instances.
  if (!isUnknown(found.status) && found.status.code != CMPI_RC_ERR_NOT_SUPPORTED)
    work.note(found.status);
  return found.status.code == CMPI_RC_OK;
}

void DeclaredAnswers::giveWith(Work& work, const DeclaredInstance& declared, const ObjectPath& end) {
  work.scratch.reset();
  Instance* const copy = declared.instance->copyTo(work.scratch);
  CMPIValue value{};
  value.ref = end.copyTo(work.scratch);
  (void)copy->setProperty(declared.pattern->name, &value, CMPI_ref);  // it was a reference before
  work.give(*copy);
}

void DeclaredAnswers::give(Work& work, const DeclaredInstance& declared) const {
  if (declared.pattern == nullptr) {
    work.scratch.reset();
    work.give(*declared.instance->copyTo(work.scratch));
    return;
  }
  const ObjectPath& all = *objectPath(declared.pattern->data);
  Ends ends(all.nameSpace(), [&](const ObjectPath& end) {
    giveWith(work, declared, end);
    return work.wantsMore;
  });
  work.note(dispatcher_.enumerate(Kind::Names, {all, nullptr, work.asked.context}, ends).status);
}

void DeclaredAnswers::giveEnd(Work& work, const ObjectPath& end) const {
  Placed placed(end.nameSpace(), work.sink);
  const Asked asked{end, work.asked.properties, work.asked.context};
  if (end.keys().empty()) {
    work.note(dispatcher_.enumerate(work.kind, asked, placed).status);
  } else if (work.kind == Kind::Instances) {
    const Status status = dispatcher_.get(asked, placed).status;
    if (!isUnknown(status))
      work.note(status);
  } else if (exists(work, end)) {
    work.scratch.reset();
    work.wantsMore = placed.path(*end.copyTo(work.scratch));
  }
  work.outcome.delivered += placed.count();
}

Outcome DeclaredAnswers::enumerate(Kind kind, const Asked& asked, const Route& route,
                                   ResultSink& sink) const {
  Work work{kind, asked, sink};
  const Routes& routes = dispatcher_.routes();
  for (const DeclaredInstance& each : routes.declared()) {
    if (work.wantsMore && isWithin(each, route) &&
        routes.isSameNameSpace(each.nameSpace(), asked.path.nameSpace()))
      give(work, each);
  }
  return work.outcome;
}

bool DeclaredAnswers::isNamed(const DeclaredInstance& declared, const ObjectPath& path) const {
  for (const NamedValue& key : declared.instance->path().keys()) {
    const NamedValue* const given = path.find(key.name);
    const ObjectPath* const end = given == nullptr ? nullptr : objectPath(given->data);
    if (objectPath(key.data) != nullptr && (end == nullptr || !mayHold(key, *end)))
      return false;
  }
  return declared.pattern != nullptr || samePath(declared.instance->path(), path);
}

Status DeclaredAnswers::get(const Asked& asked, const Route& route, ResultSink& sink) const {
  Work work{Kind::Instances, asked, sink};
  const Routes& routes = dispatcher_.routes();
  for (const DeclaredInstance& each : routes.declared()) {
    if (!isWithin(each, route) || !routes.isSameNameSpace(each.nameSpace(), asked.path.nameSpace()) ||
        !isNamed(each, asked.path))
      continue;
    if (each.pattern == nullptr) {
      give(work, each);
      return work.outcome.status;
    }
    Arena arena;
    ObjectPath* const end = objectPath(asked.path.find(each.pattern->name)->data)->copyTo(arena);
    end->setNameSpace(objectPath(each.pattern->data)->nameSpace());
    if (holds(work, *each.pattern, *end)) {
      giveWith(work, each, *end);
      return work.outcome.status;
    }
  }
  if (work.outcome.status.code != CMPI_RC_OK)
    return work.outcome.status;
  return {CMPI_RC_ERR_NOT_FOUND, "no such instance is declared"};
}

Outcome DeclaredAnswers::associators(Kind kind, const Asked& asked, const Route& route,
                                     const AssociationFilter& filter, ResultSink& sink) const {
  Work work{kind, asked, sink};
  for (const DeclaredInstance& each : dispatcher_.routes().declared()) {
    const NamedValue* const own = isWithin(each, route) ? near(each, asked.path, filter.role) : nullptr;
    if (own == nullptr || !holds(work, *own, asked.path))
      continue;
    for (const NamedValue& property : each.instance->properties()) {
      const ObjectPath* const end = objectPath(property.data);
      if (work.wantsMore && end != nullptr && &property != own && isRole(property, filter.resultRole))
        giveEnd(work, *end);
    }
  }
  return work.outcome;
}

Outcome DeclaredAnswers::references(Kind kind, const Asked& asked, const Route& route, const char* role,
                                    ResultSink& sink) const {
  Work work{kind, asked, sink};
  for (const DeclaredInstance& each : dispatcher_.routes().declared()) {
    const NamedValue* const own = isWithin(each, route) ? near(each, asked.path, role) : nullptr;
    if (!work.wantsMore || own == nullptr || !holds(work, *own, asked.path))
      continue;
    if (own == each.pattern)
      giveWith(work, each, asked.path);
    else
      give(work, each);
  }
  return work.outcome;
}

}  // namespace cimom
