// SPDX-License-Identifier: MIT
#pragma once

#include <string>

namespace quarzel::tool {

/// Run gnuplot, which is found on the PATH.
/// @param script  what it is to do
/// @return        what it writes to its standard output
/// @throws ToolError when there is no gnuplot or it fails
std::string runGnuplot(const std::string& script);

}  // namespace quarzel::tool
