#include "Fixture.h"

#include <cimom/Names.h>

#include <dlfcn.h>
#include <tests/support/Dsp0203.h>

#include <algorithm>
#include <stdexcept>

namespace protocol_test {

using testing::HasSubstr;

void Lines::add(std::string_view line) {
  const std::scoped_lock lock(mutex_);
  lines_.emplace_back(line);
}

std::vector<std::string> Lines::all() const {
  const std::scoped_lock lock(mutex_);
  return lines_;
}

void Recorded::begin(int status_, std::vector<Field> fields_) {
  if (started())
    throw std::logic_error("begun after bytes have left");
  status = status_;
  fields = std::move(fields_);
  body.clear();
  pieces.clear();
  failed = false;
}

bool Recorded::write(std::string_view bytes) {
  if (status == 0 || failed)
    throw std::logic_error("written before the beginning or after the end");
  if (pieces.size() >= takes)
    return false;
  body += bytes;
  pieces.push_back(bytes.size());
  if (onWrite)
    onWrite();
  return true;
}

void Recorded::fail(std::vector<Field> trailers_) {
  failed = true;
  trailers = std::move(trailers_);
}

bool Recorded::started() const {
  return !holdsBack && !pieces.empty();
}

std::string Recorded::field(std::string_view name) const {
  for (const Field& each : fields) {
    if (cimom::sameName(each.name, name))
      return each.value;
  }
  return "";
}

bool Recorded::has(std::string_view name) const {
  return std::any_of(fields.begin(), fields.end(),
                     [name](const Field& each) { return cimom::sameName(each.name, name); });
}

std::string text(std::string_view value) {
  return "<VALUE>" + std::string(value) + "</VALUE>";
}

std::string texts(const std::vector<std::string>& values) {
  std::string xml = "<VALUE.ARRAY>";
  for (const std::string& each : values)
    xml += text(each);
  return xml + "</VALUE.ARRAY>";
}

std::string className(std::string_view name) {
  return "<CLASSNAME NAME=\"" + std::string(name) + "\"/>";
}

std::string instanceName(std::string_view className, std::string_view name) {
  return "<INSTANCENAME CLASSNAME=\"" + std::string(className) +
         "\"><KEYBINDING NAME=\"Name\"><KEYVALUE VALUETYPE=\"string\">" + std::string(name) +
         "</KEYVALUE></KEYBINDING></INSTANCENAME>";
}

Given flag(const std::string& name, bool value) {
  return {name, text(value ? "true" : "FALSE")};
}

Request request(const std::string& method, const std::vector<Given>& parameters,
                const std::string& nameSpace) {
  std::string body = R"(<?xml version="1.0" encoding="utf-8"?>)"
                     R"(<CIM CIMVERSION="2.0" DTDVERSION="2.0"><MESSAGE ID="42" PROTOCOLVERSION="1.0">)"
                     R"(<SIMPLEREQ><IMETHODCALL NAME=")" +
                     method + "\"><LOCALNAMESPACEPATH>";
  std::string_view rest = nameSpace;
  while (!rest.empty()) {
    const std::size_t slash = std::min(rest.find('/'), rest.size());
    body += "<NAMESPACE NAME=\"" + std::string(rest.substr(0, slash)) + "\"/>";
    rest.remove_prefix(std::min(slash + 1, rest.size()));
  }
  body += "</LOCALNAMESPACEPATH>";
  for (const Given& each : parameters)
    body += "<IPARAMVALUE NAME=\"" + each.name + "\">" + each.xml + "</IPARAMVALUE>";
  body += "</IMETHODCALL></SIMPLEREQ></MESSAGE></CIM>";

  Request made;
  made.method = "POST";
  made.target = "/cimom";
  made.fields = {{"Host", "server:5988"},
                 {"Content-Type", "application/xml; charset=\"utf-8\""},
                 {"CIMOperation", "MethodCall"},
                 {"CIMMethod", method},
                 {"CIMObject", nameSpace}};
  made.body = body;
  made.peer = "127.0.0.1:1234";
  return made;
}

std::string& header(Request& request, const std::string& name) {
  for (Field& each : request.fields) {
    if (cimom::sameName(each.name, name))
      return each.value;
  }
  request.fields.push_back({name, ""});
  return request.fields.back().value;
}

void removeHeader(Request& request, std::string_view name) {
  std::erase_if(request.fields, [name](const Field& each) { return each.name == name; });
}

std::vector<std::string> between(std::string_view body, std::string_view open, std::string_view close) {
  std::vector<std::string> found;
  for (std::size_t at = body.find(open); at != std::string_view::npos; at = body.find(open, at)) {
    at += open.size();
    found.emplace_back(body.substr(at, body.find(close, at) - at));
  }
  return found;
}

std::vector<std::string> names(std::string_view body) {
  std::vector<std::string> found;
  for (const std::string& each : between(body, "<INSTANCENAME CLASSNAME=\"", "</INSTANCENAME>")) {
    const std::vector<std::string> keys = between(each, "<KEYVALUE", "</KEYVALUE>");
    const std::string key = keys.empty() ? "" : keys.front().substr(keys.front().find('>') + 1);
    found.push_back(each.substr(0, each.find('"')) + " " + key);
  }
  return found;
}

