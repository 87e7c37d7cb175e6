// SPDX-License-Identifier: MIT
#pragma once

#include <cstdint>
#include <string>

#include "fixed/number_format.hpp"

/// Columns of the trace tables, appended to a row. Their text depends on nothing but the values: neither on a
/// stream's settings nor on a locale.
namespace quarzel {

/// The step number, left-aligned in 5 characters.
void appendStep(std::string& row, std::uint32_t step);

/// A word as the real number it stands for, with its sign and 6 decimals, left-aligned in 12 characters.
void appendReal(std::string& row, std::int16_t word, const TNumberFormat& format);

}  // namespace quarzel
