#include <cimom/protocol/CimError.h>

#include <algorithm>
#include <array>
#include <utility>

namespace cimom::protocol {

namespace {

constexpr std::array<std::pair<int, std::string_view>, 27> meanings = {{
    {1, "a general error occurred"},
    {2, "access to this resource is denied"},
    {3, "there is no such namespace"},
    {4, "a parameter is not valid"},
    {5, "there is no such class"},
    {6, "the object was not found"},
    {7, "the operation is not supported"},
    {8, "the class has subclasses"},
    {9, "the class has instances"},
    {10, "there is no such superclass"},
    {11, "the object exists already"},
    {12, "there is no such property"},
    {13, "the value has another type than the property"},
    {14, "the query language is not known"},
    {15, "the query is not valid"},
    {16, "the method cannot be executed"},
    {17, "there is no such method"},
    {20, "the namespace is not empty"},
    {21, "the enumeration is not open"},
    {22, "the operation timeout is not valid"},
    {23, "the pull was abandoned because its enumeration was closed"},
    {24, "the pull cannot be abandoned"},
    {25, "filtered enumerations are not supported"},
    {26, "continuation on error is not supported"},
    {27, "the limits of the server are exceeded"},
    {28, "the server is shutting down"},
    {29, "the query has a feature that is not supported"},
}};

std::string_view meaningOf(int code) {
  const auto* found = std::find_if(meanings.begin(), meanings.end(),
                                   [code](const auto& meaning) { return meaning.first == code; });
  return found == meanings.end() ? std::string_view() : found->second;
}

}  // namespace

CMPIrc cimStatus(CMPIrc code) {
  return meaningOf(code).empty() ? CMPI_RC_ERR_FAILED : code;
}

std::string describe(CMPIrc code, std::string_view description) {
  if (!description.empty())
    return std::string(description);
  const std::string_view meaning = meaningOf(code);
  return meaning.empty() ? "the provider failed with CMPI status " + std::to_string(code)
                         : std::string(meaning);
}

}  // namespace cimom::protocol
