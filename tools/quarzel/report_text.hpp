// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <string>
#include <string_view>

/// What the reports that people read have in common.
namespace quarzel::tool {

/// Append a line with its label in a column of its own.
void reportLine(std::string& text, std::string_view label, std::string_view content);

/// "1 block", "2 blocks".
std::string counted(std::size_t number, std::string_view noun, std::string_view plural);

}  // namespace quarzel::tool
