// What is behind a broker's handle, for the functions of its tables.
#pragma once

#include <cimom/broker/Broker.h>
#include <cimom/broker/Request.h>
#include <cimom/broker/Tables.h>
#include <cmpi/cmpift.h>

#include <memory>
#include <mutex>
#include <thread>
#include <vector>

namespace cimom {

/// A thread that a provider started: the request that it works in, from `prepareAttachThread` or
/// `attachThread` to `detachThread`.
struct Attachment {
  Request request;
  const CMPIContext* context = nullptr;
  std::thread::id thread;  ///< none until a thread has attached
  std::unique_ptr<RequestScope> scope;
};

struct Broker::State {
  State(const ClassModel& model, BrokerSettings given) : settings(std::move(given)), classes(model) {}

  BrokerSettings settings;
  ClassTable classes;
  CMPIBrokerFT requests{};
  CMPIBroker handle{};
  std::mutex attachmentsMutex;
  std::vector<std::unique_ptr<Attachment>> attachments;
};

class BrokerCalls {
 public:
  /// Null for a null handle.
  static Broker::State* state(const CMPIBroker* handle) {
    return handle == nullptr ? nullptr : static_cast<Broker::State*>(handle->hdl);
  }
};

/// The broker and the calling thread's request, both needed to make anything.
struct Call {
  Broker::State* broker;
  Request* request;
  CMPIrc code;  ///< CMPI_RC_OK where both are there
};

[[nodiscard]] inline Call callOn(const CMPIBroker* handle) {
  Broker::State* const broker = BrokerCalls::state(handle);
  Request* const request = Request::current();
  if (broker == nullptr) {
    return {broker, request, CMPI_RC_ERR_INVALID_HANDLE};
  }
  return {broker, request, request == nullptr ? CMPI_RC_ERR_FAILED : CMPI_RC_OK};
}

extern CMPIBrokerEncFT encapsulationTable;
extern CMPIBrokerExtFT operatingSystemTable;
extern CMPIBrokerMemFT memoryTable;
/// Everything but the capabilities, the version and the name.
void fillUpcalls(CMPIBrokerFT& table);
void fillThreads(CMPIBrokerFT& table);

}  // namespace cimom
