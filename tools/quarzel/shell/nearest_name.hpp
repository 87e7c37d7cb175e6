// SPDX-License-Identifier: MIT
#pragma once

#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace quarzel::tool {

/// The name that someone who typed a word may have meant: the one it is the beginning of or else the one
/// fewest typing errors away (a letter more, less, other, or two exchanged); the first of equals.
/// @return nothing when none is near
std::optional<std::string> nearestName(std::string_view word, const std::vector<std::string>& names);

}  // namespace quarzel::tool
