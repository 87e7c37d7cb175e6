// SPDX-License-Identifier: MIT
#pragma once

#include <string>
#include <utility>

#include "sweep/error.hpp"
#include "sweep/merge.hpp"
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

/// Read a result of a sweep or a part of one.
/// @throws ToolError when it cannot be read or is neither
sweep::NamedResult readSweepFile(const std::string& file);

/// Put what a file holds into a result that it belongs to.
/// @param known  has the seed and the part that are expected
/// @throws ToolError that says what to do when the file does not belong to it
void joinSweepFile(sweep::NamedResult& known, const std::string& file);

}  // namespace quarzel::tool