std::vector<std::string> properties(std::string_view body) {
  std::vector<std::string> found;
  for (const std::string& each : between(body, "<PROPERTY", ">")) {
    const std::vector<std::string> name = between(each, "NAME=\"", "\"");
    if (!name.empty())
      found.push_back(name.front());
  }
  return found;
}

int errorCode(std::string_view body) {
  const std::vector<std::string> codes = between(body, "<ERROR CODE=\"", "\"");
  return codes.empty() ? -1 : std::stoi(codes.front());
}

std::string errorText(std::string_view body) {
  const std::vector<std::string> errors = between(body, "<ERROR ", ">");
  const std::vector<std::string> found =
      errors.empty() ? errors : between(errors.front(), "DESCRIPTION=\"", "\"");
  return found.empty() ? "" : found.front();
}

std::string outParameter(std::string_view body, std::string_view name) {
  const std::vector<std::string> found =
      between(body, "<PARAMVALUE NAME=\"" + std::string(name) + "\"", "</PARAMVALUE>");
  if (found.empty())
    return "none";
  const std::vector<std::string> value = between(found.front(), "<VALUE>", "</VALUE>");
  return value.empty() ? "" : value.front();
}

namespace {

cimom::Configuration configuration(Lines& log) {
  cimom::Configuration result;
  result.schema = {PROTOCOL_SCHEMA};
  for (const char* name : {"TEST_Item", "TEST_Place", "TEST_Crowd", "TEST_Refused", "TEST_Broken",
                           "TEST_LateFailing", "TEST_NoDone", "TEST_Empty"})
    result.providers.push_back(
        {name, "Protocol", "ProtocolTestProvider", true, false, {"root/test", "root/other"}, "here"});
  for (const char* name : {"TEST_Holds", "TEST_Peer"})
    result.providers.push_back(
        {name, "Protocol", "ProtocolTestProvider", false, true, {"root/test"}, "here"});
  result.providerFolder = PROTOCOL_FOLDER;
  result.log = [&log](std::string_view line) { log.add(line); };
  return result;
}

Control& providerControl() {
  // Never closed: the provider's state outlives each object manager.
  void* library = dlopen(PROTOCOL_FOLDER "/libProtocolTestProvider.so", RTLD_NOW);
  if (library == nullptr)
    throw std::runtime_error("the provider of the tests cannot be loaded");
  return *reinterpret_cast<ControlFunction>(dlsym(library, controlFunction))();
}

}  // namespace

Protocol::Protocol() : manager_(configuration(log_)), control_(providerControl()) {
  control_.set(&Control::size, 3);
  control_.set(&Control::allowed, Control::all);
  control_.set(&Control::failsAfter, Control::all);
  settings_.log = [this](std::string_view line) { log_.add(line); };
  settings_.lookAhead = std::chrono::seconds(20);
  settings_.now = [start = cimom::protocol::Clock::now(), this] { return start + passed_.load(); };
  restart();
}

Protocol::~Protocol() {
  // Whatever a provider still waits for.
  control_.set(&Control::allowed, Control::all);
}

void Protocol::restart() {
  endpoint_.reset();
  endpoint_ = std::make_unique<cimom::protocol::Endpoint>(manager_, settings_);
}

Recorded Protocol::send(const Request& request) const {
  Recorded answer;
  endpoint_->handle(request, answer);
  const bool isXml = answer.field("Content-Type").find("xml") != std::string::npos;
  if (answer.status == 200 && !answer.failed && isXml) {
    EXPECT_EQ(dsp0203::firstViolation(answer.body), "") << answer.body;
  }
  return answer;
}

std::string Protocol::ask(const std::string& method, const std::vector<Given>& parameters) const {
  const Recorded answer = send(request(method, parameters));
  EXPECT_EQ(answer.status, 200) << answer.body;
  EXPECT_EQ(errorCode(answer.body), -1) << answer.body;
  EXPECT_FALSE(answer.failed);
  EXPECT_THAT(answer.body, HasSubstr("<MESSAGE ID=\"42\""));
  EXPECT_THAT(answer.body, HasSubstr("<IMETHODRESPONSE NAME=\"" + method + "\">"));
  return answer.body;
}

std::string Protocol::expectError(int code, const std::string& method, const std::vector<Given>& parameters,
                                  const std::string& nameSpace) const {
  const Recorded answer = send(request(method, parameters, nameSpace));
  EXPECT_EQ(answer.status, 200) << answer.body;
  EXPECT_EQ(errorCode(answer.body), code) << answer.body;
  EXPECT_NE(errorText(answer.body), "") << answer.body;
  EXPECT_THAT(answer.body, testing::Not(HasSubstr("IRETURNVALUE")));
  return errorText(answer.body);
}

bool Protocol::waitFor(std::size_t Control::*member, std::size_t value) {
  std::unique_lock lock(control_.mutex);
  return control_.changed.wait_for(lock, std::chrono::seconds(20), [&] { return control_.*member == value; });
}

}  // namespace protocol_test
