// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <string>
#include <vector>

/// Text in figures. Which font there is, is not known here: widths are those of a wide one.
namespace quarzel::tool {

/// The height of a line, in heights of the font.
constexpr double lineHeight = 1.3;

/// Text that any format of pictures takes: well-formed UTF-8, without control characters.
std::string mendedText(const std::string& text);

/// The width of a text in heights of the font, rather too large than too small.
double widthOf(const std::string& text);

/// Cut a text into lines, at blanks where it can be.
/// @param width  of a line, in heights of the font
/// @return       no line when there is no text
std::vector<std::string> wrapped(const std::string& text, double width);

/// A text as a string of a gnuplot script, in which nothing has a meaning.
std::string scriptText(const std::string& text);

}  // namespace quarzel::tool
