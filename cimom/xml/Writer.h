// Writes CIM-XML responses (DSP0201 2.3, DSP0203). Everything appends to a string, which the caller empties
// whenever enough has come together.
//
// A response is
//   beginResponse, then appendError, or beginReturnValue, objects, endReturnValue and appendOutParameter,
//   then endResponse.
// Text that XML cannot carry is replaced as `Text.h` says: a document is never broken by what is in it.
#pragma once

#include <cimom/xml/ClassWriter.h>
#include <cimom/xml/InstanceWriter.h>
#include <cimom/xml/PathWriter.h>
#include <cmpi/cmpidt.h>

#include <cstdint>
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

/// ERROR; without DESCRIPTION where it is empty.
void appendError(std::string& out, CMPIrc code, std::string_view description);

/// A parameter that an operation gives back beside its return value: EnumerationContext (a text; none is
/// written as null), EndOfSequence.
void appendOutParameter(std::string& out, std::string_view name, std::string_view text);
void appendOutParameter(std::string& out, std::string_view name, bool flag);
void appendNullOutParameter(std::string& out, std::string_view name, std::string_view cimType);

}  // namespace cimom::xml
