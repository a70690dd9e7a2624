#include <cimom/Associations.h>
#include <cimom/Dispatcher.h>
#include <cimom/KeyCheck.h>
#include <cimom/Names.h>
#include <cimom/broker/Arena.h>

#include <string>
#include <utility>

namespace cimom {

namespace {

AssociationFilter withoutEmptyTexts(AssociationFilter filter) {
  for (const char** text :
       {&filter.associationClass, &filter.resultClass, &filter.role, &filter.resultRole}) {
    if (*text != nullptr && **text == '\0')
      *text = nullptr;
  }
  return filter;
}

// What DSP0200 has for a request whose parameters name what is not there. It knows no CIM_ERR_INVALID_CLASS
// for these operations.
Status invalid(std::string description) {
  return {CMPI_RC_ERR_INVALID_PARAMETER, std::move(description)};
}

/// Keeps the first path of an answer.
class FirstPath final : public ResultSink {
 public:
  explicit FirstPath(Arena& arena) : arena_(arena) {}

  bool instance(Instance& /*instance*/) override { return true; }
  bool path(ObjectPath& path) override {
    path_ = path.copyTo(arena_);
    return false;
  }
  [[nodiscard]] const ObjectPath* get() const { return path_; }

 private:
  Arena& arena_;
  const ObjectPath* path_ = nullptr;
};

/// Marks that the calling thread is learning roles. A provider that itself asks for associations in a role
/// while it enumerates them would otherwise never come to an end.
class Learning {
 public:
  Learning() { underWay = true; }
  ~Learning() { underWay = false; }
  Learning(const Learning&) = delete;
  Learning& operator=(const Learning&) = delete;

  [[nodiscard]] static bool isUnderWay() { return underWay; }

