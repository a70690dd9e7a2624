#include <cimom/broker/Broker.h>
#include <cimom/broker/BrokerState.h>

#include <utility>

namespace cimom {

Broker::Broker(const ClassModel& model, BrokerSettings settings)
    : state_(std::make_unique<State>(model, std::move(settings))) {
  CMPIBrokerFT& table = state_->requests;
  table.brokerCapabilities = CMPI_MB_BasicRead | CMPI_MB_AssociationTraversal |
                             CMPI_MB_OSEncapsulationSupport | CMPI_MB_Supports_MemEnhancements;
  table.brokerVersion = CMPIVersion200;
  table.brokerName = state_->settings.name.c_str();
  fillUpcalls(table);
  fillThreads(table);
  state_->handle = {state_.get(), &table, &encapsulationTable, &operatingSystemTable, &memoryTable};
}

Broker::~Broker() = default;

const CMPIBroker* Broker::handle() const {
  return &state_->handle;
}

const ClassTable& Broker::classes() const {
  return state_->classes;
}

namespace {
UpcallStatus notOffered() {
  return {CMPI_RC_ERR_NOT_SUPPORTED, {}};
}
}  // namespace

UpcallStatus UpcallTarget::enumerateInstances(const Context& /*context*/, const ObjectPath& /*path*/,
                                              const char** /*properties*/, ResultSink& /*sink*/) {
  return notOffered();
}

UpcallStatus UpcallTarget::enumerateInstanceNames(const Context& /*context*/, const ObjectPath& /*path*/,
                                                  ResultSink& /*sink*/) {
  return notOffered();
}

UpcallStatus UpcallTarget::getInstance(const Context& /*context*/, const ObjectPath& /*path*/,
                                       const char** /*properties*/, ResultSink& /*sink*/) {
  return notOffered();
}

UpcallStatus UpcallTarget::associators(const Context& /*context*/, const ObjectPath& /*path*/,
                                       const AssociationFilter& /*filter*/, const char** /*properties*/,
                                       ResultSink& /*sink*/) {
  return notOffered();
}

UpcallStatus UpcallTarget::associatorNames(const Context& /*context*/, const ObjectPath& /*path*/,
                                           const AssociationFilter& /*filter*/, ResultSink& /*sink*/) {
  return notOffered();
}

UpcallStatus UpcallTarget::references(const Context& /*context*/, const ObjectPath& /*path*/,
                                      const AssociationFilter& /*filter*/, const char** /*properties*/,
                                      ResultSink& /*sink*/) {
  return notOffered();
}

UpcallStatus UpcallTarget::referenceNames(const Context& /*context*/, const ObjectPath& /*path*/,
                                          const AssociationFilter& /*filter*/, ResultSink& /*sink*/) {
  return notOffered();
}

UpcallStatus UpcallTarget::createInstance(const Context& /*context*/, const ObjectPath& /*path*/,
                                          const Instance& /*instance*/, ResultSink& /*sink*/) {
  return notOffered();
}

UpcallStatus UpcallTarget::modifyInstance(const Context& /*context*/, const ObjectPath& /*path*/,
                                          const Instance& /*instance*/, const char** /*properties*/) {
  return notOffered();
}

UpcallStatus UpcallTarget::deleteInstance(const Context& /*context*/, const ObjectPath& /*path*/) {
  return notOffered();
}

UpcallStatus UpcallTarget::execQuery(const Context& /*context*/, const ObjectPath& /*path*/,
                                     std::string_view /*query*/, std::string_view /*language*/,
                                     ResultSink& /*sink*/) {
  return notOffered();
}

UpcallStatus UpcallTarget::invokeMethod(const Context& /*context*/, const ObjectPath& /*path*/,
                                        std::string_view /*method*/, const Args& /*in*/, Args* /*out*/,
                                        ResultSink& /*sink*/) {
  return notOffered();
}

UpcallStatus UpcallTarget::setProperty(const Context& /*context*/, const ObjectPath& /*path*/,
                                       std::string_view /*name*/, const CMPIData& /*value*/) {
  return notOffered();
}

UpcallStatus UpcallTarget::getProperty(const Context& /*context*/, const ObjectPath& /*path*/,
                                       std::string_view /*name*/, ResultSink& /*sink*/) {
  return notOffered();
}

}  // namespace cimom
