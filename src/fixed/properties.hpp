// SPDX-License-Identifier: MIT
#pragma once

#include <string>
#include <utility>

#pragma GCC visibility push(default)  // the shared library offers these functions

/// Split a property string "TYPE", or "TYPE" delimiter "parameters", at its first delimiter.
///
/// @param s       the text
/// @param delims  the set of delimiter characters, zero-terminated
/// @return        what stands before the first character of `s` that is in the set, and what stands after it;
///                the delimiter belongs to neither. Without a delimiter: the whole of `s`, and an empty text.
std::pair<std::string, std::string> splitString(const std::string& s, const char* delims);

#pragma GCC visibility pop
