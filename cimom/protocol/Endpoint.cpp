#include <cimom/Names.h>
#include <cimom/protocol/CimError.h>
#include <cimom/protocol/ContextTable.h>
#include <cimom/protocol/Endpoint.h>
#include <cimom/protocol/Envelope.h>
#include <cimom/protocol/Operations.h>
#include <cimom/protocol/Reply.h>
#include <cimom/xml/Conversion.h>
#include <cimom/xml/Reader.h>

#include <unistd.h>

#include <array>
#include <new>
#include <string>
#include <utility>

namespace cimom::protocol {

namespace {

constexpr std::string_view health = "/healthz";

bool asksForHealth(const http::Request& request) {
  const std::string_view path = std::string_view(request.target).substr(0, request.target.find('?'));
  return path == health && (request.method == "GET" || request.method == "HEAD");
}

/// How the client calls this machine; for clients that do not say, the name that it has for itself.
std::string hostOf(const http::Request& request) {
  const std::string* host = request.field("Host");
  if (host != nullptr && !host->empty())
    return *host;
  std::array<char, 256> name{};
  return gethostname(name.data(), name.size() - 1) == 0 ? name.data() : "localhost";
}

/// What an extrinsic method is answered: no provider here has any.
CimError noMethod(const ObjectManager& manager, const xml::MethodCall& call) {
  const std::string className = call.object ? call.object->className : "";
  const SchemaClass* which = manager.classes().find(className);
  if (which == nullptr)
    return {CMPI_RC_ERR_NOT_FOUND, "there is no class " + className};
  for (const mof::Method& method : which->methods) {
    if (sameName(method.name, call.name))
      return {CMPI_RC_ERR_METHOD_NOT_AVAILABLE, "the method " + method.name + " is not implemented"};
  }
  return {CMPI_RC_ERR_METHOD_NOT_FOUND, "the class " + className + " has no method " + call.name};
}

void refuse(const Refusal& refusal, std::vector<http::Field> fields, http::Answer& answer) {
  answer.begin(refusal.status(), std::move(fields));
  answer.write(std::string(refusal.what()) + "\n");
}

/// Without an envelope: nothing of CIM is known of the request.
std::vector<http::Field> plainFields(const Refusal& refusal) {
  std::vector<http::Field> fields = {{"Content-Type", "text/plain; charset=utf-8"}};
  fields.insert(fields.end(), refusal.fields().begin(), refusal.fields().end());
  return fields;
}

}  // namespace

struct Endpoint::State {
  State(ObjectManager& manager_, EndpointSettings given)
      : manager(manager_), settings(std::move(given)), contexts(settings) {}

  void log(const http::Request& request, const std::string& line) const {
    if (settings.log)
      settings.log(request.peer + ": " + percentEncoded(line));
  }

  void answerCim(const http::Request& request, const Envelope& envelope, http::Answer& answer) {
    const xml::MethodCall method = xml::readRequest(request.body);
    envelope.checkAgainst(method);
    Reply reply(answer, method,
                {envelope.answerFields(), request.takesTrailers, settings.pieceSize,
                 [&](std::string_view line) { log(request, std::string(line)); }});
    try {
      run(request, method, reply);
    } catch (const CimError& error) {
      reply.fail(error.code(), error.what());
    } catch (const xml::ConversionError& error) {
      reply.fail(error.code(), error.what());
    }
  }

  void run(const http::Request& request, const xml::MethodCall& method, Reply& reply) {
    if (!method.isIntrinsic)
      throw noMethod(manager, method);
    const Operation* operation = findOperation(method.name);
    if (operation == nullptr)
      throw CimError(CMPI_RC_ERR_NOT_SUPPORTED, "the operation " + method.name + " is not supported");
    if (!manager.knowsNameSpace(method.nameSpace))
      throw CimError(CMPI_RC_ERR_INVALID_NAMESPACE, "there is no namespace " + method.nameSpace);
    const Arguments arguments(method, operation->parameters);
    Call call{manager,     settings, contexts, method, arguments, reply, {hostOf(request), method.nameSpace},
              request.user};
    operation->run(call);
  }

  ObjectManager& manager;
  const EndpointSettings settings;
  ContextTable contexts;
};

Endpoint::Endpoint(ObjectManager& manager, EndpointSettings settings)
    : state_(std::make_unique<State>(manager, std::move(settings))) {}

Endpoint::~Endpoint() = default;

void Endpoint::handle(const http::Request& request, http::Answer& answer) {
  if (state_->settings.healthz && asksForHealth(request)) {
    answer.begin(200, {{"Content-Type", "text/plain; charset=utf-8"}});
    answer.write("ok\n");
    return;
  }
  std::optional<Envelope> envelope;
  const auto refused = [&](const Refusal& refusal) {
    state_->log(request, "refused with " + std::to_string(refusal.status()) + ": " + refusal.what());
    refuse(refusal, envelope ? envelope->refusalFields(refusal) : plainFields(refusal), answer);
  };
  try {
    envelope.emplace(request);
    envelope->check();
    state_->answerCim(request, *envelope, answer);
  } catch (const Refusal& refusal) {
    refused(refusal);
  } catch (const xml::RequestError& error) {
    refused(Refusal(error.httpStatus(), error.cimError(), error.what()));
  }
}

void Endpoint::shutDown() {
  state_->contexts.shutDown();
}

std::size_t Endpoint::contexts() const {
  return state_->contexts.size();
}

}  // namespace cimom::protocol
