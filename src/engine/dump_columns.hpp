// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <cstdint>
#include <string>

#include "engine/t8.hpp"
#include "fixed/number_format.hpp"

/// Columns of the trace tables, appended to a row. Their text depends on the values alone: neither on a
/// stream's settings nor on a locale.
namespace quarzel {

/// The step number, left-aligned in 5 characters.
void appendStep(std::string& row, std::uint32_t step);

/// A word as the real number it stands for, with its sign and 6 decimals, left-aligned in 12 characters.
void appendReal(std::string& row, std::int16_t word, const TNumberFormat& format);

/// A marker, "*" when the word differs from its partner and a blank when it does not, and then the word as a
/// real number. Words may differ in bits that the format does not print.
void appendMarkedReal(std::string& row, std::int16_t word, std::int16_t partner, const TNumberFormat& format);

/// The eight state metrics of a step as real numbers.
void appendStateMetrics(std::string& row, const T8& metrics, const TNumberFormat& format);

/// The elements of a branch-metric record in the columns g4 to g7 of every table.
inline constexpr std::size_t branchColumns[] = {2, 1, 3, 0};

/// The four branch metrics of a step as real numbers, in that order.
void appendBranchMetrics(std::string& row, const T8& metrics, const TNumberFormat& format);

}  // namespace quarzel
