// Enumerations in parts: opened, pulled from, closed.
#include <cimom/protocol/Operations.h>

#include <algorithm>
#include <cstdint>
#include <limits>
#include <optional>

namespace cimom::protocol {

namespace {

std::chrono::seconds idleTimeOf(const Call& call) {
  const std::optional<std::uint32_t> asked = call.arguments.number("OperationTimeout");
  if (!asked)
    return call.settings.idleTime;
  // Zero would be an enumeration that never expires.
  if (*asked == 0 || std::chrono::seconds(*asked) > call.settings.longestIdleTime)
    throw CimError(invalidOperationTimeout, "OperationTimeout is between 1 and " +
                                                std::to_string(call.settings.longestIdleTime.count()) +
                                                " seconds");
  return std::chrono::seconds(*asked);
}

void refuseWhatIsNotThere(const Call& call, bool isQuery) {
  if (call.arguments.flag("ContinueOnError"))
    throw CimError(continuationOnErrorNotSupported, "");
  if (isQuery)
    return;
  if (!call.arguments.text("FilterQueryLanguage").empty())
    throw CimError(filteredEnumerationNotSupported, "");
  if (!call.arguments.text("FilterQuery").empty())
    throw CimError(CMPI_RC_ERR_INVALID_PARAMETER, "FilterQuery is given without FilterQueryLanguage");
}

/// The parameters that go with a part: where to go on, and whether there is an end.
std::string outParameters(const std::string& context, bool isEnd) {
  std::string text;
  xml::appendOutParameter(text, "EnumerationContext", isEnd ? std::string_view() : context);
  xml::appendOutParameter(text, "EndOfSequence", isEnd);
  return text;
}

/// Delivers up to `most` objects. What was delivered before a failure of the provider is a part of its own:
/// the next pull tells of the failure.
void deliver(Call& call, ContextTable::Lease lease, std::uint32_t most) {
  ObjectQueue& queue = lease.queue();
  const std::size_t bound = std::min<std::size_t>(most, call.settings.objectsPerPull);
  const auto deadline = ObjectQueue::Clock::now() + lease.idleTime();
  std::size_t taken = 0;
  while (taken < bound) {
    const std::optional<std::string> object = queue.take(deadline);
    if (!object)
      break;
    ++taken;
    call.reply.object() += *object;
    if (!call.reply.objectDone())
      return;
  }
  const ObjectQueue::State state = queue.state(ObjectQueue::Clock::now() + call.settings.lookAhead);
  const bool isEnd = state == ObjectQueue::State::ended;
  if (state == ObjectQueue::State::closed || (state == ObjectQueue::State::failed && taken == 0)) {
    const Status status = queue.status();
    throw CimError(status.code, status.description);
  }
  const std::string out = outParameters(lease.context(), isEnd);
  if (!isEnd)
    lease.keep();  // before the client can ask for more
  call.reply.succeed(out);
}

void pull(Call& call, Pulled pulled) {
  ContextTable::Lease lease =
      call.contexts.use(call.arguments.text("EnumerationContext"), call.owner(), pulled);
  deliver(call, std::move(lease), *call.arguments.number("MaxObjectCount"));
}

void open(Call& call, Pulled pulled, bool isQuery, Source source) {
  refuseWhatIsNotThere(call, isQuery);
  const std::chrono::seconds idleTime = idleTimeOf(call);
  deliver(call, call.contexts.open(call.owner(), pulled, idleTime, std::move(source)),
          call.arguments.number("MaxObjectCount").value_or(0));
}

}  // namespace

void openWith(Call& call, Pulled pulled, Source source) {
  open(call, pulled, false, std::move(source));
}

void openQuery(Call& call) {
  // Classes of results are made by no provider.
  if (call.arguments.flag("ReturnQueryResultClass"))
    throw CimError(CMPI_RC_ERR_NOT_SUPPORTED, "ReturnQueryResultClass is not supported");
  open(call, Pulled::instances, true, queried(call, xml::InstanceForm::instance));
}

void pullInstancesWithPath(Call& call) {
  pull(call, Pulled::instancesWithPath);
}

void pullInstancePaths(Call& call) {
  pull(call, Pulled::paths);
}

void pullInstances(Call& call) {
  pull(call, Pulled::instances);
}

void closeEnumeration(Call& call) {
  call.contexts.close(call.arguments.text("EnumerationContext"), call.owner());
  call.reply.succeedWithoutValue();
}

void enumerationCount(Call& call) {
  ContextTable::Lease lease =
      call.contexts.use(call.arguments.text("EnumerationContext"), call.owner(), std::nullopt);
  const std::optional<std::size_t> left = lease.queue().left();
  lease.keep();
  call.reply.keepTogether();
  if (left) {
    call.reply.object() += "<VALUE>" + std::to_string(*left) + "</VALUE>";
    call.reply.objectDone();
  }
  call.reply.succeed();
}

}  // namespace cimom::protocol
