#include <cimom/broker/DateTimeText.h>
#include <cimom/broker/Objects.h>
#include <cimom/broker/Tables.h>

#include <algorithm>
#include <array>

namespace cimom {

DateTime::DateTime(Arena& arena, std::string_view text)
    : CMPIDateTime{this, &dateTimeTable}, arena_(&arena), text_{} {
  std::copy_n(text.begin(), textSize, text_);
}

DateTime* DateTime::create(Arena& arena, std::string_view text) {
  return isDateTimeText(text) ? arena.make<DateTime>(arena, text) : nullptr;
}

DateTime* DateTime::create(Arena& arena, std::uint64_t microseconds, bool isInterval) {
  std::array<char, textSize> text{};
  return writeDateTime(microseconds, isInterval, text.data())
             ? arena.make<DateTime>(arena, std::string_view(text.data(), text.size()))
             : nullptr;
}

DateTime* DateTime::from(const CMPIDateTime* handle) {
  return objectBehind<DateTime>(handle, dateTimeTable);
}

std::optional<std::uint64_t> DateTime::microseconds() const {
  return microsecondsOf(view());
}

DateTime* DateTime::in(Arena& arena) const {
  return arena_ == &arena ? const_cast<DateTime*>(this) : copyTo(arena);
}

DateTime* DateTime::copyTo(Arena& arena) const {
  return arena.make<DateTime>(arena, view());
}

namespace {

CMPIUint64 getBinaryFormat(const CMPIDateTime* handle, CMPIStatus* status) {
  const DateTime* const time = DateTime::from(handle);
  if (time == nullptr) {
    setStatus(status, CMPI_RC_ERR_INVALID_HANDLE);
    return 0;
  }
  const auto microseconds = time->microseconds();
  if (!microseconds) {
    setStatus(status, CMPI_RC_ERR_FAILED, "the time lies before 1970 and has no binary form");
    return 0;
  }
  setStatus(status, CMPI_RC_OK);
  return *microseconds;
}

CMPIString* getStringFormat(const CMPIDateTime* handle, CMPIStatus* status) {
  const DateTime* const time = DateTime::from(handle);
  if (time == nullptr) {
    return noObject(status, CMPI_RC_ERR_INVALID_HANDLE);
  }
  setStatus(status, CMPI_RC_OK);
  return String::create(arenaForCopies(*time->arena()), time->view());
}

CMPIBoolean isInterval(const CMPIDateTime* handle, CMPIStatus* status) {
  const DateTime* const time = DateTime::from(handle);
  setStatus(status, time == nullptr ? CMPI_RC_ERR_INVALID_HANDLE : CMPI_RC_OK);
  return time != nullptr && time->isInterval() ? 1 : 0;
}

}  // namespace

CMPIDateTimeFT dateTimeTable = {tableVersion,    releaseHandle<DateTime>, cloneHandle<DateTime>,
                                getBinaryFormat, getStringFormat,         isInterval};

}  // namespace cimom
