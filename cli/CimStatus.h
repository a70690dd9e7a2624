// CIM statuses by the names that DSP0200 gives them.
#pragma once

#include <cmpi/cmpidt.h>

#include <string>

namespace cli {

/// "CIM_ERR_NOT_FOUND"; for a code that is none of the standard's, "CIM status 77".
std::string statusName(CMPIrc code);

}  // namespace cli
