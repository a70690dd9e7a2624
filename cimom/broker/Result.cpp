#include <cimom/broker/Result.h>
#include <cimom/broker/Tables.h>
#include <cimom/broker/Values.h>

namespace cimom {

bool ResultSink::data(const CMPIData& /*value*/) {
  return true;
}

Result::Result(ResultSink& sink, Request& request, Recycling recycling)
    : CMPIResult{this, &resultTable}, sink_(&sink), request_(&request), recycling_(recycling) {}

class ResultCalls {
 public:
  static CMPIStatus returnInstance(const CMPIResult* handle, const CMPIInstance* object) {
    Instance* const instance = Instance::from(object);
    return deliver(handle, instance != nullptr, [&](ResultSink& sink) { return sink.instance(*instance); });
  }

  static CMPIStatus returnObjectPath(const CMPIResult* handle, const CMPIObjectPath* object) {
    ObjectPath* const path = ObjectPath::from(object);
    return deliver(handle, path != nullptr, [&](ResultSink& sink) { return sink.path(*path); });
  }

  // Instances and paths are objects whichever function returns them.
  static CMPIStatus returnData(const CMPIResult* handle, const CMPIValue* value, const CMPIType type) {
    if (value != nullptr && type == CMPI_instance) {
      return returnInstance(handle, value->inst);
    }
    if (value != nullptr && type == CMPI_ref) {
      return returnObjectPath(handle, value->ref);
    }
    Arena scratch(Arena::small);
    CMPIData data{};
    const CMPIrc code = makeData(scratch, value, type, data);
    if (resultBehind(handle) != nullptr && code != CMPI_RC_OK) {
      ++resultBehind(handle)->refused_;
      return makeStatus(code);
    }
    return deliver(handle, value != nullptr, [&](ResultSink& sink) { return sink.data(data); });
  }

  static CMPIStatus returnDone(const CMPIResult* handle) {
    Result* const result = resultBehind(handle);
    if (result == nullptr) {
      return makeStatus(CMPI_RC_ERR_INVALID_HANDLE);
    }
    if (!result->done_) {
      result->done_ = true;
      result->sink_->done();
    }
    return makeStatus(CMPI_RC_OK);
  }

  static CMPIStatus returnError(const CMPIResult* handle, const CMPIError* error) {
    if (resultBehind(handle) == nullptr) {
      return makeStatus(CMPI_RC_ERR_INVALID_HANDLE);
    }
    return makeStatus(error == nullptr ? CMPI_RC_ERR_INVALID_PARAMETER : CMPI_RC_ERR_NOT_SUPPORTED);
  }

  static CMPIStatus release(CMPIResult* handle) {
    return makeStatus(resultBehind(handle) == nullptr ? CMPI_RC_ERR_INVALID_HANDLE : CMPI_RC_OK);
  }

  // What was delivered is gone to its sink, and cannot be had twice.
  static CMPIResult* clone(const CMPIResult* handle, CMPIStatus* status) {
    return noObject(status,
                    resultBehind(handle) == nullptr ? CMPI_RC_ERR_INVALID_HANDLE : CMPI_RC_ERR_NOT_SUPPORTED);
  }

 private:
  static Result* resultBehind(const CMPIResult* handle) { return objectBehind<Result>(handle, resultTable); }

  template <class Delivery>
  static CMPIStatus deliver(const CMPIResult* handle, bool isValid, const Delivery& delivery) {
    Result* const result = resultBehind(handle);
    if (result == nullptr) {
      return makeStatus(CMPI_RC_ERR_INVALID_HANDLE);
    }
    if (!isValid || result->done_) {
      ++result->refused_;
      return makeStatus(isValid ? CMPI_RC_ERR_FAILED : CMPI_RC_ERR_INVALID_PARAMETER);
    }
    if (result->open_) {
      result->open_ = delivery(*result->sink_);
      ++result->delivered_;
    }
    if (result->recycling_ == Recycling::OnReturn && Request::current() == result->request_) {
      result->request_->recycle();
    }
    return makeStatus(CMPI_RC_OK);
  }
};

CMPIResultFT resultTable = {
    tableVersion,
    ResultCalls::release,
    ResultCalls::clone,
    ResultCalls::returnData,
    ResultCalls::returnInstance,
    ResultCalls::returnObjectPath,
    ResultCalls::returnDone,
    ResultCalls::returnError,
};

}  // namespace cimom
