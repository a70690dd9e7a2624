// One value as a plain text.
#pragma once

#include <cli/Row.h>

#include <string>

namespace cli {

/// Texts, datetimes and references as they are, booleans as "true" and "false", numbers in decimal; null is
/// empty.
std::string scalarText(const Scalar& value);

}  // namespace cli
