#include <cimom/ProviderCall.h>

namespace cimom {

thread_local int Nesting::depth = 0;

Status Nesting::check() {
  if (depth <= deepest)
    return {};
  return {CMPI_RC_ERR_FAILED,
          "providers ask each other more than " + std::to_string(deepest) + " calls deep"};
}

ProviderCall::ProviderCall(const Route& route, const Asked& asked, std::string_view className,
                           CMPIFlags flags, ResultSink& sink)
    : route_(route), scope_(&request_), result_(sink, request_, route.recycling) {
  Arena& held = request_.held();
  if (asked.context == nullptr) {
    context_ = Context::create(held);
    context_->setFlags(flags);
  } else {
    context_ = asked.context->copyTo(held);
  }
  context_->setText(CMPIInitNameSpace, asked.path.nameSpace());
  path_ = asked.path.copyTo(held);
  path_->setClassName(className);
}

Outcome ProviderCall::concluded(Status status, const Delivery& delivery,
                                const Diagnostics& diagnostics) const {
  const auto report = [&](const std::string& what) { diagnostics.report(named(route_) + what); };
  const std::string className(route_.info->name());
  if (delivery.strangers() > 0)
    report(" answered for class " + className + " with " + std::to_string(delivery.strangers()) +
           " objects that nobody asked for, the first of class " + delivery.strangersClass() +
           "; they are left out");
  if (result_.refused() > 0)
    report(" answered for class " + className + " with " + std::to_string(result_.refused()) +
           " nulls or foreign objects, or after its done marker; they are left out");
  if (status.code == CMPI_RC_OK && !result_.done()) {
    diagnostics.countUnfinished();
    report(" stopped early: for class " + className + " it sent " + std::to_string(result_.delivered()) +
           " objects and no done marker");
  }
  return {std::move(status), result_.done(), result_.delivered()};
}

Status notSupported(std::string what) {
  return {CMPI_RC_ERR_NOT_SUPPORTED, std::move(what)};
}

std::string named(const Route& route) {
  return route.isDeclared() ? "the schema" : "provider " + route.library->provider();
}

}  // namespace cimom
