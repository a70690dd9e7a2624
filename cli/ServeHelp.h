// The texts behind --help of the commands around the WBEM endpoint.
#pragma once

#include <string_view>

namespace cli {

extern const std::string_view serveHelp;
extern const std::string_view passwdHelp;

}  // namespace cli
