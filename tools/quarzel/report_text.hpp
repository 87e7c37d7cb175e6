// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <string>
#include <string_view>
#include <vector>

/// What the reports that people read have in common.
namespace quarzel::tool {

/// Append a line with its label in a column of its own.
void reportLine(std::string& text, std::string_view label, std::string_view content);

/// "1 block", "2 blocks".
std::string counted(std::size_t number, std::string_view noun, std::string_view plural);

/// "3, 17, and 2 more": the first `most` items of a list, and how many there are beyond.
std::string listText(std::vector<std::string> items, std::size_t most);

/// The word of a shell that stands for a text.
std::string shellWord(const std::string& text);

/// Hours, minutes and seconds: "1:02:03".
std::string durationText(double seconds);

}  // namespace quarzel::tool
