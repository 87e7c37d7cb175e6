// SPDX-License-Identifier: MIT
#include "engine/dump_columns.hpp"

#include <charconv>

namespace quarzel {

namespace {

/// Pad with blanks what `row` holds from `start` on.
void pad(std::string& row, std::size_t start, std::size_t width) {
    if (row.size() < start + width) {
        row.resize(start + width, ' ');
    }
}

}  // namespace

void appendStep(std::string& row, std::uint32_t step) {
    const std::size_t start = row.size();
    row += std::to_string(step);
    pad(row, start, 5);
}

void appendReal(std::string& row, std::int16_t word, const TNumberFormat& format) {
    const std::size_t start = row.size();
    const double real = format.toReal(word);
    if (real >= 0) {
        row += '+';
    }
    char digits[32];
    const auto end = std::to_chars(digits, digits + sizeof digits, real, std::chars_format::fixed, 6).ptr;
    row.append(digits, end);
    pad(row, start, 12);
}

void appendMarkedReal(std::string& row, std::int16_t word, std::int16_t partner,
                      const TNumberFormat& format) {
    row += word == partner ? ' ' : '*';
    appendReal(row, word, format);
}

void appendStateMetrics(std::string& row, const T8& metrics, const TNumberFormat& format) {
    for (const std::int16_t metric : metrics.element) {
        appendReal(row, metric, format);
    }
}

void appendBranchMetrics(std::string& row, const T8& metrics, const TNumberFormat& format) {
    for (const std::size_t column : branchColumns) {
        appendReal(row, metrics[column], format);
    }
}

}  // namespace quarzel
