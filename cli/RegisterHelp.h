// The texts behind --help of the commands around other object managers.
#pragma once

#include <string_view>

namespace cli {

extern const std::string_view registerHelp;
extern const std::string_view unregisterHelp;

}  // namespace cli