 private:
  static thread_local bool underWay;
};

thread_local bool Learning::underWay = false;

}  // namespace

Status Associations::checkSource(const Asked& asked) const {
  Status status = dispatcher_.check(asked.path);
  if (status.code == CMPI_RC_ERR_INVALID_CLASS)
    status.code = CMPI_RC_ERR_INVALID_PARAMETER;
  const bool mayBeClass = asked.context != nullptr && asked.path.keys().empty();
  if (status.code == CMPI_RC_OK && !mayBeClass)
    status = checkKeys(asked.path, *asked.path.classInfo());
  return status;
}

Status Associations::resolve(const Asked& asked, const AssociationFilter& filter, Query& query) const {
  Status status = checkSource(asked);
  if (status.code != CMPI_RC_OK)
    return status;
  query.filter = withoutEmptyTexts(filter);
  const Routes& routes = dispatcher_.routes();
  const ClassInfo* top = nullptr;
  if (const char* name = query.filter.associationClass) {
    top = routes.classes().find(name);
    if (top == nullptr)
      return invalid("the schema has no association class " + std::string(name));
  }
  query.routes = routes.associations(asked.path.nameSpace(), top);
  if (query.routes.empty() && top != nullptr && !routes.schema().find(top->name())->isAssociation())
    return invalid("class " + std::string(top->name()) + " is no association");
  std::erase_if(query.routes, [&](const Route* route) {
    return route->isDeclared() && !dispatcher_.declared().concern(*route, asked.path);
  });
  if (const char* name = query.filter.resultClass) {
    query.resultClass = routes.classes().find(name);
    if (query.resultClass == nullptr)
      return invalid("the schema has no result class " + std::string(name));
  }
  return {};
}

Associations::RolesByRoute Associations::narrowByRoles(const Asked& asked, Query& query) const {
  RolesByRoute result;
  const char* const role = query.filter.role;
  const char* const resultRole = query.filter.resultRole;
  if (role == nullptr && resultRole == nullptr)
    return result;
  const bool isOneReference = role != nullptr && resultRole != nullptr && sameName(role, resultRole);
  std::erase_if(query.routes, [&](const Route* route) {
    const Roles declared(*route, dispatcher_.routes().classes());
    const auto lacks = [&declared](const char* name) { return name != nullptr && !declared.has(name); };
    if (isOneReference || lacks(role) || lacks(resultRole))
      return true;
    Roles known = roles(*route, asked);
    if (role != nullptr && !known.stands(asked.path.classInfo(), role))
      return true;
    result.emplace(route, std::move(known));
    return false;
  });
  return result;
}

Roles Associations::roles(const Route& route, const Asked& asked) const {
  if (auto known = book_.find(route))
    return *std::move(known);
  const ClassTable& classes = dispatcher_.routes().classes();
  Roles result(route, classes);
  if (!route.instance || route.isDeclared() || Learning::isUnderWay())
    return result;
  const Learning learning;
  Arena arena;
  FirstPath first(arena);
  const ObjectPath& all = *ObjectPath::create(arena, classes, asked.path.nameSpace(), route.info->name());
  const Outcome outcome = dispatcher_.enumerate(Kind::Names, {all, nullptr, asked.context}, first);
  if (first.get() != nullptr) {
    result.learnFrom(*first.get());
    book_.keep(route, result);
  } else if (outcome.status.code != CMPI_RC_OK) {
    dispatcher_.diagnostics().report(
        "roles in class " + std::string(route.info->name()) +
        " go by its declaration, because its names cannot be enumerated: " + outcome.status.description);
  }
  return result;
}

Outcome Associations::associators(Kind kind, const Asked& asked, const AssociationFilter& filter,
                                  ResultSink& sink) const {
  const Nesting nesting;
  Query query;
  if (Status status = resolve(asked, filter, query); status.code != CMPI_RC_OK)
    return {std::move(status), false, 0};
  const RolesByRoute roles = narrowByRoles(asked, query);
  AssociatorDelivery delivery(kind, sink, asked.properties, {query.resultClass, query.filter.resultRole},
                              asked.path.nameSpace(), query.routes.size());
  return askEach(query.routes, delivery, [&](const Route& route) {
    const auto known = roles.find(&route);
    delivery.startAnswer(known == roles.end() ? nullptr : &known->second);
    if (route.isDeclared())
      return dispatcher_.declared().associators(kind, asked, route, query.filter, delivery);
    ProviderCall call(route, asked, asked.path.className(), 0, delivery);
    const char* const association = route.info->name().data();
    Status status =
        kind == Kind::Instances
            ? call.ask(&ProviderLibrary::associationMI, &CMPIAssociationMIFT::associators, association,
                       query.filter.resultClass, query.filter.role, query.filter.resultRole, asked.properties)
            : call.ask(&ProviderLibrary::associationMI, &CMPIAssociationMIFT::associatorNames, association,
                       query.filter.resultClass, query.filter.role, query.filter.resultRole);
    return call.concluded(std::move(status), delivery, dispatcher_.diagnostics());
  });
}

Outcome Associations::references(Kind kind, const Asked& asked, const AssociationFilter& filter,
                                 ResultSink& sink) const {
  const Nesting nesting;
  Query query;
  const AssociationFilter used{filter.associationClass, nullptr, filter.role, nullptr};
  if (Status status = resolve(asked, used, query); status.code != CMPI_RC_OK)
    return {std::move(status), false, 0};
  const Routes& routes = dispatcher_.routes();
  const char* const role = query.filter.role;
  std::erase_if(query.routes, [&](const Route* route) {
    return role != nullptr && !Roles(*route, routes.classes()).has(role);
  });
  ReferenceDelivery delivery(kind, sink, asked.properties, asked.path, role);
  return askEach(query.routes, delivery, [&](const Route& route) {
    delivery.startRoute(routes, route, *route.info, asked.path.nameSpace());
    if (route.isDeclared())
      return dispatcher_.declared().references(kind, asked, route, role, delivery);
    ProviderCall call(route, asked, asked.path.className(), 0, delivery);
    const char* const association = route.info->name().data();
    Status status = kind == Kind::Instances
                        ? call.ask(&ProviderLibrary::associationMI, &CMPIAssociationMIFT::references,
                                   association, role, asked.properties)
                        : call.ask(&ProviderLibrary::associationMI, &CMPIAssociationMIFT::referenceNames,
                                   association, role);
    return call.concluded(std::move(status), delivery, dispatcher_.diagnostics());
  });
}

}  // namespace cimom
