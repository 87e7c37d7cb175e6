// SPDX-License-Identifier: MIT
#pragma once

#include <sstream>
#include <string>
#include <utility>

#include "tool_error.hpp"

namespace quarzel::fuzz {

/// Let a reader of the tool read a text as a file. It may refuse it by a ToolError; all else that it throws
/// is a fault.
/// @param read  `read(stream)`
template <class Read>
void readText(const std::string& text, Read&& read) {
    std::istringstream stream(text);
    try {
        std::forward<Read>(read)(stream);
    } catch (const tool::ToolError&) {
    }
}

}  // namespace quarzel::fuzz
