// SPDX-License-Identifier: MIT
#pragma once

#include <cstdint>
#include <functional>
#include <optional>
#include <string>
#include <string_view>

#include "options/cli_fwd.hpp"

namespace quarzel::tool {

/// A whole number in decimal; none when the text is anything else or the number too large.
std::optional<std::uint64_t> readWholeNumber(std::string_view text);

/// A check that the text of an option is a whole number in decimal, as 2500, 1e6 or 2.5e3, and one of those
/// wanted, for an option's transform(). CLI11 by itself reads a leading 0 as octal and lets a negative number
/// wrap.
///
/// @param isWanted  which numbers are
/// @param wanted    the same for the error message: "'3' is not {wanted}"
CLI::Validator wholeNumber(std::function<bool(std::uint64_t)> isWanted, std::string wanted);

}  // namespace quarzel::tool
