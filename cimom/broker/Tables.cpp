#include <cimom/broker/Tables.h>
#include <cimom/broker/Values.h>

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

Arena& arenaForCopies(Arena& home) {
  Request* const request = Request::current();
  return request != nullptr && &home == &request->held() ? request->arena() : arenaForAnswer(home);
}

CMPIData answerWith(Arena& home, const CMPIData& data) {
  const bool isMutable = (data.type & CMPI_ARRAY) != 0 || data.type == CMPI_ref || data.type == CMPI_instance;
  return copyData(isMutable ? arenaForCopies(home) : arenaForAnswer(home), data);
}

}  // namespace cimom
