// SPDX-License-Identifier: MIT
#pragma once

#include <string>

#include "shell/tool_description.hpp"

namespace quarzel::tool {

/// The manual page of the tool, for man(1).
std::string manualPage(const ToolDescription& description);

}  // namespace quarzel::tool
