// SPDX-License-Identifier: MIT
#pragma once

#include <string>
#include <utility>

#include "sweep/error.hpp"
#include "tool_error.hpp"

namespace quarzel::tool {

/// The bytes of a file.
/// @throws ToolError when it cannot be read
std::string readBytes(const std::string& file);

/// Call a function that reads what is in a file; its sweep::Error becomes a ToolError that names the file.
template <class Function>
auto aboutFile(const std::string& file, Function&& function) {
    try {
        return std::forward<Function>(function)();
    } catch (const sweep::Error& error) {
        throw fileError(file, error.problem(), error.remedy());
    }
}

}  // namespace quarzel::tool
