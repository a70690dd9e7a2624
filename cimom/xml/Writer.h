// Writes CIM-XML responses (DSP0201 2.3, DSP0203). Everything appends to a string, which the caller empties
// whenever enough has come together.
//
// A response is
//   beginResponse, then appendError, or beginReturnValue, objects, endReturnValue and parameters,
//   then endResponse.
// Text that XML cannot carry is replaced as `Text.h` says: a document is never broken by what is in it.
#pragma once

#include <cimom/xml/ClassWriter.h>
#include <cimom/xml/InstanceWriter.h>
#include <cimom/xml/PathWriter.h>
#include <cmpi/cmpidt.h>

#include <string>
#include <string_view>

namespace cimom::xml {

/// IMETHODRESPONSE for intrinsic methods, METHODRESPONSE for those of objects.
enum class MethodKind { intrinsic, extrinsic };

/// The XML declaration and all up to the opening tag of the method's response. `messageId` and `method` are
/// the request's own.
void beginResponse(std::string& out, std::string_view messageId, std::string_view method,
                   MethodKind kind = MethodKind::intrinsic);
void endResponse(std::string& out, MethodKind kind = MethodKind::intrinsic);

void beginReturnValue(std::string& out);
void endReturnValue(std::string& out);

/// ERROR; without DESCRIPTION where it is empty. `code` is a CIM status code (CMPIrc has the first of them);
/// what is none (0, 30 and above, such as CMPI's own) is written as 1, CIM_ERR_FAILED.
void appendError(std::string& out, int code, std::string_view description);

/// PARAMVALUE: what an operation gives back beside its return value.
void appendOutParameter(std::string& out, std::string_view name, std::string_view text);
void appendOutParameter(std::string& out, std::string_view name, bool flag);
/// A literal is a text; without this one it would be taken for a boolean.
inline void appendOutParameter(std::string& out, std::string_view name, const char* text) {
  appendOutParameter(out, name, std::string_view(text));
}
/// Null; `type` is the parameter's.
void appendNullOutParameter(std::string& out, std::string_view name, CMPIType type);

}  // namespace cimom::xml
