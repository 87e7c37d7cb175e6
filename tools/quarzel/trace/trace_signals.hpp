// SPDX-License-Identifier: MIT
#pragma once

#include <array>
#include <bitset>
#include <cstddef>
#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "quarzel/code.hpp"

namespace quarzel::tool {

/// A stream of a block's soft inputs, as a trace shows it.
struct TraceStream {
    const char* label;        ///< what its line begins with in the text form
    const char* signal;       ///< its name in the forms for other programs
    const char* description;  ///< the same in words
};

/// The streams, in the order of their lines: three of each constituent code.
inline constexpr std::array<TraceStream, 6> traceStreams = {{
    {"itsSys [0]=[", "code1_sys", "systematic values of constituent code 1"},
    {"itsPar0[0]=[", "code1_par0", "first parity of constituent code 1"},
    {"itsPar1[0]=[", "code1_par1", "second parity of constituent code 1"},
    {"itsSys [1]=[", "code2_sys", "systematic values of constituent code 2"},
    {"itsPar0[1]=[", "code2_par0", "first parity of constituent code 2"},
    {"itsPar1[1]=[", "code2_par1", "second parity of constituent code 2"},
}};

/// What a value of a trace belongs to: a column in the table of a pass, or a stream of soft inputs.
struct TraceColumn {
    const char* signal;
    const char* description;         ///< the signal in words
    std::optional<unsigned> number;  ///< of the column, where the signal has several

    /// What stands over it.
    std::string heading() const { return number ? signal + std::to_string(*number) : signal; }
};

/// All columns by their numbers: first those of a pass, in the order of its table, then the streams of soft
/// inputs.
const std::vector<TraceColumn>& traceColumns();

/// The columns in the table of a pass, in their order.
const std::vector<TraceColumn>& passColumns();

/// Whether a column is a stream of soft inputs.
bool isInput(unsigned column);

/// The column with a signal's name and, where it has several, the number.
std::optional<unsigned> findColumn(std::string_view signal, std::optional<unsigned> number = std::nullopt);

/// The column under a heading such as "a3" or "llr".
std::optional<unsigned> columnUnder(std::string_view heading);

using TraceColumnSet = std::bitset<32>;

/// The columns of a signal, or the one under a heading; none when there is no such name.
TraceColumnSet columnsNamed(std::string_view name);

/// All columns in the order in which the core computes them: soft inputs, intrinsic value, branch metrics,
/// forward and backward metrics, log-likelihood ratio, extrinsic value.
const std::vector<unsigned>& columnsAsComputed();

/// Whether the core computes a column from the last step of a block down.
bool isComputedDownwards(unsigned column);

/// @name What a word of a trace stands for: 12 bits, 3 of them fractional, at the top of 16
/// @{
constexpr int rawOf(std::int16_t word) {
    return word >> 4;
}
constexpr double realOf(std::int16_t word) {
    return rawOf(word) / 8.0;
}
/// @}

/// The constituent code that a pass decodes.
constexpr unsigned constituentCode(std::uint32_t pass) {
    return pass % 2 == 0 ? 2 : 1;
}

}  // namespace quarzel::tool
