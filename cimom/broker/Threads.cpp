// Threads that providers start: how they come to a request of their own.
#include <cimom/broker/BrokerState.h>
#include <cimom/broker/Context.h>

#include <algorithm>

namespace cimom {

namespace {

// Under the mutex of the attachments.
Attachment& addAttachment(Broker::State& broker, const CMPIContext* context) {
  broker.attachments.push_back(std::make_unique<Attachment>());
  broker.attachments.back()->context = context;
  return *broker.attachments.back();
}

auto findAttachment(Broker::State& broker, const CMPIContext* context, std::thread::id thread) {
  return std::find_if(broker.attachments.begin(), broker.attachments.end(), [&](const auto& attachment) {
    return attachment->context == context && attachment->thread == thread;
  });
}

CMPIContext* prepareAttachThread(const CMPIBroker* handle, const CMPIContext* context) {
  Broker::State* const broker = BrokerCalls::state(handle);
  const Context* const source = Context::from(context);
  if (broker == nullptr || source == nullptr) {
    return nullptr;
  }
  const std::lock_guard lock(broker->attachmentsMutex);
  Attachment& attachment = addAttachment(*broker, nullptr);
  Context* const copy = source->copyTo(attachment.request.held());
  attachment.context = copy;
  return copy;
}

CMPIStatus attachThread(const CMPIBroker* handle, const CMPIContext* context) {
  Broker::State* const broker = BrokerCalls::state(handle);
  if (broker == nullptr) {
    return makeStatus(CMPI_RC_ERR_INVALID_HANDLE);
  }
  if (Context::from(context) == nullptr) {
    return makeStatus(CMPI_RC_ERR_INVALID_PARAMETER);
  }
  if (Request::current() != nullptr) {
    return makeStatus(CMPI_RC_ERR_FAILED, "the thread is attached already");
  }
  const std::lock_guard lock(broker->attachmentsMutex);
  const auto prepared = findAttachment(*broker, context, {});
  Attachment& attachment =
      prepared == broker->attachments.end() ? addAttachment(*broker, context) : **prepared;
  attachment.thread = std::this_thread::get_id();
  attachment.scope = std::make_unique<RequestScope>(&attachment.request);
  return makeStatus(CMPI_RC_OK);
}

CMPIStatus detachThread(const CMPIBroker* handle, const CMPIContext* context) {
  Broker::State* const broker = BrokerCalls::state(handle);
  if (broker == nullptr) {
    return makeStatus(CMPI_RC_ERR_INVALID_HANDLE);
  }
  const std::lock_guard lock(broker->attachmentsMutex);
  const auto attached = findAttachment(*broker, context, std::this_thread::get_id());
  // Only what this thread works in now: a provider may call from within an attached thread into another one.
  if (attached == broker->attachments.end() || Request::current() != &(*attached)->request) {
    return makeStatus(CMPI_RC_ERR_INVALID_PARAMETER);
  }
  broker->attachments.erase(attached);
  return makeStatus(CMPI_RC_OK);
}

}  // namespace

void fillThreads(CMPIBrokerFT& table) {
  table.prepareAttachThread = prepareAttachThread;
  table.attachThread = attachThread;
  table.detachThread = detachThread;
}

}  // namespace cimom
