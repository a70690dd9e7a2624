#include "CimClient.h"

#include "tests/support/Dsp0203.h"

#include <stdexcept>

namespace serve_test {

std::string classParameter(std::string_view name, std::string_view className) {
  return "<IPARAMVALUE NAME=\"" + std::string(name) + "\"><CLASSNAME NAME=\"" + std::string(className) +
         "\"/></IPARAMVALUE>";
}

std::string valueParameter(std::string_view name, std::string_view value) {
  return "<IPARAMVALUE NAME=\"" + std::string(name) + "\"><VALUE>" + escaped(value) +
         "</VALUE></IPARAMVALUE>";
}

std::string listParameter(std::string_view name, const std::vector<std::string>& values) {
  std::string list;
  for (const std::string& value : values) {
    list += "<VALUE>" + escaped(value) + "</VALUE>";
  }
  return "<IPARAMVALUE NAME=\"" + std::string(name) + "\"><VALUE.ARRAY>" + list +
         "</VALUE.ARRAY></IPARAMVALUE>";
}

std::string instanceParameter(std::string_view name, std::string_view instanceName) {
  return "<IPARAMVALUE NAME=\"" + std::string(name) + "\">" + std::string(instanceName) + "</IPARAMVALUE>";
}

std::string instanceName(std::string_view className,
                         const std::vector<std::pair<std::string, std::string>>& keys) {
  std::string text = "<INSTANCENAME CLASSNAME=\"" + std::string(className) + "\">";
  for (const auto& [key, value] : keys) {
    text += "<KEYBINDING NAME=\"" + key + R"("><KEYVALUE VALUETYPE="string">)" + escaped(value) +
            "</KEYVALUE></KEYBINDING>";
  }
  return text + "</INSTANCENAME>";
}

std::string message(std::string_view method, std::string_view nameSpace, std::string_view parameters) {
  std::string path;
  while (!nameSpace.empty()) {
    const std::size_t end = std::min(nameSpace.find('/'), nameSpace.size());
    path += "<NAMESPACE NAME=\"" + std::string(nameSpace.substr(0, end)) + "\"/>";
    nameSpace.remove_prefix(std::min(end + 1, nameSpace.size()));
  }
  return R"(<?xml version="1.0" encoding="utf-8"?><CIM CIMVERSION="2.0" DTDVERSION="2.0">)"
         R"(<MESSAGE ID="7" PROTOCOLVERSION="1.0"><SIMPLEREQ><IMETHODCALL NAME=")" +
         std::string(method) + "\"><LOCALNAMESPACEPATH>" + path + "</LOCALNAMESPACEPATH>" +
         std::string(parameters) + "</IMETHODCALL></SIMPLEREQ></MESSAGE></CIM>";
}

std::string post(std::string_view method, std::string_view nameSpace, std::string_view parameters,
                 const tests::HttpFields& fields, std::string_view version) {
  tests::HttpFields all{{"Content-Type", "application/xml; charset=utf-8"},
                        {"CIMOperation", "MethodCall"},
                        {"CIMMethod", std::string(method)},
                        {"CIMObject", std::string(nameSpace)}};
  all.insert(all.end(), fields.begin(), fields.end());
  return tests::httpRequest("POST", "/cimom", all, message(method, nameSpace, parameters), version);
}

std::string CimAnswer::parameter(std::string_view name) const {
  for (const Element* each : root.all("PARAMVALUE")) {
    if (each->attribute("NAME") == name) {
      const auto values = each->all("VALUE");
      return values.empty() ? std::string() : values.front()->text;
    }
  }
  return {};
}

std::vector<std::string> CimAnswer::keys(std::string_view name) const {
  std::vector<std::string> values;
  for (const Element* path : root.all("INSTANCENAME")) {
    for (const Element& binding : path->children) {
      if (binding.attribute("NAME") == name && !binding.children.empty()) {
        values.push_back(binding.children.front().text);
      }
    }
  }
  return values;
}

namespace {

/// As much of a body as a message can sensibly hold.
std::string beginningOf(const std::string& body) {
  constexpr std::size_t most = 4000;
  return body.size() <= most ? body : body.substr(0, most) + "...";
}

}  // namespace

CimAnswer readCim(const tests::HttpAnswer& answer) {
  if (answer.status != 200 || !answer.isComplete) {
    throw std::runtime_error("HTTP status " + std::to_string(answer.status) +
                             (answer.isComplete ? "" : ", and the answer is not complete") + ": " +
                             answer.body);
  }
  const std::string violation = dsp0203::firstViolation(answer.body);
  if (!violation.empty()) {
    throw std::runtime_error("against DSP0203: " + violation + "\n" + beginningOf(answer.body));
  }
  CimAnswer result{parseXml(answer.body), 0, {}};
  const auto errors = result.root.all("ERROR");
  if (!errors.empty()) {
    result.error = std::stoi(errors.front()->attribute("CODE"));
    result.description = errors.front()->attribute("DESCRIPTION");
  }
  return result;
}

CimAnswer CimClient::call(std::string_view method, std::string_view nameSpace, std::string_view parameters,
                          const tests::HttpFields& fields) {
  return readCim(connection_.ask(post(method, nameSpace, parameters, fields)));
}

std::size_t CimClient::countIdentities() {
  return call("EnumerateInstanceNames", "root/cimv2", classParameter("ClassName", "KELVO_SoftwareIdentity"))
      .keys("InstanceID")
      .size();
}

}  // namespace serve_test
