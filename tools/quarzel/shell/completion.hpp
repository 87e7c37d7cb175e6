// SPDX-License-Identifier: MIT
#pragma once

#include <string>

#include "shell/tool_description.hpp"

/// Scripts that complete the tool's command line in a shell.
namespace quarzel::tool {

std::string bashCompletion(const ToolDescription& description);
std::string zshCompletion(const ToolDescription& description);
std::string fishCompletion(const ToolDescription& description);

}  // namespace quarzel::tool
