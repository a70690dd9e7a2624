#include <cimom/broker/Values.h>

#include <cstring>

namespace cimom {

namespace {

CMPIData goodData(CMPIType type) {
  CMPIData data{};
  data.type = type;
  data.state = CMPI_goodValue;
  return data;
}

// Copies the member that the type says, and not the bytes beside it, which nobody need have set.
bool copyScalar(const CMPIValue& from, CMPIType type, CMPIValue& to) {
  switch (type) {
    case CMPI_boolean:
      to.boolean = from.boolean != 0 ? 1 : 0;
      return true;
    case CMPI_uint8:
    case CMPI_sint8:
      to.uint8 = from.uint8;
      return true;
    case CMPI_char16:
    case CMPI_uint16:
    case CMPI_sint16:
      to.uint16 = from.uint16;
      return true;
    case CMPI_uint32:
    case CMPI_sint32:
      to.uint32 = from.uint32;
      return true;
    case CMPI_real32:
      to.real32 = from.real32;
      return true;
    case CMPI_uint64:
    case CMPI_sint64:
      to.uint64 = from.uint64;
      return true;
    case CMPI_real64:
      to.real64 = from.real64;
      return true;
    default:
      return false;
  }
}

CMPIData stringData(Arena& arena, std::string_view text) {
  CMPIData data = goodData(CMPI_string);
  data.value.string = String::create(arena, text);
  return data;
}

// CMPI passes a text of type CMPI_chars in the place of the value: the pointer is the text, at any address.
CMPIrc makeText(Arena& arena, const CMPIValue* value, CMPIType type, CMPIData& data) {
  if (type == CMPI_chars) {
    data = stringData(arena, reinterpret_cast<const char*>(value));
  } else if (value->dataPtr.ptr != nullptr) {
    const char* const chars = static_cast<const char*>(value->dataPtr.ptr);
    data = stringData(arena, {chars, strnlen(chars, value->dataPtr.length)});
  } else {
    data = nullData(CMPI_string);
  }
  return CMPI_RC_OK;
}

// One handle of CMPI: null, foreign, or ours and then kept.
template <class Object, class Handle, class Keep>
CMPIrc makeObject(Handle* handle, CMPIType type, Handle* CMPIValue::*member, CMPIData& data,
                  const Keep& keep) {
  if (handle == nullptr) {
    data = nullData(type);
    return CMPI_RC_OK;
  }
  const Object* const object = Object::from(handle);
  if (object == nullptr) {
    return CMPI_RC_ERR_INVALID_HANDLE;
  }
  data = goodData(type);
  data.value.*member = keep(*object);
  return CMPI_RC_OK;
}

CMPIrc makeArray(Arena& arena, const CMPIValue& value, CMPIType type, CMPIData& data) {
  if (value.array != nullptr) {
    const Array* const array = Array::from(value.array);
    if (array != nullptr && (array->simpleType() | CMPI_ARRAY) != type) {
      return CMPI_RC_ERR_TYPE_MISMATCH;
    }
  }
  return makeObject<Array>(value.array, type, &CMPIValue::array, data,
                           [&](const Array& array) { return array.copyTo(arena); });
}

CMPIrc makeEncapsulated(Arena& arena, const CMPIValue& value, CMPIType type, CMPIData& data) {
  switch (type) {
    case CMPI_string:
      return makeObject<String>(value.string, type, &CMPIValue::string, data,
                                [&](const String& string) { return string.in(arena); });
    case CMPI_dateTime:
      return makeObject<DateTime>(value.dateTime, type, &CMPIValue::dateTime, data,
                                  [&](const DateTime& time) { return time.in(arena); });
    case CMPI_ref:
      return makeObject<ObjectPath>(value.ref, type, &CMPIValue::ref, data,
                                    [&](const ObjectPath& path) { return path.copyTo(arena); });
    case CMPI_instance:
      return makeObject<Instance>(value.inst, type, &CMPIValue::inst, data,
                                  [&](const Instance& object) { return object.copyTo(arena); });
    default:
      return CMPI_RC_ERR_INVALID_DATA_TYPE;
  }
}

bool isScalarType(CMPIType type) {
  CMPIValue from{};
  CMPIValue to{};
  return copyScalar(from, type, to);
}

}  // namespace

bool isSimpleType(CMPIType type) {
  switch (type) {
    case CMPI_string:
    case CMPI_chars:
    case CMPI_charsptr:
    case CMPI_dateTime:
    case CMPI_ref:
    case CMPI_instance:
      return true;
    default:
      return isScalarType(type);
  }
}

CMPIData nullData(CMPIType type) {
  CMPIData data = goodData(type);
  data.state = CMPI_nullValue;
  return data;
}

CMPIrc makeData(Arena& arena, const CMPIValue* value, CMPIType type, CMPIData& data) {
  if (type == CMPI_null) {
    data = nullData(CMPI_null);
    return CMPI_RC_OK;
  }
  if (!isSimpleType(static_cast<CMPIType>(type & ~CMPI_ARRAY))) {
    return CMPI_RC_ERR_INVALID_DATA_TYPE;
  }
  if (value == nullptr) {
    data = nullData(keptType(type));
    return CMPI_RC_OK;
  }
  if ((type & CMPI_ARRAY) != 0) {
    return makeArray(arena, *value, keptType(type), data);
  }
  if (type == CMPI_chars || type == CMPI_charsptr) {
    return makeText(arena, value, type, data);
  }
  CMPIData scalar = goodData(type);
  if (copyScalar(*value, type, scalar.value)) {
    data = scalar;
    return CMPI_RC_OK;
  }
  return makeEncapsulated(arena, *value, type, data);
}

CMPIData copyData(Arena& arena, const CMPIData& data) {
  CMPIData copy = data;
  if (!isNull(data)) {
    // Whatever is in an object of the broker has been checked on its way in, so this cannot fail.
    (void)makeData(arena, &data.value, data.type, copy);
    copy.state = data.state;
  }
  return copy;
}

bool isNull(const CMPIData& data) {
  return (data.state & (CMPI_nullValue | CMPI_notFound | CMPI_badValue)) != 0 || data.type == CMPI_null;
}

std::optional<std::string_view> text(const CMPIData& data) {
  if (isNull(data) || data.type != CMPI_string) {
    return std::nullopt;
  }
  const String* const string = String::from(data.value.string);
  return string == nullptr ? std::nullopt : std::optional(string->view());
}

std::optional<std::string_view> dateTimeText(const CMPIData& data) {
  if (isNull(data) || data.type != CMPI_dateTime) {
    return std::nullopt;
  }
  const DateTime* const time = DateTime::from(data.value.dateTime);
  return time == nullptr ? std::nullopt : std::optional(time->view());
}

std::span<const CMPIData> elements(const CMPIData& data) {
  if (isNull(data) || (data.type & CMPI_ARRAY) == 0) {
    return {};
  }
  const Array* const array = Array::from(data.value.array);
  return array == nullptr ? std::span<const CMPIData>() : array->elements();
}

const ObjectPath* objectPath(const CMPIData& data) {
  return isNull(data) || data.type != CMPI_ref ? nullptr : ObjectPath::from(data.value.ref);
}

const Instance* instance(const CMPIData& data) {
  return isNull(data) || data.type != CMPI_instance ? nullptr : Instance::from(data.value.inst);
}

std::optional<Integer> integer(const CMPIData& data) {
  const auto fromSigned = [](std::int64_t number) {
    return Integer{number < 0, static_cast<std::uint64_t>(number)};
  };
  if (isNull(data)) {
    return std::nullopt;
  }
  switch (data.type) {
    case CMPI_uint8:
      return Integer{false, data.value.uint8};
    case CMPI_uint16:
      return Integer{false, data.value.uint16};
    case CMPI_uint32:
      return Integer{false, data.value.uint32};
    case CMPI_uint64:
      return Integer{false, data.value.uint64};
    case CMPI_sint8:
      return fromSigned(data.value.sint8);
    case CMPI_sint16:
      return fromSigned(data.value.sint16);
    case CMPI_sint32:
      return fromSigned(data.value.sint32);
    case CMPI_sint64:
      return fromSigned(data.value.sint64);
    default:
      return std::nullopt;
  }
}

}  // namespace cimom
