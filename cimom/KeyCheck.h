// Whether a path names an instance of its class.
#pragma once

#include <cimom/Outcome.h>
#include <cimom/broker/Objects.h>

namespace cimom {

/// CMPI_RC_ERR_INVALID_PARAMETER, with the key at fault, where the path lacks a key of its class, has one
/// that the class does not declare, or one of another type. Integers count as one type: a client cannot write
/// their size.
[[nodiscard]] Status checkKeys(const ObjectPath& path, const ClassInfo& info);

/// The same for a path that may lack keys.
[[nodiscard]] Status checkGivenKeys(const ObjectPath& path, const ClassInfo& info);

}  // namespace cimom
