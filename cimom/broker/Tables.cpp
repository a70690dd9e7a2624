#include <cimom/broker/Tables.h>

namespace cimom {

CMPIStatus makeStatus(CMPIrc code) {
  return {code, nullptr};
}

CMPIStatus makeStatus(CMPIrc code, std::string_view message) {
  Request* const request = Request::current();
  if (request == nullptr || message.empty()) {
    return makeStatus(code);
  }
  return {code, String::create(request->arena(), message)};
}

void setStatus(CMPIStatus* status, CMPIrc code) {
  if (status != nullptr) {
    *status = makeStatus(code);
  }
}

void setStatus(CMPIStatus* status, CMPIrc code, std::string_view message) {
  if (status != nullptr) {
    *status = makeStatus(code, message);
  }
}

CMPIData noData(CMPIStatus* status, CMPIrc code) {
  setStatus(status, code);
  CMPIData data{};
  data.state = CMPI_nullValue | CMPI_notFound;
  return data;
}

Arena& arenaForAnswer(Arena& home) {
  Request* const request = Request::current();
  return request == nullptr || request->owns(home) ? home : request->arena();
}

}  // namespace cimom
